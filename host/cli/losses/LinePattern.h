// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace vrxhost {

// Bytes of a line that is compared with a pattern. A longer line is a provider's text, which would fill the screen; it
// is a loss of no known kind. Program output is cut to its lines first.
constexpr std::size_t kMaxMatchedBytes = 4096;

// Compares a whole line with a sentence that has gaps: <text> takes any bytes, <word> one or more that are not white
// space, <number> one or more digits. A gap ends where the text after it occurs first; at the end of the pattern, and
// before another gap, it takes as much as it can.
//
//     <text>class <word> has no property <word>
//     warning: class FAN_A has no property Rpm    gives "warning: ", FAN_A and Rpm
//
// Returns: what the gaps took, in their order; empty when the line has another form or is too long.
std::optional<std::vector<std::string>> MatchLine(std::string_view pattern, std::string_view line);

} // namespace vrxhost
