// SPDX-License-Identifier: MIT
#include "tests/pegasus/cmpi/replay/KnownDifferences.h"

#include <algorithm>
#include <optional>
#include <string_view>

namespace servertest {

namespace {

constexpr std::string_view kGap = "<*>";

struct Match
{
    std::size_t begin;
    std::size_t end;
};

// Finds the pattern's first match that begins at `from` or later. A gap at the end reaches to the text's end.
std::optional<Match> findMatch(const std::string& text, std::string_view pattern, std::size_t from)
{
    std::optional<Match> match;
    while (true) {
        const std::size_t gap = std::min(pattern.find(kGap), pattern.size());
        const std::size_t at = text.find(pattern.substr(0, gap), match ? match->end : from);
        if (at == std::string::npos) {
            return std::nullopt;
        }
        match = Match{match ? match->begin : at, at + gap};
        if (gap == pattern.size()) {
            return match;
        }
        pattern.remove_prefix(gap + kGap.size());
        if (pattern.empty()) {
            return Match{match->begin, text.size()};
        }
    }
}

bool replaceAll(std::string& text, std::string_view pattern, std::string_view replacement)
{
    std::size_t from = 0;
    bool isFound = false;
    while (const auto match = findMatch(text, pattern, from)) {
        isFound = true;
        text.replace(match->begin, match->end - match->begin, replacement);
        from = match->begin + replacement.size();
        if (match->begin == match->end || from >= text.size()) {
            break;
        }
    }
    return isFound;
}

// Returns: a recorded instance that ours lacks; empty without one.
std::string leaveInstancesOut(std::string& ours, std::string& recorded)
{
    const std::string mark = "     VALUE.NAMEDINSTANCE\n";
    std::size_t at = recorded.find(mark);
    const std::size_t first = at;
    while (at != std::string::npos) {
        const std::size_t next = recorded.find(mark, at + mark.size());
        const std::string instance = recorded.substr(at, next == std::string::npos ? next : next - at);
        if (ours.find(instance) == std::string::npos) {
            return instance;
        }
        at = next;
    }
    ours.resize(std::min(ours.find(mark), ours.size()));
    recorded.resize(std::min(first, recorded.size()));
    return {};
}

} // namespace

const char* nameOf(Why why)
{
    static const char* const kNames[] = {"trap", "keys of paths", "not served", "text", "host", "crash", "defect"};
    return kNames[static_cast<int>(why)];
}

const KnownDifference* findDifference(const KnownDifferences& known, const std::string& name)
{
    for (const KnownDifference& row : known) {
        if (std::find(row.names.begin(), row.names.end(), name) != row.names.end()) {
            return &row;
        }
    }
    return nullptr;
}

std::string reconcile(const KnownDifference& known, std::string& ours, std::string& recorded)
{
    for (const Edit& edit : known.edits) {
        const char* const instead = edit.recorded != nullptr ? edit.recorded : "";
        if (!replaceAll(ours, edit.ours, instead) ||
            (edit.recorded == nullptr && !replaceAll(recorded, edit.ours, instead)))
        {
            return edit.ours;
        }
    }
    return known.isCutShort ? leaveInstancesOut(ours, recorded) : std::string();
}

} // namespace servertest
