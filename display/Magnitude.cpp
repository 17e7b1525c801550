// SPDX-License-Identifier: MIT
#include "display/PlainText.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <cstdio>

namespace NKOLVRX20 {
namespace {

struct TUnit
{
    const char* fName;   // in small letters
    double fFactor;      // of the shown unit
    int fBase;           // of its prefixes
    const char* fSymbol; // after the prefix
};

// Names of the qualifiers Units and PUnit (DSP0004, Annex C). A kilobyte of Units has 1024 bytes.
constexpr TUnit kUnits[] = {
    {"bytes", 1, 1024, "B"},
    {"byte", 1, 1024, "B"},
    {"kilobytes", 1024, 1024, "B"},
    {"byte * 2^10", 1024, 1024, "B"},
    {"megabytes", 1024.0 * 1024, 1024, "B"},
    {"byte * 2^20", 1024.0 * 1024, 1024, "B"},
    {"bits per second", 1, 1000, "bit/s"},
    {"bit / second", 1, 1000, "bit/s"},
    {"bytes per second", 1, 1000, "B/s"},
    {"byte / second", 1, 1000, "B/s"},
    {"hertz", 1, 1000, "Hz"},
    {"megahertz", 1e6, 1000, "Hz"},
    {"hertz * 10^6", 1e6, 1000, "Hz"},
};

constexpr const char* kBinaryPrefixes[] = {"", "Ki", "Mi", "Gi", "Ti", "Pi", "Ei"};
constexpr const char* kDecimalPrefixes[] = {"", "k", "M", "G", "T", "P", "E"};

std::string SmallLetters(std::string text)
{
    std::transform(text.begin(), text.end(), text.begin(), [](unsigned char c) { return std::tolower(c); });
    return text;
}

std::string Scaled(double number, const TUnit& unit)
{
    std::size_t prefix = 0;
    while (std::fabs(number) >= unit.fBase && prefix + 1 < std::size(kBinaryPrefixes)) {
        number /= unit.fBase;
        ++prefix;
    }
    char text[64];
    std::snprintf(text, sizeof text, prefix == 0 || std::fabs(number) >= 100 ? "%.0f" : "%.1f", number);
    std::string digits = text;
    if (digits.size() > 2 && digits.compare(digits.size() - 2, 2, ".0") == 0) {
        digits.resize(digits.size() - 2);
    }
    return digits + " " + (unit.fBase == 1024 ? kBinaryPrefixes : kDecimalPrefixes)[prefix] + unit.fSymbol;
}

} // namespace

std::optional<std::string> Magnitude(const TCIMValue& value, const std::string& unit)
{
    const std::string name = SmallLetters(unit);
    const auto known =
        std::find_if(std::begin(kUnits), std::end(kUnits), [&name](const TUnit& each) { return name == each.fName; });
    if (known == std::end(kUnits) || !IsNumber(value)) {
        return std::nullopt;
    }
    return Scaled(static_cast<double>(value) * known->fFactor, *known);
}

std::string GroupedDigits(const std::string& number)
{
    constexpr std::size_t kGroup = 3;
    constexpr std::size_t kShort = 4; // a year, a port
    const std::size_t first = !number.empty() && number.front() == '-' ? 1 : 0;
    const bool isInteger = std::all_of(number.begin() + static_cast<std::ptrdiff_t>(first), number.end(),
                                       [](unsigned char c) { return std::isdigit(c) != 0; });
    if (!isInteger || number.size() - first <= kShort) {
        return number;
    }
    std::string grouped = number;
    for (std::size_t at = number.size(); at > first + kGroup;) {
        at -= kGroup;
        grouped.insert(at, ",");
    }
    return grouped;
}

} // namespace NKOLVRX20
