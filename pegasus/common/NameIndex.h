// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/common/ObjectReps.h"

#include <algorithm>
#include <numeric>
#include <vector>

namespace Pegasus {

// Finds the items of a list by their names, letter case ignored. Few items are compared one by one. Many are sorted
// once: a class or an instance may have thousands of properties, and a look-up for each of them in a list would take
// time in the square of their number.
// Requires: the list outlives the index, and it and its names stay unchanged.
template <typename Item> class NameIndex
{
  public:
    explicit NameIndex(const Array<Item>& items) : fItems(items.getData()), fSize(items.size())
    {
        if (fSize <= kUnsortedSize) {
            return;
        }
        fOrder.resize(fSize);
        std::iota(fOrder.begin(), fOrder.end(), 0u);
        std::sort(fOrder.begin(), fOrder.end(), [this](Uint32 x, Uint32 y) { return isLess(nameAt(x), nameAt(y)); });
    }

    // Returns: the place in the list, or PEG_NOT_FOUND. Of items of one name, any is found.
    Uint32 find(const CIMName& name) const
    {
        if (fOrder.empty()) {
            const Item* end = fItems + fSize;
            const Item* found =
                std::find_if(fItems, end, [&name](const Item& item) { return nameOf(item).equal(name); });
            return found == end ? PEG_NOT_FOUND : static_cast<Uint32>(found - fItems);
        }
        const auto found = std::lower_bound(fOrder.begin(), fOrder.end(), name,
                                            [this](Uint32 at, const CIMName& key) { return isLess(nameAt(at), key); });
        return found != fOrder.end() && nameAt(*found).equal(name) ? *found : PEG_NOT_FOUND;
    }

    bool has(const CIMName& name) const { return find(name) != PEG_NOT_FOUND; }

  private:
    static constexpr Uint32 kUnsortedSize = 64;

    static const CIMName& nameOf(const CIMName& name) { return name; }
    template <typename Member> static const CIMName& nameOf(const Member& member) { return member.getName(); }
    const CIMName& nameAt(Uint32 index) const { return nameOf(fItems[index]); }

    static bool isLess(const CIMName& x, const CIMName& y)
    {
        const String& left = x.getString();
        const String& right = y.getString();
        const Char16* l = left.getChar16Data();
        const Char16* r = right.getChar16Data();
        return std::lexicographical_compare(l, l + left.size(), r, r + right.size(), [](Char16 a, Char16 b) {
            return base::lowerAscii(Uint16(a)) < base::lowerAscii(Uint16(b));
        });
    }

    const Item* fItems;
    Uint32 fSize;
    std::vector<Uint32> fOrder; // places in the list by name; empty for few items
};

} // namespace Pegasus
