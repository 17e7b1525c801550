// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <limits>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// The few text forms of /proc and /sys. A text that fails to parse as a whole is absent.
namespace lnx {

std::string_view trimmed(std::string_view text);

// Returns: the parts between blanks (spaces, tabs, line feeds).
std::vector<std::string> words(std::string_view text);
std::vector<std::string_view> lines(std::string_view text);

std::optional<std::int64_t> toInteger(std::string_view text);  // decimal
std::optional<std::uint64_t> toNatural(std::string_view text); // decimal, or hexadecimal with 0x
std::optional<double> toReal(std::string_view text);

// Returns: the value in the narrower type, when it fits.
template <typename T, typename From> std::optional<T> narrowed(const std::optional<From>& value)
{
    if (!value) {
        return std::nullopt;
    }
    const T result = static_cast<T>(*value);
    const bool isSame = static_cast<From>(result) == *value && (result < T{}) == (*value < From{});
    return isSame ? std::optional<T>(result) : std::nullopt;
}

using Fields = std::map<std::string, std::string>;

// Returns: the fields of lines "name<separator>value", blanks around both taken off; the first of a name counts.
Fields fields(std::string_view text, char separator);
// The text of os-release: shell quotes around a value taken off.
Fields shellFields(std::string_view text);

std::optional<std::string> field(const Fields& from, const std::string& name);

} // namespace lnx
