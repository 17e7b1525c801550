#pragma once

#include <string>

namespace Pegasus::wire {

// The server's private socket `cimxml.socket` in its home folder. The address goes through /proc/self/fd, so that the
// folder's path may be longer than a socket address holds.
// Throws: std::system_error, whose what() names the operation and the path. All descriptors are close-on-exec.

extern const char* const kLocalSocketName;

// Returns: the folder that the environment's PEGASUS_HOME names; empty when unset.
std::string localSocketHome();
// A connected, blocking stream socket. The caller owns the descriptor.
// Blocks: at most `timeoutMs` when the listener's queue is full; 0 waits without a bound.
int connectLocalSocket(const std::string& home, int timeoutMs = 0);
// A listening socket with mode 0600; a socket file left over is replaced. The caller owns the descriptor.
int listenLocalSocket(const std::string& home, int backlog);
// Removes the socket file; not being there is no error.
void removeLocalSocket(const std::string& home) noexcept;

} // namespace Pegasus::wire
