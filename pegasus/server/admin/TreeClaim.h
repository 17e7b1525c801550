// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/admin/Config.h"
#include "pegasus/server/admin/TreeLock.h"

#include <stdexcept>
#include <string>

namespace Pegasus::server {

// The server cannot start. what() is the sentence that its launcher prints.
class StartError : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// Requires that only root and the server's own user can change what a server of this configuration is going to run:
// this program and its libraries, and in the tree the home folder, bin, lib, provider and the folders of providerDir.
// An agent checks a vendor's library when it loads it. strictOwners=false switches both checks off.
// Throws: StartError with path, owner and mode.
// Thread: any.
void requireOwnTree(const Config& config);

// This server's hold on its tree, and the files by which others find it. The destructor removes them; the lock file of
// a server that failed to start stays, unlocked, so that the tree's clients do not take another server on its port for
// it.
//
// A server that finds the tree held by another one whose repository has been deleted takes its place: the other one is
// left over from a host that has ended.
//
// Thread: one at a time.
class TreeClaim
{
  public:
    TreeClaim() = default;
    ~TreeClaim();
    TreeClaim(const TreeClaim&) = delete;
    TreeClaim& operator=(const TreeClaim&) = delete;

    // Takes the lock and writes the current configuration.
    // Throws: StartError.
    // Blocks: when it ends a server that is left over, 1 s and until that process has ended.
    void take(const Config& config);

    // Publishes which process serves, from which repository: completes the lock file and writes the start file. A
    // start file whose write fails is a line in the log.
    // Throws: std::system_error. Requires: taken; the repository's folder exists.
    void announce(const std::string& repository);

  private:
    void lock(const std::string& home);

    TreeLock fLock;
    base::TreeLockRecord fRecord;
    bool fAnnounced = false;
    base::Descriptor fRepository; // keeps the folder's inode from being given to another one
    pid_t fReplaced = 0;          // the server whose place this one took
};

} // namespace Pegasus::server
