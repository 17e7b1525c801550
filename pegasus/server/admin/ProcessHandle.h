// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Descriptor.h"

#include <chrono>

#include <sys/types.h>

namespace Pegasus::server {

// A process, by a handle that stays its own when the number is given to a later process.
//
// Thread: any.
class ProcessHandle
{
  public:
    // An unused process number gives the handle of an ended process.
    explicit ProcessHandle(pid_t pid);

    // Returns: whether the process runs this program's file.
    bool runsThisProgram() const;
    // Returns: false for a process that is being taken down, and for one whose program this user may not see.
    bool hasProgram() const;
    // Returns: false if it still runs at the time-out.
    bool waitForEnd(std::chrono::milliseconds timeout) const;
    // Sends SIGTERM, and SIGKILL when the process still runs after `grace`.
    // Blocks: for `grace`, and then until the kernel has taken the process down, at most kKillTimeout.
    void end(std::chrono::milliseconds grace) const;

  private:
    static constexpr std::chrono::seconds kKillTimeout{60};

    void send(int signal) const;

    pid_t fPid;
    base::Descriptor fHandle;
};

} // namespace Pegasus::server
