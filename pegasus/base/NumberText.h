// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>

#include <optional>
#include <string>
#include <string_view>

// Numbers as CIM writes them, whatever the process's locale.
// Thread: any.
namespace Pegasus::base {

// Decimal without leading zeros, or hexadecimal after 0x; the whole text. Returns: nullopt for any other text, and for
// a number outside the type.
std::optional<Uint64> parseUnsigned(std::string_view text);
// The same with an optional minus.
std::optional<Sint64> parseSigned(std::string_view text);

// A decimal with a point, then an optional exponent; also INF, -INF and NaN in any case.
// Returns: nullopt for a number too big for the type; 0 for one too small.
std::optional<Real64> parseReal64(std::string_view text);
std::optional<Real32> parseReal32(std::string_view text);

// As printf's %.16e in the C locale, infinities and NaN included.
std::string formatReal(Real64 value, int digits = 16);

// Returns: 0 to 15; -1 for any other character.
constexpr int hexDigitValue(char c) noexcept
{
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    if (c >= 'a' && c <= 'f') {
        return c - 'a' + 10;
    }
    return c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
}

} // namespace Pegasus::base
