// SPDX-License-Identifier: MIT
#include "host/cli/formats/AssociationTree.h"

#include "host/cli/formats/ValueText.h"

#include <algorithm>
#include <map>
#include <set>

namespace vrxhost {
namespace {

constexpr int kMaxDepth = 64; // a vendor's chain of links must not exhaust the stack

bool IsUpperEnd(const std::string& name)
{
    const char* const beginnings[] = {"Group", "Ante", "Parent"};
    return std::any_of(std::begin(beginnings), std::end(beginnings),
                       [&name](const char* begin) { return name.rfind(begin, 0) == 0; });
}

class TTree
{
  public:
    void Add(const TInstanceRecord& link, const TClassRecord& association)
    {
        std::vector<const TPropertyRecord*> ends;
        for (const TPropertyRecord& property : link.fProperties) {
            const TPropertyDeclRecord* const declaration = association.Find(property.fName);
            if (declaration && declaration->fType == "reference" && !property.fText.empty()) {
                ends.push_back(&property);
            }
        }
        if (ends.size() != 2) {
            return;
        }
        if (IsUpperEnd(ends[1]->fName)) {
            std::swap(ends[0], ends[1]);
        }
        const std::string above = LocalPath(ends[0]->fText);
        const std::string below = LocalPath(ends[1]->fText);
        if (fChildren.count(above) == 0) {
            fOrder.push_back(above);
        }
        fChildren[above].push_back(below);
        fBelow.insert(below);
    }

    std::vector<TLinkedObject> Objects() const
    {
        std::vector<TLinkedObject> objects;
        std::set<std::string> shown;
        for (const std::string& root : fOrder) {
            if (fBelow.count(root) == 0) {
                objects.push_back(Object(root, 0, shown));
            }
        }
        return objects;
    }

  private:
    // shown: the objects whose branches have been shown, which keeps circles finite.
    TLinkedObject Object(const std::string& path, int depth, std::set<std::string>& shown) const
    {
        TLinkedObject object{path, {}};
        const auto children = fChildren.find(path);
        if (children != fChildren.end() && depth < kMaxDepth && shown.insert(path).second) {
            for (const std::string& child : children->second) {
                object.fParts.push_back(Object(child, depth + 1, shown));
            }
        }
        return object;
    }

    std::vector<std::string> fOrder;
    std::map<std::string, std::vector<std::string>> fChildren;
    std::set<std::string> fBelow;
};

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

std::vector<TLinkedObject> LinkedObjects(const std::vector<const TClassRecord*>& associations)
{
    TTree tree;
    for (const TClassRecord* association : associations) {
        for (const TInstanceRecord& link : association->fInstances) {
            tree.Add(link, *association);
        }
    }
    return tree.Objects();
}

std::string AssociationTree(const std::vector<const TClassRecord*>& associations, const std::string& indent)
{
    std::string text;
    for (const TLinkedObject& object : LinkedObjects(associations)) {
        text += indent + PathLabel(object.fPath) + "\n" + Branches(object.fParts, indent);
    }
    return text;
}

} // namespace vrxhost
