// SPDX-License-Identifier: MIT
#include "host/cli/formats/Differences.h"

#include "host/cli/formats/TextLayout.h"
#include "host/cli/formats/ValueText.h"
#include "host/cli/model/Printable.h"

namespace vrxhost {
namespace {

std::string SideText(const TPropertyRecord& side, const TPropertyDeclRecord& declaration, const TFormatOptions& options)
{
    const std::string text = ValueText(side, &declaration, options);
    return side.fValue.IsNull() ? "null" : text.empty() ? "\"\"" : text;
}

TJson JsonSide(const TPropertyRecord& side)
{
    return {{"value", JsonValue(side.fValue)}, {"text", side.fText}};
}

} // namespace

const char* NameOf(EDifference kind)
{
    switch (kind) {
    case EDifference::kAdded:
        return "added";
    case EDifference::kRemoved:
        return "removed";
    case EDifference::kChanged:
        return "changed";
    default:
        return "unknown";
    }
}

TJson JsonDifference(const TDifference& difference)
{
    TJson json = {{"kind", NameOf(difference.fKind)}, {"class", difference.fClass}};
    if (!difference.fPath.empty()) {
        json["path"] = difference.fPath;
    }
    const TPropertyDeclRecord& declaration = difference.fDeclaration;
    if (!declaration.fName.empty()) {
        json["property"] = declaration.fName;
        const std::string& units = declaration.fUnits.empty() ? declaration.fPUnit : declaration.fUnits;
        if (!units.empty()) {
            json["units"] = units;
        }
        json["from"] = JsonSide(difference.fFrom);
        json["to"] = JsonSide(difference.fTo);
    }
    if (!difference.fReason.empty()) {
        json["reason"] = difference.fReason;
    }
    return json;
}

std::string DifferenceLines(const TComparison& comparison, const TFormatOptions& options)
{
    std::string out;
    std::string className;
    std::string path; // of the changed instance
    for (const TDifference& each : comparison.fDifferences) {
        if (each.fClass != className) {
            className = each.fClass;
            path.clear();
            out += std::string(out.empty() ? "" : "\n") + className + "\n";
        }
        const std::string& property = each.fDeclaration.fName;
        const std::string what = !each.fPath.empty() ? each.fPath : !each.fReason.empty() ? each.fReason : "the class";
        if (property.empty() || each.fPath != path) {
            out += "  " + Padded(property.empty() ? NameOf(each.fKind) : "changed", 9) + Printable(what) + "\n";
        }
        path = property.empty() ? "" : each.fPath;
        if (!property.empty()) {
            const std::string reason = each.fReason.empty() ? "" : "  (unknown: " + Printable(each.fReason) + ")";
            out += LabelledLines({{property, SideText(each.fFrom, each.fDeclaration, options) + " -> " +
                                                 SideText(each.fTo, each.fDeclaration, options) + reason}},
                                 "    ", options.fWidth);
        }
    }
    return out.empty() ? "no difference\n" : out;
}

TJson JsonComparison(const TComparison& comparison)
{
    TJson json = {{"from", comparison.fFrom}, {"to", comparison.fTo}, {"differences", TJson::array()}};
    for (const TDifference& each : comparison.fDifferences) {
        json["differences"].push_back(JsonDifference(each));
    }
    return json;
}

} // namespace vrxhost
