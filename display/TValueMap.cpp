// SPDX-License-Identifier: MIT
#include "display/TValueMap.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <string_view>

namespace NKOLVRX20 {
namespace {

constexpr std::string_view kRangeMark = "..";
// What an open end of a range stands for.
constexpr TWideInteger kLowest = std::numeric_limits<long>::min();
constexpr TWideInteger kHighest = std::numeric_limits<unsigned long>::max();

std::optional<TWideInteger> ParseDigits(std::string_view digits, int base)
{
    unsigned long magnitude = 0;
    const char* const end = digits.data() + digits.size();
    const auto result = std::from_chars(digits.data(), end, magnitude, base);
    if (result.ec != std::errc() || result.ptr != end) {
        return std::nullopt;
    }
    return magnitude;
}

// The prefix comes before the suffix: "0x1b" is hexadecimal.
std::optional<TWideInteger> ParseMagnitude(std::string_view text)
{
    const std::string_view prefix = text.substr(0, 2);
    if (prefix == "0x" || prefix == "0X") {
        return ParseDigits(text.substr(2), 16);
    }
    if (!text.empty() && (text.back() == 'b' || text.back() == 'B')) {
        return ParseDigits(text.substr(0, text.size() - 1), 2);
    }
    const bool isOctal = text.size() > 1 && text.front() == '0';
    return isOctal ? ParseDigits(text.substr(1), 8) : ParseDigits(text, 10);
}

std::optional<TWideInteger> ParseInteger(std::string_view text)
{
    const bool hasSign = !text.empty() && (text.front() == '-' || text.front() == '+');
    const auto magnitude = ParseMagnitude(text.substr(hasSign ? 1 : 0));
    return magnitude && text.front() == '-' ? -*magnitude : magnitude;
}

std::optional<TWideInteger> ParseBound(std::string_view text, TWideInteger openEnd)
{
    return text.empty() ? openEnd : ParseInteger(text);
}

} // namespace

TValueMap::TValueMap(const std::vector<std::string>& entries)
{
    fEntries.reserve(entries.size());
    std::transform(entries.begin(), entries.end(), std::back_inserter(fEntries), ParseEntry);
}

TValueMap::TEntry TValueMap::ParseEntry(const std::string& text)
{
    const std::string_view view = text;
    const std::size_t mark = view.find(kRangeMark);
    if (mark == std::string_view::npos) {
        const auto number = ParseInteger(view);
        return number ? TEntry{text, EKind::kExact, *number, *number} : TEntry{text};
    }
    const auto low = ParseBound(view.substr(0, mark), kLowest);
    const auto high = ParseBound(view.substr(mark + kRangeMark.size()), kHighest);
    if (!low || !high) {
        return TEntry{text};
    }
    return TEntry{text, view == kRangeMark ? EKind::kRest : EKind::kRange, *low, *high};
}

bool TValueMap::TEntry::Covers(TWideInteger number) const
{
    return fKind != EKind::kText && number >= fLow && number <= fHigh;
}

std::optional<std::size_t> TValueMap::Find(TWideInteger number) const
{
    // Values without ValueMap count from 0, and so do BitValues without BitMap.
    if (fEntries.empty()) {
        return number < 0 ? std::nullopt : std::make_optional(static_cast<std::size_t>(number));
    }
    std::optional<std::size_t> best;
    for (std::size_t i = 0; i < fEntries.size(); ++i) {
        // Only a kind of higher precedence replaces an earlier entry.
        if (fEntries[i].Covers(number) && (!best || fEntries[i].fKind < fEntries[*best].fKind)) {
            best = i;
        }
    }
    return best;
}

std::optional<std::size_t> TValueMap::Find(const std::string& text) const
{
    const auto entry =
        std::find_if(fEntries.begin(), fEntries.end(), [&](const TEntry& each) { return each.fText == text; });
    return entry == fEntries.end() ? std::nullopt : std::make_optional<std::size_t>(entry - fEntries.begin());
}

} // namespace NKOLVRX20
