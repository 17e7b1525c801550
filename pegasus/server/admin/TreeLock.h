// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/TreeLockFile.h"

#include <string>

namespace Pegasus::server {

// Holds "one server a tree": the lock on <home>/cimserver.lock. The kernel releases it when the process ends, however
// it ends.
// Thread: one at a time.
class TreeLock
{
  public:
    // Returns: false if another process holds the tree.
    // Throws: std::system_error when opening the lock file fails.
    bool acquire(const std::string& home);
    // Requires: acquired. Throws: std::system_error.
    void write(const base::TreeLockRecord& record) const { base::writeTreeLock(fFile, record); }
    // Removes the file, then releases the lock, if this object holds it.
    void release() noexcept;

  private:
    base::Descriptor fFile;
    std::string fPath;
};

} // namespace Pegasus::server
