// SPDX-License-Identifier: MIT
#include "host/cli/formats/ValueText.h"

#include "display/PlainText.h"
#include "host/cli/formats/TextLayout.h"
#include "host/cli/model/Printable.h"

#include <algorithm>

namespace vrxhost {
namespace {

using NKOLVRX20::TCIMValue;

constexpr unsigned char kDecimal = 10;
constexpr char kCreationClassName[] = "CreationClassName";

bool EndsWith(const std::string& text, const std::string& end)
{
    return text.size() >= end.size() && text.compare(text.size() - end.size(), end.size(), end) == 0;
}

// A weak key of the CIM schema that repeats the name of the class, or of the system that an instance belongs to.
bool RepeatsName(const std::string& key)
{
    return EndsWith(key, kCreationClassName) || key == "SystemName" || key == "CSName";
}

std::string NumberText(const TCIMValue& number, const std::string& unit)
{
    if (const auto magnitude = NKOLVRX20::Magnitude(number, unit)) {
        return *magnitude;
    }
    return NKOLVRX20::GroupedDigits(number.ToString(kDecimal)) + (unit.empty() ? "" : " " + unit);
}

// Returns: the text that a plain number has, to tell it from one that Values replaces.
std::string PlainNumber(const TCIMValue& number, const std::string& unit)
{
    return number.ToString(kDecimal) + (unit.empty() ? "" : " " + unit);
}

std::string UnitOf(const TPropertyDeclRecord* declaration)
{
    return !declaration ? "" : declaration->fUnits.empty() ? declaration->fPUnit : declaration->fUnits;
}

struct TKeyText
{
    std::string fName;
    std::string fValue;
};

// "A.k=\"x\",l=2": quoted values may hold commas and escaped quotes.
std::vector<TKeyText> KeysOf(const std::string& path, std::size_t at)
{
    std::vector<TKeyText> keys;
    while (at < path.size()) {
        const std::size_t equals = path.find('=', at);
        if (equals == std::string::npos) {
            break;
        }
        TKeyText key{path.substr(at, equals - at), ""};
        bool quoted = false;
        for (at = equals + 1; at < path.size() && (quoted || path[at] != ','); ++at) {
            if (path[at] == '\\' && at + 1 < path.size()) {
                key.fValue += path[++at];
            } else if (path[at] == '"') {
                quoted = !quoted;
            } else {
                key.fValue += path[at];
            }
        }
        ++at; // the comma
        keys.push_back(std::move(key));
    }
    return keys;
}

} // namespace

std::string ValueText(const TPropertyRecord& property, const TPropertyDeclRecord* declaration,
                      const TFormatOptions& options)
{
    if (options.fRaw || property.fText.empty()) {
        return Printable(property.fText);
    }
    const std::string unit = UnitOf(declaration);
    const TCIMValue& value = property.fValue;
    if (!value.IsArray()) {
        return Printable(NKOLVRX20::IsNumber(value) && property.fText == PlainNumber(value, unit)
                             ? NumberText(value, unit)
                             : property.fText);
    }
    std::string plain;
    std::string joined;
    for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(value)) {
        if (!NKOLVRX20::IsNumber(element)) {
            return Printable(property.fText);
        }
        plain += (plain.empty() ? "" : ", ") + PlainNumber(element, unit);
        joined += (joined.empty() ? "" : ", ") + NumberText(element, unit);
    }
    return Printable(plain == property.fText ? joined : property.fText);
}

std::string ShownNumber(const TPropertyRecord& property, const TPropertyDeclRecord* declaration)
{
    const TCIMValue& value = property.fValue;
    const bool isShown =
        !value.IsArray() && NKOLVRX20::IsNumber(value) && property.fText == PlainNumber(value, UnitOf(declaration));
    return isShown ? value.ToString(kDecimal) : "";
}

bool IsKept(const TClassRecord& each, const TPropertyRecord& property, const TFormatOptions& options)
{
    const TPropertyDeclRecord* const declaration = each.Find(property.fName);
    return !options.fStable || !declaration || !declaration->fIsVolatile;
}

bool IsShown(const TClassRecord& each, const TPropertyRecord& property, const TFormatOptions& options)
{
    const TPropertyDeclRecord* const declaration = each.Find(property.fName);
    const bool isRepeated = declaration && declaration->fIsKey && RepeatsName(property.fName);
    return !property.fValue.IsNull() && (options.fAll || !isRepeated) && IsKept(each, property, options);
}

std::vector<std::string> ShownColumns(const TClassRecord& each, const TFormatOptions& options)
{
    std::vector<std::string> names;
    for (const TInstanceRecord& instance : each.fInstances) {
        for (const TPropertyRecord& property : instance.fProperties) {
            if (IsShown(each, property, options) &&
                std::find(names.begin(), names.end(), property.fName) == names.end())
            {
                names.push_back(property.fName);
            }
        }
    }
    std::stable_partition(names.begin(), names.end(), [&each](const std::string& name) {
        const TPropertyDeclRecord* const declaration = each.Find(name);
        return declaration && declaration->fIsKey;
    });
    return names;
}

std::string ValueList(const TPropertyDeclRecord& property)
{
    std::string list;
    for (std::size_t i = 0; i < property.fValues.size(); ++i) {
        const std::string value = property.fValueMap.empty()      ? std::to_string(i)
                                  : i < property.fValueMap.size() ? property.fValueMap[i]
                                                                  : "";
        list += (list.empty() ? "" : ", ") + value + (value.empty() ? "" : " ") + property.fValues[i];
    }
    return list;
}

std::string LocalPath(const std::string& path)
{
    const std::size_t dot = path.find('.');
    const std::size_t colon = path.rfind(':', dot);
    return colon == std::string::npos ? path : path.substr(colon + 1);
}

std::string PathLabel(const std::string& path)
{
    const std::string local = LocalPath(path);
    const std::size_t dot = local.find('.');
    std::string label = local.substr(0, dot);
    if (dot == std::string::npos) {
        return Printable(label);
    }
    for (const TKeyText& key : KeysOf(local, dot + 1)) {
        if (!RepeatsName(key.fName)) {
            label += " " + key.fValue;
        }
    }
    return Printable(label);
}

std::string CheckText(const TCheck& check, const TFormatOptions& options)
{
    const std::string took = check.fTook.empty() || options.fStable ? "" : ", in " + check.fTook;
    return (check.fIsNote ? "note: " : check.fIsOk ? "ok: " : "FAILED: ") + check.fText + took;
}

} // namespace vrxhost
