// SPDX-License-Identifier: MIT
#include "host/cli/formats/JsonValues.h"

#include "display/PlainText.h"
#include "host/cli/formats/ValueText.h"

#include <charconv>
#include <cmath>

namespace vrxhost {
namespace {

using NKOLVRX20::TCIMValue;
using TType = TCIMValue::TCIMType;

// Converts through the shortest text, so that a real32 of 0.1 is shown as 0.1 (widened: 0.10000000149011612).
TJson RealValue(const TCIMValue& value)
{
    const auto wide = static_cast<double>(value);
    if (!std::isfinite(wide)) {
        return std::isnan(wide) ? "NaN" : wide > 0 ? "Infinity" : "-Infinity";
    }
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
    switch (value.GetType()) {
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

TJson Loss(const TLoss& loss)
{
    TJson json = {{"kind", WordOf(loss.fKind)}, {"text", loss.GetText()}};
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

} // namespace

TJson JsonValue(const TCIMValue& value)
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

TJson JsonProperties(const TClassRecord& each, const TInstanceRecord& instance, const TFormatOptions& options)
{
    TJson properties = TJson::object();
    for (const auto& property : instance.fProperties) {
        if (IsKept(each, property, options)) {
            properties[property.fName] = JsonValue(property.fValue);
        }
    }
    return properties;
}

TJson JsonDeclarations(const TClassRecord& each)
{
    TJson declarations = TJson::array();
    for (const auto& property : each.fProperties) {
        TJson json = {{"name", property.fName}, {"type", property.fType}, {"key", property.fIsKey}};
        if (property.fIsCounter) {
            json["counter"] = true;
        }
        if (property.fIsVolatile) {
            json["volatile"] = true;
        }
        if (!property.fUnits.empty()) {
            json["units"] = property.fUnits;
        }
        if (!property.fPUnit.empty()) {
            json["punit"] = property.fPUnit;
        }
        if (!property.fValueMap.empty()) {
            json["valueMap"] = property.fValueMap;
        }
        if (!property.fValues.empty()) {
            json["values"] = property.fValues;
        }
        declarations.push_back(std::move(json));
    }
    return declarations;
}

TJson JsonHost(const THostFacts& host)
{
    TJson json = {{"name", host.fName}};
    const std::pair<const char*, const std::string&> texts[] = {
        {"machineId", host.fMachineId}, {"product", host.fProduct}, {"serial", host.fSerial}};
    for (const auto& [name, text] : texts) {
        if (!text.empty()) {
            json[name] = text;
        }
    }
    return json;
}

void AddLosses(TJson& json, const TDocument& document)
{
    json["complete"] = document.fComplete;
    json["losses"] = TJson::array();
    json["notes"] = TJson::array();
    for (const TLoss& loss : document.fLosses) {
        json[loss.fIsNote ? "notes" : "losses"].push_back(Loss(loss));
    }
}

std::string JsonText(const TJson& json, int indent)
{
    return json.dump(indent, ' ', false, TJson::error_handler_t::replace) + "\n";
}

} // namespace vrxhost
