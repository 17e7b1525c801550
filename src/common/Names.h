// CIM names, and the keys under which the plug-in keeps what is named.
#pragma once

#include <string>

namespace NKOLVRX20 {

std::string LowerCase(std::string text);

// Returns: the lower-cased name, the key of every map of named elements; an empty name stays empty.
// Throws: TVRXException 25, after a log line, when the name does not begin with a letter or an underscore, or holds
// anything but letters, digits and underscores.
std::string NormalizedName(const std::string& name);

} // namespace NKOLVRX20
