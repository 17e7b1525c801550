// SPDX-License-Identifier: MIT
#include "host/cli/formats/AssociationTree.h"

#include "host/cli/formats/ValueText.h"

#include <algorithm>
#include <iterator>

namespace vrxhost {
namespace {

constexpr int kMaxDepth = 64; // a vendor's chain of links must not exhaust the stack

bool IsUpperEnd(const std::string& name)
{
    const char* const beginnings[] = {"Group", "Ante", "Parent"};
    return std::any_of(std::begin(beginnings), std::end(beginnings),
                       [&name](const char* begin) { return name.rfind(begin, 0) == 0; });
}

std::string Branches(const std::vector<TLinkedObject>& parts, const std::string& indent)
{
    std::string text;
    for (const TLinkedObject& part : parts) {
        const bool isLast = &part == &parts.back();
        text += indent + (isLast ? "`-- " : "|-- ") + PathLabel(part.fPath) + "\n" +
                Branches(part.fParts, indent + (isLast ? "    " : "|   "));
    }
    return text;
}

} // namespace

bool TLinks::Add(const TClassRecord& association, const TInstanceRecord& link)
{
    std::vector<const TPropertyRecord*> ends;
    for (const TPropertyRecord& property : link.fProperties) {
        const TPropertyDeclRecord* const declaration = association.Find(property.fName);
        if (declaration && declaration->fType == "reference" && !property.fText.empty()) {
            ends.push_back(&property);
        }
    }
    if (ends.size() != 2) {
        return false;
    }
    if (IsUpperEnd(ends[1]->fName)) {
        std::swap(ends[0], ends[1]);
    }
    const std::string above = LocalPath(ends[0]->fText);
    const std::string below = LocalPath(ends[1]->fText);
    std::vector<std::string>& parts = fParts[above];
    if (parts.empty()) {
        fOrder.push_back(above);
    }
    parts.push_back(below);
    fBelow.insert(below);
    return true;
}

// Objects that are below each other in a circle begin where the first link does.
std::vector<TLinkedObject> TLinks::GetObjects() const
{
    std::vector<TLinkedObject> objects;
    std::set<std::string> shown;
    for (const bool isInCircle : {false, true}) {
        for (const std::string& path : fOrder) {
            if (isInCircle ? shown.count(path) == 0 : fBelow.count(path) == 0) {
                objects.push_back(ObjectOf(path, 0, shown));
            }
        }
    }
    return objects;
}

// shown: the objects whose branches have been shown, which keeps circles finite.
TLinkedObject TLinks::ObjectOf(const std::string& path, int depth, std::set<std::string>& shown) const
{
    TLinkedObject object{path, {}};
    const auto parts = fParts.find(path);
    if (parts != fParts.end() && depth < kMaxDepth && shown.insert(path).second) {
        for (const std::string& part : parts->second) {
            object.fParts.push_back(ObjectOf(part, depth + 1, shown));
        }
    }
    return object;
}

std::string AssociationTree(const std::vector<TLinkedObject>& objects, const std::string& indent)
{
    std::string text;
    for (const TLinkedObject& object : objects) {
        text += indent + PathLabel(object.fPath) + "\n" + Branches(object.fParts, indent);
    }
    return text;
}

} // namespace vrxhost
