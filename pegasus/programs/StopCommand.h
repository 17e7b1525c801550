#pragma once

#include <string>

namespace Pegasus::programs {

// "cimserver -s": asks the server at `home` to end and waits until its process has; ends it by force when it cannot be
// asked. Prints what the caller should know.
// Returns: the exit status.
// Blocks: for the server's shutdown time, and as long again.
int stopServer(const std::string& home, const std::string& consumer);

} // namespace Pegasus::programs
