// SPDX-License-Identifier: MIT
#include "pegasus/base/NumberText.h"

#include "pegasus/base/AsciiCase.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <system_error>

namespace Pegasus::base {
namespace {

bool hasHexPrefix(std::string_view text)
{
    return text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X');
}

std::string_view takeDigits(std::string_view& text)
{
    std::size_t count = 0;
    while (count < text.size() && isAsciiDigit(text[count])) {
        ++count;
    }
    const std::string_view digits = text.substr(0, count);
    text.remove_prefix(count);
    return digits;
}

bool takeSign(std::string_view& text)
{
    const bool found = !text.empty() && (text.front() == '+' || text.front() == '-');
    if (found) {
        text.remove_prefix(1);
    }
    return found;
}

// sign? digits* . digits+ (e sign? digits+)?
bool isRealShape(std::string_view text)
{
    takeSign(text);
    takeDigits(text);
    if (text.empty() || text.front() != '.') {
        return false;
    }
    text.remove_prefix(1);
    if (takeDigits(text).empty()) {
        return false;
    }
    if (text.empty()) {
        return true;
    }
    if (text.front() != 'e' && text.front() != 'E') {
        return false;
    }
    text.remove_prefix(1);
    takeSign(text);
    return !takeDigits(text).empty() && text.empty();
}

template <typename Real> std::optional<Real> parseNamed(std::string_view text)
{
    if (equalNoCase(text, "nan")) {
        return std::numeric_limits<Real>::quiet_NaN();
    }
    const bool negative = !text.empty() && text.front() == '-';
    takeSign(text);
    if (!equalNoCase(text, "inf")) {
        return std::nullopt;
    }
    return negative ? -std::numeric_limits<Real>::infinity() : std::numeric_limits<Real>::infinity();
}

// `text` is what follows the "e". One beyond any number of digits becomes large of its sign.
std::ptrdiff_t readExponent(std::string_view text)
{
    constexpr std::ptrdiff_t kLarge = std::numeric_limits<std::int32_t>::max();
    const bool negative = !text.empty() && text.front() == '-';
    takeSign(text);
    std::int32_t value = 0;
    const std::errc problem = std::from_chars(text.data(), text.data() + text.size(), value).ec;
    const std::ptrdiff_t magnitude = problem == std::errc::result_out_of_range ? kLarge : value;
    return negative ? -magnitude : magnitude;
}

// After an out-of-range result: was the number too small (then it is 0) or too big? Its first digit has a place before
// or after the point, and the exponent moves the point.
bool isTiny(std::string_view text)
{
    const std::size_t exponentAt = std::min(text.find_first_of("eE"), text.size());
    const auto before =
        static_cast<std::ptrdiff_t>(text.find('.')) - static_cast<std::ptrdiff_t>(text.find_first_of("123456789"));
    return before + readExponent(text.substr(std::min(exponentAt + 1, text.size()))) < 0;
}

template <typename Real> std::optional<Real> parseReal(std::string_view text)
{
    if (!isRealShape(text)) {
        return parseNamed<Real>(text);
    }
    if (text.front() == '+') {
        text.remove_prefix(1);
    }
    Real value{};
    const std::from_chars_result result = std::from_chars(text.data(), text.data() + text.size(), value);
    if (result.ec == std::errc::result_out_of_range) {
        return isTiny(text) ? std::optional<Real>(Real(0)) : std::nullopt;
    }
    if (result.ec != std::errc() || result.ptr != text.data() + text.size()) {
        return std::nullopt;
    }
    return value;
}

} // namespace

std::optional<Uint64> parseUnsigned(std::string_view text)
{
    const bool hex = hasHexPrefix(text);
    if (hex) {
        text.remove_prefix(2);
    } else if (text.size() > 1 && text[0] == '0') {
        return std::nullopt;
    }
    Uint64 value = 0;
    const std::from_chars_result result = std::from_chars(text.data(), text.data() + text.size(), value, hex ? 16 : 10);
    if (result.ec != std::errc() || result.ptr != text.data() + text.size()) {
        return std::nullopt;
    }
    return value;
}

std::optional<Sint64> parseSigned(std::string_view text)
{
    constexpr Uint64 kMax = std::numeric_limits<Sint64>::max();
    const bool negative = !text.empty() && text.front() == '-';
    if (negative) {
        text.remove_prefix(1);
    }
    const std::optional<Uint64> magnitude = parseUnsigned(text);
    if (!magnitude || *magnitude > kMax + (negative ? 1 : 0)) {
        return std::nullopt;
    }
    // The magnitude of the smallest number is beyond the positive range.
    return negative ? static_cast<Sint64>(~*magnitude + 1) : static_cast<Sint64>(*magnitude);
}

std::optional<Real64> parseReal64(std::string_view text)
{
    return parseReal<Real64>(text);
}

std::optional<Real32> parseReal32(std::string_view text)
{
    return parseReal<Real32>(text);
}

std::string formatReal(Real64 value, int digits)
{
    if (std::isnan(value)) {
        return std::signbit(value) ? "-nan" : "nan";
    }
    if (std::isinf(value)) {
        return value < 0 ? "-inf" : "inf";
    }
    char text[64];
    const std::to_chars_result result =
        std::to_chars(text, text + sizeof(text), value, std::chars_format::scientific, digits);
    return std::string(text, result.ptr);
}

} // namespace Pegasus::base
