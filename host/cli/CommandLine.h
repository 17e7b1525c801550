// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/Options.h"

namespace vrxhost {

// Reads the command line as it stands: paths are as they were written, and what is not given keeps its value.
// Returns: false when help or the version was all that was wanted; it went to standard output then.
// Throws: TUsageError.
bool ReadCommandLine(int argc, const char* const* argv, TOptions& options);

} // namespace vrxhost
