// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>

#include <algorithm>
#include <string>
#include <string_view>

// Case of ASCII letters, for CIM names and the words of protocols. All other bytes stay as they are. The process's
// locale is ignored: in some locales I and i are different letters.
// Thread: any.
namespace Pegasus::base {

constexpr bool isAsciiDigit(char c) noexcept
{
    return c >= '0' && c <= '9';
}

constexpr char lowerAscii(char c) noexcept
{
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c + ('a' - 'A')) : c;
}

constexpr Uint16 lowerAscii(Uint16 unit) noexcept
{
    return unit >= 'A' && unit <= 'Z' ? static_cast<Uint16>(unit + ('a' - 'A')) : unit;
}

constexpr bool isAsciiAlnum(char c) noexcept
{
    return isAsciiDigit(c) || (lowerAscii(c) >= 'a' && lowerAscii(c) <= 'z');
}

// Returns: the text in lower case. Texts that differ only in case have the same folded text.
inline std::string foldCase(std::string text)
{
    for (char& c : text) {
        c = lowerAscii(c);
    }
    return text;
}

inline bool equalNoCase(std::string_view x, std::string_view y) noexcept
{
    return std::equal(x.begin(), x.end(), y.begin(), y.end(),
                      [](char a, char b) { return lowerAscii(a) == lowerAscii(b); });
}

inline bool startsWithNoCase(std::string_view text, std::string_view prefix) noexcept
{
    return equalNoCase(text.substr(0, prefix.size()), prefix);
}

} // namespace Pegasus::base
