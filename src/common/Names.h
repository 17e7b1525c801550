// SPDX-License-Identifier: MIT
// CIM names, and the keys under which the plug-in keeps what is named.
#pragma once

#include <string>

namespace NKOLVRX20 {

std::string LowerCase(std::string text);

// Returns: whether a name begins with a letter or an underscore and holds letters, digits and underscores only; true
// for the empty name.
bool IsCimName(const std::string& name);

// Returns: the lower-cased name, the key of every map of named elements; an empty name stays empty.
// Throws: TVRXException 25, after a log line, for an invalid name.
std::string NormalizedName(const std::string& name);

} // namespace NKOLVRX20
