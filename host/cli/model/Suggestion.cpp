// SPDX-License-Identifier: MIT
// Which known name an unknown one may have meant.
#include "host/cli/model/ErrorReport.h"

#include <algorithm>
#include <cctype>
#include <numeric>
#include <utility>
#include <vector>

namespace vrxhost {
namespace {

bool IsSameLetter(char a, char b)
{
    return std::tolower(static_cast<unsigned char>(a)) == std::tolower(static_cast<unsigned char>(b));
}

// How many characters must be inserted, removed or replaced (Levenshtein), row by row.
std::size_t Distance(const std::string& from, const std::string& to)
{
    std::vector<std::size_t> row(to.size() + 1);
    std::iota(row.begin(), row.end(), 0);
    for (std::size_t i = 0; i < from.size(); ++i) {
        std::size_t diagonal = std::exchange(row[0], i + 1);
        for (std::size_t j = 0; j < to.size(); ++j) {
            const std::size_t replaced = diagonal + (IsSameLetter(from[i], to[j]) ? 0 : 1);
            diagonal = row[j + 1];
            row[j + 1] = std::min({replaced, row[j] + 1, row[j + 1] + 1});
        }
    }
    return row.back();
}

} // namespace

std::string Suggestion(const std::string& unknown, const std::vector<std::string>& names)
{
    std::size_t least = unknown.size() / 3 + 1; // more is another word
    std::string nearest;
    for (const std::string& name : names) {
        const std::size_t distance = Distance(unknown, name);
        if (distance <= least && (nearest.empty() || distance < least)) {
            least = distance;
            nearest = name;
        }
    }
    return nearest.empty() ? "" : "; did you mean " + nearest + "?";
}

} // namespace vrxhost
