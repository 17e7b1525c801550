// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>
#include <string>

#include <sys/types.h>

// Users of this machine.
// Thread: any.
namespace Pegasus::base {

// What getpwuid_r() and its like get for the entry of one user or group.
constexpr std::size_t kMaxDatabaseEntryBytes = 64u << 10;

// Returns: the user's name, or the number of an unnamed user.
// Blocks: for the user database, which may be a service elsewhere.
std::string userName(uid_t user);

// Returns: whether this process may rely on what a user's process or file says: root's and this process's own user's
// count. nullopt stands for an unknown user.
bool isTrustedUser(std::optional<uid_t> user);

} // namespace Pegasus::base
