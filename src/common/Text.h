// SPDX-License-Identifier: MIT
// The client library's texts as the host's.
#pragma once

#include <optional>
#include <string>

namespace Pegasus {
class String;
}

namespace NKOLVRX20 {

// Returns: the text in UTF-8. (What the stream operator of Pegasus::String writes depends on how OpenPegasus was
// built.)
std::string ToStdString(const Pegasus::String& text);

// Returns: the text when it consists of ASCII characters alone, which every build of the client library writes alike;
// nullopt for any other text.
std::optional<std::string> AsciiText(const Pegasus::String& text);

// Returns: whether the texts are equal. Names of one answer are most often the very same text.
bool IsSameText(const Pegasus::String& left, const Pegasus::String& right);

} // namespace NKOLVRX20
