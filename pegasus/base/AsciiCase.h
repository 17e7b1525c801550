#pragma once

#include <algorithm>
#include <string_view>

namespace Pegasus {

inline char lowerAscii(char c) noexcept
{
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c + ('a' - 'A')) : c;
}

// Words of protocols. The C library's comparison would follow the process's locale, where I and i may differ.
inline bool equalNoCase(std::string_view x, std::string_view y) noexcept
{
    return std::equal(x.begin(), x.end(), y.begin(), y.end(),
                      [](char a, char b) { return lowerAscii(a) == lowerAscii(b); });
}

} // namespace Pegasus
