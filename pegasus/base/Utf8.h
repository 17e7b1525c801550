#pragma once

#include <Pegasus/Common/Char16.h>

#include <cstddef>
#include <string>

namespace Pegasus::utf8 {

// What is left of the input where it stopped being UTF-8: null when all of it was.
struct DecodeResult
{
    Char16* end;
    const char* invalid;
};

// UTF-8 to UTF-16. `to` has room for `size` units (each unit comes from at least one byte).
// Overlong, truncated and out-of-range forms are invalid; a surrogate in three bytes is let through.
DecodeResult decode(const char* from, std::size_t size, Char16* to) noexcept;

// UTF-16 to UTF-8, appended; a lone surrogate becomes its three bytes.
void append(std::string& out, const Char16* units, std::size_t count);

} // namespace Pegasus::utf8
