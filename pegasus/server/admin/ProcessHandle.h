#pragma once

#include "pegasus/base/Descriptor.h"

#include <chrono>

#include <sys/types.h>

namespace Pegasus::server {

// A process by a handle of its own: a later process of the same number is never waited for or ended.
class ProcessHandle
{
  public:
    // A process that has ended already, or never was, gives a handle of a process that has ended.
    explicit ProcessHandle(pid_t pid);

    // Whether the process runs this program.
    bool runsThisProgram() const;
    // Returns: false if it still runs at the time-out.
    bool waitForEnd(std::chrono::milliseconds timeout) const;
    // Sends SIGTERM, and SIGKILL when the process has not ended after `grace`.
    // Blocks: for `grace`, and then until the kernel has taken the process down, at most kKillTimeout.
    void end(std::chrono::milliseconds grace) const;

  private:
    static constexpr std::chrono::seconds kKillTimeout{60};

    void send(int signal) const;

    pid_t fPid;
    base::Descriptor fHandle;
};

} // namespace Pegasus::server
