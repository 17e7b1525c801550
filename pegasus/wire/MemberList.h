// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/ObjectReps.h"
#include "pegasus/wire/XmlDocument.h"

#include <string>
#include <unordered_set>

namespace Pegasus::wire {

// Fills the list of an owner's members of one kind, such as the properties of a class, from their elements. Each member
// has a name of its own, letter case ignored. The time grows with the number of members, not with its square.
template <typename Item> class MemberList
{
  public:
    // The list must outlive this object.
    MemberList(Array<Item>& items, std::size_t maxMembers) : fItems(items), fMaxMembers(maxMembers) {}

    // Throws: XmlError at `element`, which the item was read from: a name that the list has, or a member too many.
    void add(const XmlElement& element, const Item& item)
    {
        if (fItems.size() >= fMaxMembers) {
            element.fail(XmlError::Kind::kTooLarge,
                         "more than " + std::to_string(fMaxMembers) + " members of one owner");
        }
        if (!isNew(item.getName())) {
            element.fail(XmlError::Kind::kSemantic, "a second " + std::string(element.name()) + " named \"" +
                                                        base::utf8(item.getName().getString()) + "\"");
        }
        fItems.append(item);
    }

  private:
    // Fewer are compared one by one, which costs less than to hash them.
    static constexpr Uint32 kHashedFrom = 64;

    bool isNew(const CIMName& name)
    {
        if (fItems.size() < kHashedFrom) {
            return ObjectAccess::find(fItems, name) == PEG_NOT_FOUND;
        }
        for (Uint32 i = 0; fNames.size() < fItems.size(); ++i) {
            fNames.insert(folded(fItems[i].getName()));
        }
        return fNames.insert(folded(name)).second;
    }

    static std::string folded(const CIMName& name) { return base::foldCase(base::utf8(name.getString())); }

    Array<Item>& fItems;
    std::size_t fMaxMembers;
    std::unordered_set<std::string> fNames; // of all members, once there are many
};

} // namespace Pegasus::wire
