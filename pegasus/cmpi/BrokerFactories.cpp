#include "pegasus/cmpi/ArgsObject.h"
#include "pegasus/cmpi/ArrayObject.h"
#include "pegasus/cmpi/Broker.h"
#include "pegasus/cmpi/ContextObject.h"
#include "pegasus/cmpi/DateTimeObject.h"
#include "pegasus/cmpi/EnumerationObject.h"
#include "pegasus/cmpi/InstanceObject.h"
#include "pegasus/cmpi/MessageText.h"
#include "pegasus/cmpi/ResultObject.h"
#include "pegasus/cmpi/StringObject.h"
#include "pegasus/cmpi/Text.h"

#include <array>
#include <cstdarg>
#include <cstdio>
#include <string_view>

// What providers make with the broker, and ask it about what they hold.
namespace Pegasus::cmpi {
namespace {

template <class Face, class Make> Face* made(CMPIStatus* rc, Make&& make)
{
    return answer(rc, static_cast<Face*>(nullptr), [&]() -> Face* { return make(); });
}

template <class Face> Face* notSupported(CMPIStatus* rc)
{
    return answer(rc, static_cast<Face*>(nullptr), []() -> Face* { throw SlotError{CMPI_RC_ERR_NOT_SUPPORTED, {}}; });
}

CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* rc)
{
    return made<CMPIInstance>(rc, [&] {
        if (path == nullptr) {
            throw SlotError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
        }
        return Frame::current().make<InstanceObject>(Broker::of(broker), objectOf<ObjectPathObject>(path).state);
    });
}

CMPIObjectPath* newObjectPath(const CMPIBroker* broker, const char* nameSpace, const char* className, CMPIStatus* rc)
{
    return made<CMPIObjectPath>(rc, [&] {
        Broker& owner = Broker::of(broker);
        return Frame::current().make<ObjectPathObject>(owner, PathState(owner, nameSpace, className));
    });
}

CMPIArgs* newArgs(const CMPIBroker* broker, CMPIStatus* rc)
{
    return made<CMPIArgs>(rc, [&] { return Frame::current().make<ArgsObject>(Broker::of(broker)); });
}

CMPIString* newString(const CMPIBroker*, const char* text, CMPIStatus* rc)
{
    return made<CMPIString>(rc, [&] { return Frame::current().make<StringObject>(requireText(text)); });
}

CMPIArray* newArray(const CMPIBroker* broker, CMPICount size, CMPIType type, CMPIStatus* rc)
{
    return made<CMPIArray>(rc, [&] { return Frame::current().make<ArrayObject>(Broker::of(broker), size, type); });
}

CMPIDateTime* newDateTime(const CMPIBroker*, CMPIStatus* rc)
{
    return made<CMPIDateTime>(rc,
                              [] { return Frame::current().make<DateTimeObject>(CIMDateTime::getCurrentDateTime()); });
}

CMPIDateTime* newDateTimeFromBinary(const CMPIBroker*, CMPIUint64 time, CMPIBoolean interval, CMPIStatus* rc)
{
    return made<CMPIDateTime>(
        rc, [&] { return Frame::current().make<DateTimeObject>(dateTimeFromBinary(time, interval != 0)); });
}

CMPIDateTime* newDateTimeFromChars(const CMPIBroker*, const char* text, CMPIStatus* rc)
{
    return made<CMPIDateTime>(rc, [&] { return Frame::current().make<DateTimeObject>(dateTimeFromText(text)); });
}

CMPISelectExp* newSelectExp(const CMPIBroker*, const char*, const char*, CMPIArray**, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPISelectExp*>(nullptr), []() -> CMPISelectExp* {
        throw SlotError{CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, {}};
    });
}

