// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Deadline.h"
#include "pegasus/base/Descriptor.h"

#include <string>

// The server's private socket `cimxml.socket` in its home folder. The address goes through /proc/self/fd, so that the
// folder's path may be longer than a socket address holds. All descriptors are close-on-exec.
// Throws: std::system_error, whose what() names the operation and the path.
// Thread: any.
namespace Pegasus::base {

extern const char* const kLocalSocketName;

// Returns: the folder that the environment's PEGASUS_HOME names; empty when unset.
std::string localSocketHome();
// Returns: a connected, blocking stream socket.
// Blocks: until the deadline when the listener's queue is full. One that has passed still allows a millisecond.
Descriptor connectLocalSocket(const std::string& home, const Deadline& deadline);
// Returns: a listening socket with mode 0600. A socket file left over is replaced.
Descriptor listenLocalSocket(const std::string& home, int backlog);
// Removes the socket file, if it exists.
void removeLocalSocket(const std::string& home) noexcept;

} // namespace Pegasus::base
