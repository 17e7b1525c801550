// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ErrorObject.h"

#include "pegasus/cmpi/objects/StringObject.h"

namespace Pegasus::cmpi {
namespace {

template <auto Member> auto getValue(const CMPIError* self, CMPIStatus* rc)
{
    using Value = std::decay_t<decltype(std::declval<ErrorObject>().*Member)>;
    return answer(rc, Value{}, [&]() -> Value { return objectOf<ErrorObject>(self).*Member; });
}

template <auto Member, typename Value> CMPIStatus setValue(const CMPIError* self, Value value)
{
    return perform([&] { objectOf<ErrorObject>(self).*Member = value; });
}

template <ErrorObject::Text Which> CMPIString* getText(const CMPIError* self, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIString*>(nullptr), [&]() -> CMPIString* {
        const std::optional<std::string>& text = objectOf<ErrorObject>(self).texts[Which];
        return text ? Frame::current().make<StringObject>(*text) : nullptr;
    });
}

template <ErrorObject::Text Which> CMPIStatus setText(const CMPIError* self, const char* text)
{
    return perform([&] { objectOf<ErrorObject>(self).texts[Which] = requireText(text); });
}

template <ErrorObject::List Which> CMPIArray* getList(const CMPIError* self, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIArray*>(nullptr), [&]() -> CMPIArray* {
        const ErrorObject& error = objectOf<ErrorObject>(self);
        return Frame::current().make<ArrayObject>(error.broker, CMPIType{CMPI_string}, error.lists[Which]);
    });
}

template <ErrorObject::List Which> CMPIStatus setList(const CMPIError* self, const CMPIArray* texts)
{
    return perform([&] {
        const ArrayObject& array = objectOf<ArrayObject>(texts);
        if (cimTypeOf(array.elementType()) != CIMTYPE_STRING) {
            throw CmpiError{CMPI_RC_ERR_TYPE_MISMATCH, {}};
        }
        array.markUsed();
        objectOf<ErrorObject>(self).lists[Which] = array.elements();
    });
}

std::optional<std::string> textOrNone(const char* text)
{
    return text == nullptr ? std::nullopt : std::optional<std::string>(text);
}

} // namespace

const CMPIErrorFT kErrorTable{kTableVersion,
                              releaseObject<ErrorObject, CMPIError>,
                              cloneObject<ErrorObject, CMPIError>,
                              getValue<&ErrorObject::type>,
                              getText<ErrorObject::kOtherErrorType>,
                              getText<ErrorObject::kOwningEntity>,
                              getText<ErrorObject::kMessageId>,
                              getText<ErrorObject::kMessage>,
                              getValue<&ErrorObject::severity>,
                              getValue<&ErrorObject::cause>,
                              getText<ErrorObject::kProbableCauseDescription>,
                              getList<ErrorObject::kRecommendedActions>,
                              getText<ErrorObject::kErrorSource>,
                              getValue<&ErrorObject::sourceFormat>,
                              getText<ErrorObject::kOtherErrorSourceFormat>,
                              getValue<&ErrorObject::code>,
                              getText<ErrorObject::kStatusCodeDescription>,
                              getList<ErrorObject::kMessageArguments>,
                              setValue<&ErrorObject::type>,
                              setText<ErrorObject::kOtherErrorType>,
                              setText<ErrorObject::kProbableCauseDescription>,
                              setList<ErrorObject::kRecommendedActions>,
                              setText<ErrorObject::kErrorSource>,
                              setValue<&ErrorObject::sourceFormat>,
                              setText<ErrorObject::kOtherErrorSourceFormat>,
                              setText<ErrorObject::kStatusCodeDescription>,
                              setList<ErrorObject::kMessageArguments>};

ErrorObject::ErrorObject(Broker& owner, const char* owningEntity, const char* messageId, const char* message,
                         CMPIErrorSeverity perceived, CMPIErrorProbableCause probable, CMPIrc statusCode)
    : CMPIError{nullptr, &kErrorTable}, broker(owner), severity(perceived), cause(probable), code(statusCode)
{
    hdl = this;
    texts[kOwningEntity] = textOrNone(owningEntity);
    texts[kMessageId] = textOrNone(messageId);
    texts[kMessage] = textOrNone(message);
}

ErrorObject::ErrorObject(const ErrorObject& other)
    : CMPIError{nullptr, &kErrorTable}, broker(other.broker), type(other.type), sourceFormat(other.sourceFormat),
      severity(other.severity), cause(other.cause), code(other.code), texts(other.texts), lists(other.lists)
{
    hdl = this;
}

} // namespace Pegasus::cmpi
