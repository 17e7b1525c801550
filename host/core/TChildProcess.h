#pragma once

#include "host/core/SpawnChild.h"
#include "host/core/TUniqueFd.h"

#include <chrono>
#include <cstddef>
#include <string>
#include <vector>

#include <sys/types.h>

namespace NKOLVRX20 {

// What became of it.
struct TProcessOutcome
{
    enum EEnd
    {
        kExited,   // fStatus is the exit status
        kSignaled, // fStatus is the signal
        kUnknown,  // it ended, but this process's SIGCHLD disposition threw the status away
        kNotRun,   // fStatus is the errno of the failed start
        kTimedOut, // killed
        kCancelled // killed, or not started, because programs are cancelled (TProcessControl)
    };

    EEnd fEnd = kNotRun;
    int fStatus = 0;
    std::string fOutput;
    std::string fErrorOutput;
    std::size_t fDroppedBytes = 0; // of both, beyond the limits

    bool IsSuccess() const { return fEnd == kExited && fStatus == 0; }
};

// Captured beyond these, output is read and dropped, so that the child does not stall.
constexpr std::size_t kMaxOutputBytes = 16UL * 1024 * 1024;
constexpr std::size_t kMaxErrorOutputBytes = 64UL * 1024;

// One run of a child process, started as SpawnChild says; standard output and error are captured.
// Thread: one at a time; several objects may be used at once.
class TChildProcess
{
  public:
    explicit TChildProcess(const TProcessRequest& request);

    // Never throws for what the child does; see TProcessOutcome.
    // Throws: std::bad_alloc.
    // Blocks: until the child exits (not until its last descendant closes the pipes), the time is over or programs are
    // cancelled.
    TProcessOutcome Run(std::chrono::milliseconds timeout);

  private:
    typedef std::chrono::steady_clock TClock;

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
    TUniqueFd fPidFd; // readable when the child has exited; none on kernels before 5.3
    TProcessOutcome fOutcome;
};

} // namespace NKOLVRX20
