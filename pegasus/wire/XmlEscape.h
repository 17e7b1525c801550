#pragma once

#include <Pegasus/Common/String.h>

#include <string>
#include <string_view>

namespace Pegasus::wire {

// Appends `text` (UTF-8) as XML text or attribute value: & < > " ' become entities. What a parser would change becomes
// a character reference: control characters, and a blank at the beginning, at the end or after another blank. Thread:
// any.
void appendEscaped(std::string& out, std::string_view text);
void appendEscaped(std::string& out, const String& text);

} // namespace Pegasus::wire
