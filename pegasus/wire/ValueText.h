// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"

#include <limits>
#include <optional>
#include <string_view>
#include <type_traits>

namespace Pegasus::wire {

// The texts of booleans and numbers in CIM-XML. Thread: any.

// Returns: nullopt for any other text, and for a number outside the type.
template <typename T> std::optional<T> parseValue(std::string_view text)
{
    if constexpr (std::is_same_v<T, Boolean>) {
        const bool isTrue = base::equalNoCase(text, "true");
        return isTrue || base::equalNoCase(text, "false") ? std::optional<T>(isTrue) : std::nullopt;
    } else if constexpr (std::is_same_v<T, Real32>) {
        return base::parseReal32(text);
    } else if constexpr (std::is_same_v<T, Real64>) {
        return base::parseReal64(text);
    } else if constexpr (std::is_unsigned_v<T>) {
        const auto value = base::parseUnsigned(text);
        return value && *value <= std::numeric_limits<T>::max() ? std::optional<T>(static_cast<T>(*value))
                                                                : std::nullopt;
    } else {
        const auto value = base::parseSigned(text);
        const bool fits = value && *value >= std::numeric_limits<T>::min() && *value <= std::numeric_limits<T>::max();
        return fits ? std::optional<T>(static_cast<T>(*value)) : std::nullopt;
    }
}

} // namespace Pegasus::wire