CMPIBoolean classPathIsA(const CMPIBroker* broker, const CMPIObjectPath* path, const char* className, CMPIStatus* rc)
{
    return answer(rc, CMPIBoolean{0}, [&]() -> CMPIBoolean {
        Broker& owner = Broker::of(broker);
        if (path == nullptr || className == nullptr) {
            throw SlotError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
        }
        if (!CIMName::legal(fromUtf8(className))) {
            throw SlotError{CMPI_RC_ERR_INVALID_CLASS, {}};
        }
        const PathState& state = objectOf<ObjectPathObject>(path).state;
        if (sameName(utf8(state.className), className)) {
            return 1;
        }
        const std::string nameSpace = utf8(state.nameSpace.getString());
        for (const ClassSchema* at = state.schema; at != nullptr && !at->superClass().isNull();
             at = owner.classes().find(nameSpace, utf8(at->superClass())))
        {
            if (sameName(utf8(at->superClass()), className)) {
                return 1;
            }
        }
        return 0;
    });
}

// The first two words of every object; which table the second one names tells the kind.
struct AnyObject
{
    const void* hdl;
    const void* ft;
};

struct Kind
{
    std::string_view name;
    const void* table;
};

std::string_view kindOf(const void* object)
{
    if (object == nullptr || static_cast<const AnyObject*>(object)->hdl == nullptr) {
        throw SlotError{CMPI_RC_ERR_INVALID_HANDLE, {}};
    }
    const std::array kinds{
        Kind{"CMPIInstance", &kInstanceTable},
        Kind{"CMPIObjectPath", &kObjectPathTable},
        Kind{"CMPIArgs", &kArgsTable},
        Kind{"CMPIContext", &kContextTable},
        Kind{"CMPIResult", &kResultTable},
        Kind{"CMPIDateTime", &kDateTimeTable},
        Kind{"CMPIArray", &kArrayTable},
        Kind{"CMPIString", &kStringTable},
        Kind{"CMPIEnumeration", &kEnumerationTable},
        Kind{"CMPIBroker", &kUpcallTable},
    };
    for (const Kind& kind : kinds) {
        if (kind.table == static_cast<const AnyObject*>(object)->ft) {
            return kind.name;
        }
    }
    throw SlotError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
}

// Informal, for logs: the address, the kind, and what there is of text.
std::string describe(const void* object)
{
    const std::string_view kind = kindOf(object);
    std::array<char, 32> address{};
    std::snprintf(address.data(), address.size(), "%p:", object);
    std::string text = address.data() + std::string(kind);
    if (kind == "CMPIString") {
        text += ' ' + static_cast<const StringObject*>(static_cast<const CMPIString*>(object))->text();
    } else if (kind == "CMPIObjectPath") {
        text += ' ' + utf8(objectOf<ObjectPathObject>(static_cast<const CMPIObjectPath*>(object)).value().toString());
    } else if (kind == "CMPIInstance") {
        text += ' ' + utf8(objectOf<InstanceObject>(static_cast<const CMPIInstance*>(object))
                               .completePath()
                               .withNameSpace()
                               .toString());
    } else if (kind == "CMPIDateTime") {
        text += ' ' + utf8(objectOf<DateTimeObject>(static_cast<const CMPIDateTime*>(object)).value().toString());
    }
    return text;
}

CMPIString* toString(const CMPIBroker*, const void* object, CMPIStatus* rc)
{
    return made<CMPIString>(rc, [&] { return Frame::current().make<StringObject>(describe(object)); });
}

CMPIBoolean isOfType(const CMPIBroker*, const void* object, const char* type, CMPIStatus* rc)
{
    return answer(rc, CMPIBoolean{0}, [&]() -> CMPIBoolean { return kindOf(object) == requireText(type); });
}

CMPIString* getType(const CMPIBroker*, const void* object, CMPIStatus* rc)
{
    return made<CMPIString>(rc, [&] { return Frame::current().make<StringObject>(std::string(kindOf(object))); });
}

