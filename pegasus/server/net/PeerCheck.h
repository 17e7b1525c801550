#pragma once

#include <optional>

#include <sys/types.h>

namespace Pegasus::server {

// Returns: the user at the other end of a Unix socket, as of its connect().
std::optional<uid_t> localPeerUser(int fd);

} // namespace Pegasus::server
