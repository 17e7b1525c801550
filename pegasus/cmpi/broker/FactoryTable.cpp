// SPDX-License-Identifier: MIT
#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/cmpi/broker/BrokerTables.h"
#include "pegasus/cmpi/broker/MessageText.h"
#include "pegasus/cmpi/broker/ObjectKinds.h"
#include "pegasus/cmpi/objects/ArgsObject.h"
#include "pegasus/cmpi/objects/ArrayObject.h"
#include "pegasus/cmpi/objects/DateTimeObject.h"
#include "pegasus/cmpi/objects/ErrorObject.h"
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <cstdarg>

// The functions with which providers make objects, ask for their kinds, and write messages and log lines.
namespace Pegasus::cmpi {
namespace {

template <typename Face, typename Make> Face* made(CMPIStatus* rc, Make&& make)
{
    return answer(rc, static_cast<Face*>(nullptr), [&]() -> Face* { return make(); });
}

template <typename Face> Face* notSupported(CMPIStatus* rc)
{
    return answer(rc, static_cast<Face*>(nullptr), []() -> Face* { throw CmpiError{CMPI_RC_ERR_NOT_SUPPORTED, {}}; });
}

CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* rc)
{
    return made<CMPIInstance>(rc, [&] {
        if (path == nullptr) {
            throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
        }
        return Frame::current().make<InstanceObject>(Broker::of(broker), objectOf<ObjectPathObject>(path).state);
    });
}

CMPIObjectPath* newObjectPath(const CMPIBroker* broker, const char* nameSpace, const char* className, CMPIStatus* rc)
{
    return made<CMPIObjectPath>(rc, [&] {
        Broker& owner = Broker::of(broker);
        Frame& frame = Frame::current();
        const bool isNamed = nameSpace != nullptr && *nameSpace != '\0';
        const std::string own = isNamed ? std::string() : base::utf8(frame.origin().nameSpace);
        return frame.make<ObjectPathObject>(owner, PathState(owner, isNamed ? nameSpace : own.c_str(), className));
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
        throw CmpiError{CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, {}};
    });
}

CMPIBoolean classPathIsA(const CMPIBroker* broker, const CMPIObjectPath* path, const char* className, CMPIStatus* rc)
{
    return answer(rc, CMPIBoolean{0}, [&]() -> CMPIBoolean {
        Broker& owner = Broker::of(broker);
        if (path == nullptr || className == nullptr) {
            throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
        }
        if (!CIMName::legal(base::fromUtf8Repaired(className))) {
            throw CmpiError{CMPI_RC_ERR_INVALID_CLASS, {}};
        }
        const PathState& state = objectOf<ObjectPathObject>(path).state;
        if (base::equalNoCase(base::utf8(state.className), className)) {
            return 1;
        }
        const std::string nameSpace = base::utf8(state.nameSpace.getString());
        for (const ClassSchema* at = state.schema; at != nullptr && !at->superClass().isNull();
             at = owner.classes().find(nameSpace, base::utf8(at->superClass())))
        {
            if (base::equalNoCase(base::utf8(at->superClass()), className)) {
                return 1;
            }
        }
        return 0;
    });
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
    if (text == nullptr && string == nullptr) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
    }
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

CMPIError* newCMPIError(const CMPIBroker* broker, const char* owner, const char* messageId, const char* message,
                        CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc code, CMPIStatus* rc)
{
    return made<CMPIError>(rc, [&] {
        return Frame::current().make<ErrorObject>(Broker::of(broker), owner, messageId, message, severity, cause, code);
    });
}

// A message file has no translations here: getMessage2 formats the default text.
CMPIStatus openMessageFile(const CMPIBroker*, const char*, CMPIMsgFileHandle* handle)
{
    static char fgNoTranslations;
    if (handle != nullptr) {
        *handle = &fgNoTranslations;
    }
    return makeStatus(CMPI_RC_OK, {});
}

CMPIStatus closeMessageFile(const CMPIBroker*, CMPIMsgFileHandle)
{
    return makeStatus(CMPI_RC_OK, {});
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
