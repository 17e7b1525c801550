// SPDX-License-Identifier: MIT
#pragma once

#include "host/core/SpawnChild.h"
#include "host/core/TUniqueFd.h"

#include <chrono>
#include <cstddef>
#include <string>
#include <vector>

#include <sys/types.h>

namespace NKOLVRX20 {

// How a run ended, and what the child wrote.
struct TProcessOutcome
{
    enum EEnd
    {
        kExited,   // fStatus is the exit status
        kSignaled, // fStatus is the signal
        kUnknown,  // it ended; the kernel dropped the status because this process ignores SIGCHLD
        kNotRun,   // fStatus is the errno of the failed start
        kTimedOut, // killed
        kCancelled // killed or refused while programs are cancelled (TProcessControl)
    };

    EEnd fEnd = kNotRun;
    int fStatus = 0;
    std::string fOutput;
    std::string fErrorOutput;
    std::size_t fDroppedBytes = 0; // of both, beyond the limits

    bool IsSuccess() const { return fEnd == kExited && fStatus == 0; }
};

// Further output is read and dropped, so that the child keeps running.
constexpr std::size_t kMaxOutputBytes = 16UL * 1024 * 1024;
constexpr std::size_t kMaxErrorOutputBytes = 64UL * 1024;

// One run of a child process, started as SpawnChild says; standard output and error are captured.
// Thread: one at a time; several objects may be used at once.
class TChildProcess
{
  public:
    explicit TChildProcess(const TProcessRequest& request);

    // Returns: the outcome, also of a child that fails, or fails to start.
    // Throws: std::bad_alloc.
    // Blocks: until the child itself exits (its descendants may keep the pipes open), the timeout expires or programs
    // are cancelled.
    TProcessOutcome Run(std::chrono::milliseconds timeout);

  private:
    using TClock = std::chrono::steady_clock;

    struct TPipe
    {
        TUniqueFd fRead;
        TUniqueFd fWrite;
    };

    int Start();
    bool AwaitExit(TClock::time_point deadline);
    bool PollOnce(TClock::time_point deadline);
    bool HasExited() const;
    void Drain(TUniqueFd& from, std::string& into, std::size_t limit);
    void DrainBoth();
    void Kill();
    void Reap();

    const TProcessRequest& fRequest;
    TPipe fOutputPipe;
    TPipe fErrorPipe;
    pid_t fPid = -1;
    TUniqueFd fPidFd; // readable when the child has exited; empty on kernels before 5.3
    TProcessOutcome fOutcome;
};

} // namespace NKOLVRX20
