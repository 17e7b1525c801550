#pragma once

#include "pegasus/base/Descriptor.h"

#include <string>

namespace Pegasus::server {

// Holds "one server a tree" by a lock on <home>/cimserver.lock. The kernel lets it go when the process ends, however it
// ends; the file lies beside the repository, which may be deleted at any time.
class TreeLock
{
  public:
    // Returns: false if another process holds the tree.
    // Throws: std::system_error when the lock file cannot be opened.
    bool acquire(const std::string& home);
    // Lets go and removes the file.
    void release() noexcept;

  private:
    Descriptor fFile;
    std::string fPath;
};

} // namespace Pegasus::server
