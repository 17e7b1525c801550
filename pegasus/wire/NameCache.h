// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMName.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// Names by their UTF-8 text: one that was seen before costs a look-up, and all its users share one text. It holds a
// bounded number of names of a bounded length: a name takes the place of another one that has the same slot.
// Thread: one thread at a time.
class NameCache
{
  public:
    // Returns: the name; null when it is not held. Valid until the next call.
    const CIMName* find(std::string_view utf8) const;
    // Converts and keeps a name. Returns: the name; valid until the next call.
    // Throws: InvalidNameException; Exception on invalid UTF-8.
    const CIMName& add(std::string_view utf8);

  private:
    struct Slot
    {
        std::string utf8;
        CIMName name;
    };

    std::size_t slotOf(std::string_view utf8) const;
    void grow();

    std::vector<Slot> fSlots;
    std::size_t fAdded = 0;
    CIMName fLongName;
};

} // namespace Pegasus::wire
