// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Descriptor.h"

#include <cstdint>
#include <string>

#include <sys/types.h>

// The lock file `cimserver.lock` in a server's home folder. The server holds a lock on it from before it binds its port
// until its process ends, however that ends, and writes into it what others need to know about it. It lies beside the
// repository, which may be deleted at any time.
//
// The lock belongs to the open file description (F_OFD_SETLK), so that others can ask for it and leave it alone.
// Thread: any.
namespace Pegasus::base {

// What the lock file holds: "name=value" lines. While the server starts, values may still be 0 or empty.
struct TreeLockRecord
{
    pid_t pid = 0;
    std::uint16_t port = 0;   // TCP on 127.0.0.1; 0: none
    std::string startFile;    // full path
    std::string repository;   // full path of the folder
    std::uint64_t device = 0; // of the folder that the server has open
    std::uint64_t inode = 0;
};

enum class TreeLockState
{
    kAbsent, // there is no lock file: no server has run here yet, or the last one removed it
    kFree,   // the server that made the file has ended
    kHeld
};

struct TreeLockStatus
{
    TreeLockState state = TreeLockState::kAbsent;
    TreeLockRecord record; // when held
};

std::string treeLockPath(const std::string& home);

// Returns: the state at this moment. Only a regular file of root's or the user's own counts as a lock file.
// Throws: std::system_error when the file is there and cannot be read.
TreeLockStatus readTreeLock(const std::string& home);

// Returns: whether the lock could be taken. Requires: the file is open for writing.
bool takeTreeLock(const Descriptor& file);
// Replaces the file's content. Requires: the lock is held. Throws: std::system_error.
void writeTreeLock(const Descriptor& file, const TreeLockRecord& record);

} // namespace Pegasus::base
