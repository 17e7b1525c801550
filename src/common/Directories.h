// SPDX-License-Identifier: MIT
// The two directories that everything hangs off. They may differ and are kept apart.
#pragma once

#include <string>

namespace NKOLVRX20 {

// Returns: the directory of the plug-in's own file, trailing slash omitted: the base schema and the vendors' files lie
// below it. Written once, when the library is loaded; empty when that failed.
std::string& ModulePath();

// Returns: the process's working directory, below which the server's programs and its repository lie; empty when it
// is unreadable or longer than 1023 bytes.
std::string WorkingDirectory();

} // namespace NKOLVRX20
