// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/common/RepPointerImpl.h"

#include <Pegasus/Common/String.h>

#include <cstddef>
#include <string>
#include <string_view>

namespace Pegasus {

// The code units and a zero follow in the same piece of memory.
struct StringRep : RefCounted
{
    Uint32 fSize = 0;
    Uint32 fCapacity = 0;

    Char16* units() noexcept { return reinterpret_cast<Char16*>(this + 1); }
    const Char16* units() const noexcept { return reinterpret_cast<const Char16*>(this + 1); }

    // A representation with room for `capacity` units, and size 0.
    static StringRep* create(std::size_t capacity);
    static void operator delete(void* memory) { ::operator delete(memory); }
};

// What the library itself does with strings beyond their public interface.
struct StringAccess
{
    // Returns: null for a text that has not held anything yet.
    static const StringRep* rep(const String& text) noexcept { return text.fRep.get(); }
};

} // namespace Pegasus
