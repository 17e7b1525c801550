// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"

#include <limits>
#include <optional>
#include <string_view>
#include <type_traits>

// Texts of booleans and numbers by the type of the value. Thread: any.
namespace Pegasus::base {

// Returns: nullopt for any other text, and for a number outside the type.
template <typename T> std::optional<T> parseValue(std::string_view text)
{
    if constexpr (std::is_same_v<T, Boolean>) {
        const bool isTrue = equalNoCase(text, "true");
        return isTrue || equalNoCase(text, "false") ? std::optional<T>(isTrue) : std::nullopt;
    } else if constexpr (std::is_same_v<T, Real32>) {
        return parseReal32(text);
    } else if constexpr (std::is_same_v<T, Real64>) {
        return parseReal64(text);
    } else if constexpr (std::is_unsigned_v<T>) {
        const auto value = parseUnsigned(text);
        return value && *value <= std::numeric_limits<T>::max() ? std::optional<T>(static_cast<T>(*value))
                                                                : std::nullopt;
    } else {
        const auto value = parseSigned(text);
        const bool fits = value && *value >= std::numeric_limits<T>::min() && *value <= std::numeric_limits<T>::max();
        return fits ? std::optional<T>(static_cast<T>(*value)) : std::nullopt;
    }
}

} // namespace Pegasus::base
