#include "display/PlainText.h"
#include "host/cli/model/Document.h"

#include <nlohmann/json.hpp>

#include <charconv>

namespace vrxhost {
namespace {

using NKOLVRX20::TCIMValue;
using TJson = nlohmann::ordered_json;
using TType = TCIMValue::TCIMType;

// Converts through the shortest text, so that a real32 of 0.1 is shown as 0.1 (widened: 0.10000000149011612).
TJson RealValue(const TCIMValue& value)
{
    const std::string text = value.ToString(10);
    double number = 0;
    std::from_chars(text.data(), text.data() + text.size(), number);
    return number;
}

TJson ScalarValue(const TCIMValue& value)
{
    if (value.IsNull()) {
        return nullptr;
    }
    const auto type = value.GetType();
    switch (type) {
    case TType::kBoolean:
        return static_cast<bool>(value);
    case TType::kUint8:
    case TType::kUint16:
    case TType::kUint32:
    case TType::kUint64:
        return static_cast<unsigned long>(value);
    case TType::kSint8:
    case TType::kSint16:
    case TType::kSint32:
    case TType::kSint64:
        return static_cast<long>(value);
    case TType::kReal32:
    case TType::kReal64:
        return RealValue(value);
    case TType::kChar16:
        return NKOLVRX20::CharacterText(static_cast<NKOLVRX20::TCIMChar16>(value));
    default:
        return value.ToString(10);
    }
}

TJson Value(const TCIMValue& value)
{
    if (!value.IsArray()) {
        return ScalarValue(value);
    }
    TJson array = TJson::array();
    for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(value)) {
        array.push_back(ScalarValue(element));
    }
    return array;
}

TJson Instance(const TInstanceRecord& instance)
{
    TJson properties = TJson::object();
    for (const auto& property : instance.fProperties) {
        properties[property.fName] = Value(property.fValue);
    }
    return {{"path", instance.fPath}, {"properties", std::move(properties)}};
}

TJson Method(const TMethodRecord& method)
{
    TJson parameters = TJson::array();
    for (const auto& parameter : method.fParameters) {
        parameters.push_back({{"name", parameter.fName}, {"type", parameter.fType}});
    }
    return {{"name", method.fName}, {"type", method.fReturnType}, {"parameters", std::move(parameters)}};
}

void AddDeclarations(TJson& json, const TClassRecord& each)
{
    json["superclass"] = each.fSuperClass.empty() ? TJson() : TJson(each.fSuperClass);
    json["properties"] = TJson::array();
    for (const auto& property : each.fProperties) {
        json["properties"].push_back({{"name", property.fName}, {"type", property.fType}, {"key", property.fIsKey}});
    }
    json["methods"] = TJson::array();
    for (const auto& method : each.fMethods) {
        json["methods"].push_back(Method(method));
    }
}

TJson Class(const TClassRecord& each, ECommand command)
{
    TJson json = {{"name", each.fName}};
    if (command == ECommand::kClasses) {
        AddDeclarations(json, each);
    }
    if (command == ECommand::kInventory || command == ECommand::kInstances) {
        json["instances"] = TJson::array();
        for (const auto& instance : each.fInstances) {
            json["instances"].push_back(Instance(instance));
        }
    }
    return json;
}

TJson Provider(const TProviderRecord& provider, ECommand command)
{
    TJson json = {{"name", provider.fName}, {"module", provider.fModule}, {"description", provider.fDescription}};
    json["classes"] = TJson::array();
    for (const auto& each : provider.fClasses) {
        json["classes"].push_back(Class(each, command));
    }
    return json;
}

TJson Loss(const TLoss& loss)
{
    TJson json = {{"text", loss.GetText()}};
    const std::pair<const char*, const std::string&> texts[] = {
        {"vendor", loss.fVendor}, {"file", loss.fFile}, {"property", loss.fProperty}};
    for (const auto& [name, text] : texts) {
        if (!text.empty()) {
            json[name] = text;
        }
    }
    if (!loss.fClasses.empty()) {
        json["classes"] = loss.fClasses;
    }
    if (!loss.fLog.empty()) {
        json["log"] = loss.fLog;
    }
    return json;
}

void AddLosses(TJson& json, const std::vector<TLoss>& losses)
{
    json["losses"] = TJson::array();
    json["notes"] = TJson::array();
    for (const TLoss& loss : losses) {
        json[loss.fIsNote ? "notes" : "losses"].push_back(Loss(loss));
    }
}

TJson Body(const TDocument& document)
{
    if (document.fCommand == ECommand::kInstances) {
        for (const auto& provider : document.fProviders) {
            for (const auto& each : provider.fClasses) {
                return Class(each, document.fCommand);
            }
        }
        return TJson::object();
    }
    TJson body = {{"providers", TJson::array()}};
    for (const auto& provider : document.fProviders) {
        body["providers"].push_back(Provider(provider, document.fCommand));
    }
    return body;
}

} // namespace

std::string RenderJson(const TDocument& document)
{
    TJson json = Body(document);
    json["complete"] = document.fComplete;
    AddLosses(json, document.fLosses);
    return json.dump(2, ' ', false, TJson::error_handler_t::replace) + "\n";
}

} // namespace vrxhost
