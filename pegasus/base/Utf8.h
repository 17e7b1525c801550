// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Char16.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

// UTF-8 (RFC 3629), and its conversion from and to the UTF-16 units of CIM strings.
// Thread: any.
namespace Pegasus::base {

// Returns: whether all of it is UTF-8. Overlong and truncated sequences, surrogates and codes above U+10FFFF fail.
bool isUtf8(std::string_view bytes) noexcept;

// Returns: the bytes, with U+FFFD in place of each byte that isUtf8() would reject.
std::string repairedUtf8(std::string_view bytes);

struct Utf8DecodeResult
{
    Char16* end;         // after the last unit written
    const char* invalid; // the first byte of the sequence that is not UTF-8; null when all of the input was
};

// UTF-8 to UTF-16. It rejects what isUtf8() rejects, but takes a surrogate in three bytes as that unit: CIM strings
// may hold lone surrogates, and appendUtf8() writes them so.
// Requires: `to` has room for `size` units; each unit comes from at least one byte.
Utf8DecodeResult decodeUtf8(const char* from, std::size_t size, Char16* to) noexcept;

// UTF-16 to UTF-8, appended. A lone surrogate becomes its three bytes.
void appendUtf8(std::string& out, const Char16* units, std::size_t count);
// One code point. Requires: code <= 0x10FFFF.
void appendUtf8(std::string& out, std::uint32_t code);

} // namespace Pegasus::base
