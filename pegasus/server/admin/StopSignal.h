// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Descriptor.h"

#include <thread>

namespace Pegasus::server {

// A descriptor that becomes readable when the server is to end: by SIGTERM, SIGINT or SIGHUP, or by raise().
// From the constructor on, these signals are blocked in this thread and in those started from it, and SIGPIPE is
// ignored by the process.
class StopSignal
{
  public:
    // Throws: std::system_error. Requires: the calling thread is the only one.
    StopSignal();
    ~StopSignal();
    StopSignal(const StopSignal&) = delete;
    StopSignal& operator=(const StopSignal&) = delete;

    int fd() const { return fEvent.get(); }
    // Thread: any.
    void raise() noexcept;

  private:
    void waitForSignal();

    base::Descriptor fEvent;
    base::Descriptor fSignals;
    base::Descriptor fEnd;
    std::thread fWaiter;
};

} // namespace Pegasus::server
