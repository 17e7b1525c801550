// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace vrxhost {

// Returns: the text in one line of visible characters, for a terminal and for a page: what a device or a vendor's file
// holds must neither steer the reader's terminal nor reorder what it shows. Control characters (those of U+0080 to
// U+009F too) and invisible ones are escapes, "\x1b" and "\u{202e}", as are bytes outside UTF-8; a line feed is "\n", a
// tab "\t".
std::string Printable(const std::string& text);

} // namespace vrxhost
