// The two directories that everything hangs off. They may differ and are kept apart.
#pragma once

#include <string>

namespace NKOLVRX20 {

// Returns: the directory of the plug-in's own file, without a trailing slash: the base schema and the vendors' files
// lie below it. Written once, when the library is loaded; empty when that failed.
std::string& ModulePath();

// Returns: the process's working directory, below which the server's programs and its repository lie; empty when it
// cannot be read or is longer than 1023 bytes.
std::string WorkingDirectory();

} // namespace NKOLVRX20
