// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace Pegasus::server {

// Replaces `path` by a regular file of mode 0600 with this content, in one step: a reader sees the old file or the new
// one. A link at `path` is itself replaced.
// Throws: std::system_error. Thread: any.
void writePrivateFile(const std::string& path, const std::string& content);

// Returns: at most `maxBytes` of the file; empty if it is missing, unreadable, not a regular file, not root's or the
// user's own, or writable by everybody. A link counts as not regular. A FIFO returns at once.
// Thread: any.
std::string readOwnFile(const std::string& path, std::size_t maxBytes);

} // namespace Pegasus::server
