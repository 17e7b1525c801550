// SPDX-License-Identifier: MIT
#include "host/cli/losses/LinePattern.h"

#include <algorithm>
#include <iterator>

namespace vrxhost {
namespace {

struct TGap
{
    std::string_view fMark;
    bool (*fTakes)(char byte);
    std::size_t fMinBytes;
};

constexpr std::string_view kWhiteSpace = " \t\n\v\f\r";

constexpr TGap kGaps[] = {
    {"<text>", [](char) { return true; }, 0},
    {"<word>", [](char byte) { return kWhiteSpace.find(byte) == std::string_view::npos; }, 1},
    {"<number>", [](char byte) { return byte >= '0' && byte <= '9'; }, 1},
};

// Returns: null when the pattern begins with text.
const TGap* GapAt(std::string_view pattern)
{
    const auto* const found = std::find_if(std::begin(kGaps), std::end(kGaps), [pattern](const TGap& gap) {
        return pattern.compare(0, gap.fMark.size(), gap.fMark) == 0;
    });
    return found == std::end(kGaps) ? nullptr : found;
}

// Takes the text before the first gap from the pattern.
std::string_view TakeText(std::string_view& pattern)
{
    std::size_t size = 0;
    while (size < pattern.size() && !GapAt(pattern.substr(size))) {
        ++size;
    }
    const std::string_view text = pattern.substr(0, size);
    pattern.remove_prefix(size);
    return text;
}

// Returns: the bytes of the line that the gap takes; npos when the text after it is missing.
std::size_t BytesOf(const TGap& gap, std::string_view after, bool isLast, std::string_view line)
{
    if (after.empty()) {
        return static_cast<std::size_t>(
            std::distance(line.begin(), std::find_if_not(line.begin(), line.end(), gap.fTakes)));
    }
    if (isLast) {
        const std::size_t size = line.size() - std::min(line.size(), after.size());
        return line.substr(size) == after ? size : std::string_view::npos;
    }
    return line.find(after);
}

} // namespace

std::optional<std::vector<std::string>> MatchLine(std::string_view pattern, std::string_view line)
{
    const std::string_view begin = TakeText(pattern);
    if (line.size() > kMaxMatchedBytes || line.compare(0, begin.size(), begin) != 0) {
        return std::nullopt;
    }
    line.remove_prefix(begin.size());
    std::vector<std::string> taken;
    while (const TGap* const gap = GapAt(pattern)) {
        pattern.remove_prefix(gap->fMark.size());
        const std::string_view after = TakeText(pattern);
        const std::size_t size = BytesOf(*gap, after, pattern.empty(), line);
        if (size == std::string_view::npos || size < gap->fMinBytes) {
            return std::nullopt;
        }
        taken.emplace_back(line.substr(0, size));
        if (!std::all_of(taken.back().begin(), taken.back().end(), gap->fTakes)) {
            return std::nullopt;
        }
        line.remove_prefix(size + after.size());
    }
    return line.empty() ? std::optional(taken) : std::nullopt;
}

} // namespace vrxhost