CMPIString* getMessage(const CMPIBroker*, const char*, const char* text, CMPIStatus* rc, CMPICount count, ...)
{
    va_list args;
    va_start(args, count);
    CMPIString* result =
        made<CMPIString>(rc, [&] { return Frame::current().make<StringObject>(formatMessage(text, count, args)); });
    va_end(args);
    return result;
}

CMPIString* getMessage2(const CMPIBroker*, const char*, CMPIMsgFileHandle, const char* text, CMPIStatus* rc,
                        CMPICount count, ...)
{
    va_list args;
    va_start(args, count);
    CMPIString* result =
        made<CMPIString>(rc, [&] { return Frame::current().make<StringObject>(formatMessage(text, count, args)); });
    va_end(args);
    return result;
}

// "<id or component>: <text>", the text from either argument.
std::string logLine(const char* id, const char* text, const CMPIString* string)
{
    std::string line = id != nullptr && *id != '\0' ? std::string(id) + ": " : std::string();
    if (text != nullptr) {
        line += text;
    } else if (string != nullptr) {
        line += objectOf<StringObject>(string).text();
    }
    return line;
}

CMPIStatus logMessage(const CMPIBroker* broker, CMPISeverity severity, const char* id, const char* text,
                      const CMPIString* string)
{
    using Severity = BrokerServices::Severity;
    return perform([&] {
        const Severity level = severity == CMPI_SEV_ERROR     ? Severity::kError
                               : severity == CMPI_SEV_WARNING ? Severity::kWarning
                               : severity == CMPI_SEV_INFO    ? Severity::kInformation
                                                              : Severity::kDebug;
        Broker::of(broker).services().log(level, logLine(id, text, string));
    });
}

CMPIStatus trace(const CMPIBroker* broker, CMPILevel, const char* component, const char* text, const CMPIString* string)
{
    return perform(
        [&] { Broker::of(broker).services().log(BrokerServices::Severity::kDebug, logLine(component, text, string)); });
}

CMPIError* newCMPIError(const CMPIBroker*, const char*, const char*, const char*, CMPIErrorSeverity,
                        CMPIErrorProbableCause, CMPIrc, CMPIStatus* rc)
{
    return notSupported<CMPIError>(rc);
}

CMPIStatus openMessageFile(const CMPIBroker*, const char*, CMPIMsgFileHandle* handle)
{
    if (handle != nullptr) {
        *handle = nullptr;
    }
    return makeStatus(CMPI_RC_ERR_NOT_SUPPORTED, {});
}

CMPIStatus closeMessageFile(const CMPIBroker*, CMPIMsgFileHandle)
{
    return makeStatus(CMPI_RC_ERR_NOT_SUPPORTED, {});
}

CMPIPropertyList* newPropertyList(const CMPIBroker*, const char**, CMPIStatus* rc)
{
    return notSupported<CMPIPropertyList>(rc);
}

CMPIString* newStringCP(const CMPIBroker*, const char*, CMPICodepageID, CMPIStatus* rc)
{
    return notSupported<CMPIString>(rc);
}

CMPIEnumerationFilter* newEnumerationFilter(const CMPIBroker*, const char*, const char*, CMPIStatus* rc)
{
    return notSupported<CMPIEnumerationFilter>(rc);
}

} // namespace

const CMPIBrokerEncFT kFactoryTable{kTableVersion,
                                    newInstance,
                                    newObjectPath,
                                    newArgs,
                                    newString,
                                    newArray,
                                    newDateTime,
                                    newDateTimeFromBinary,
                                    newDateTimeFromChars,
                                    newSelectExp,
                                    classPathIsA,
                                    toString,
                                    isOfType,
                                    getType,
                                    getMessage,
                                    logMessage,
                                    trace,
                                    newCMPIError,
                                    openMessageFile,
                                    closeMessageFile,
                                    getMessage2,
                                    newPropertyList,
                                    newStringCP,
                                    newEnumerationFilter};

} // namespace Pegasus::cmpi
