// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>

namespace Pegasus::mof {

// Text of a foreign file or of a server, for a terminal or a log: control characters and bytes outside UTF-8 become
// "\x1B", and the text stays on one line. Tabs and backslashes stay. Text that was converted before is unchanged.
std::string shownText(std::string_view text);

} // namespace Pegasus::mof
