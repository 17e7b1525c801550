#pragma once

#include <Pegasus/Common/Config.h>

#include <optional>
#include <string>
#include <string_view>

namespace Pegasus::number {

// Integers as CIM writes them: decimal without leading zeros, or hexadecimal after 0x; nothing around them.
std::optional<Uint64> parseUnsigned(std::string_view text);
// The same with an optional minus.
std::optional<Sint64> parseSigned(std::string_view text);

// A decimal with a point, an optional exponent only behind one; also INF, -INF and NaN in any case.
// Out of the type's range: nothing; too small for it: 0.
std::optional<Real64> parseReal64(std::string_view text);
std::optional<Real32> parseReal32(std::string_view text);

// printf's %.16e, whatever the process's locale. Infinities and NaN as printf writes them.
std::string formatReal(Real64 value, int digits = 16);

} // namespace Pegasus::number
