// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Descriptor.h"

#include <cstdint>
#include <optional>
#include <string>

#include <sys/types.h>

namespace Pegasus::server {

// Returns: a non-blocking socket that listens on 127.0.0.1 only.
// Throws: std::runtime_error "Bind failed: Failed to bind socket on port N: <reason> (error code E)."
base::Descriptor listenOnLoopback(std::uint16_t port);

// Returns: a non-blocking socket that listens at <home>/cimxml.socket, mode 0600. Throws: std::system_error.
base::Descriptor listenLocally(const std::string& home);

// Returns: the next connection; an empty descriptor when the queue is empty or the connection broke already. Sets
//     `exhausted` when the process or the system is out of descriptors or memory for it.
// Thread: one at a time a listener.
base::Descriptor acceptConnection(const base::Descriptor& listener, bool& exhausted);

// Returns: the user at the other end of a Unix socket, as of its connect().
std::optional<uid_t> localPeerUser(int fd);

} // namespace Pegasus::server
