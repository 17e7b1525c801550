// SPDX-License-Identifier: MIT
#include "host/cli/formats/ValueText.h"

#include <algorithm>
#include <map>
#include <set>

namespace vrxhost {
namespace {

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

    std::string Text(const std::string& indent) const
    {
        std::string text;
        std::set<std::string> shown;
        for (const std::string& root : fOrder) {
            if (fBelow.count(root) == 0) {
                text += indent + PathLabel(root) + "\n" + Branches(root, indent, shown);
            }
        }
        return text;
    }

  private:
    // shown: the objects whose branches have been shown, which keeps circles finite.
    std::string Branches(const std::string& above, const std::string& indent, std::set<std::string>& shown) const
    {
        const auto children = fChildren.find(above);
        std::string text;
        if (children == fChildren.end() || !shown.insert(above).second) {
            return text;
        }
        for (const std::string& child : children->second) {
            const bool isLast = &child == &children->second.back();
            text += indent + (isLast ? "`-- " : "|-- ") + PathLabel(child) + "\n" +
                    Branches(child, indent + (isLast ? "    " : "|   "), shown);
        }
        return text;
    }

    std::vector<std::string> fOrder;
    std::map<std::string, std::vector<std::string>> fChildren;
    std::set<std::string> fBelow;
};

} // namespace

std::string AssociationTree(const std::vector<const TClassRecord*>& associations, const std::string& indent)
{
    TTree tree;
    for (const TClassRecord* association : associations) {
        for (const TInstanceRecord& link : association->fInstances) {
            tree.Add(link, *association);
        }
    }
    return tree.Text(indent);
}

} // namespace vrxhost
