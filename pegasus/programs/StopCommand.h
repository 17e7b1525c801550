#pragma once

#include <string>

namespace Pegasus::programs {

// "cimserver -s": asks the server that holds the tree at `home` to end and waits until its process has ended; ends it
// by force when it does not answer. Prints what the caller should know. Returns: the exit status. Throws:
// std::system_error when the tree's lock file cannot be read. Blocks: for the server's shutdown time, and as long
// again.
int stopServer(const std::string& home);

} // namespace Pegasus::programs
