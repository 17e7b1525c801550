// SPDX-License-Identifier: MIT
#include "pegasus/wire/NameCache.h"

#include "pegasus/base/Text.h"

#include <algorithm>
#include <functional>
#include <utility>

namespace Pegasus::wire {
namespace {

// More than a message of one class uses.
constexpr std::size_t kMaxSlots = 1024;
constexpr std::size_t kFirstSlots = 32; // enough for a request
// Longer names are converted each time.
constexpr std::size_t kMaxKeptBytes = 128;

} // namespace

std::size_t NameCache::slotOf(std::string_view utf8) const
{
    return std::hash<std::string_view>()(utf8) & (fSlots.size() - 1); // a power of two
}

const CIMName* NameCache::find(std::string_view utf8) const
{
    if (fSlots.empty() || utf8.empty()) {
        return nullptr;
    }
    const Slot& slot = fSlots[slotOf(utf8)];
    return slot.utf8 == utf8 ? &slot.name : nullptr;
}

const CIMName& NameCache::add(std::string_view utf8)
{
    CIMName name(base::fromUtf8(utf8));
    if (utf8.size() > kMaxKeptBytes) {
        fLongName = name;
        return fLongName;
    }
    if (fSlots.size() < kMaxSlots && fAdded >= fSlots.size() / 2) {
        grow();
    }
    ++fAdded;
    Slot& slot = fSlots[slotOf(utf8)];
    slot.utf8.assign(utf8);
    slot.name = name;
    return slot.name;
}

void NameCache::grow()
{
    std::vector<Slot> old(std::max(kFirstSlots, 2 * fSlots.size()));
    old.swap(fSlots);
    for (Slot& slot : old) {
        if (!slot.utf8.empty()) {
            fSlots[slotOf(slot.utf8)] = std::move(slot);
        }
    }
}

} // namespace Pegasus::wire
