// SPDX-License-Identifier: MIT
#include "host/core/TChildProcess.h"

#include "host/core/TProcessControl.h"

#include <algorithm>
#include <cerrno>
#include <csignal>

#include <poll.h>
#include <sys/wait.h>

extern "C" {
#include <sys/pidfd.h> // glibc 2.36 declares it for C only
}

namespace NKOLVRX20 {
namespace {

// The interval between looks at the child on kernels that are unable to announce its exit.
constexpr std::chrono::milliseconds kExitPollInterval{20};

// Reads in one go: more than a pipe holds, so that all output is read after the exit; bounded, so that the deadline is
// checked even while a program keeps writing.
constexpr int kMaxReadsAtOnce = 16;

} // namespace

TChildProcess::TChildProcess(const TProcessRequest& request) : fRequest(request) {}

TProcessOutcome TChildProcess::Run(std::chrono::milliseconds timeout)
{
    const auto deadline = TClock::now() + timeout;
    if (TProcessControl::Instance().IsCancelled()) {
        fOutcome.fEnd = TProcessOutcome::kCancelled;
        return std::move(fOutcome);
    }
    if (const int error = Start()) {
        fOutcome.fEnd = TProcessOutcome::kNotRun;
        fOutcome.fStatus = error;
        return std::move(fOutcome);
    }
    const bool exited = AwaitExit(deadline);
    if (!exited) {
        Kill();
    }
    Reap();
    DrainBoth();
    if (!exited) {
        fOutcome.fEnd =
            TProcessControl::Instance().IsCancelled() ? TProcessOutcome::kCancelled : TProcessOutcome::kTimedOut;
    }
    return std::move(fOutcome);
}

int TChildProcess::Start()
{
    int error = OpenPipe(fOutputPipe.fRead, fOutputPipe.fWrite);
    if (!error) {
        error = OpenPipe(fErrorPipe.fRead, fErrorPipe.fWrite);
    }
    if (!error) {
        error = SpawnChild(fRequest, fOutputPipe.fWrite.Get(), fErrorPipe.fWrite.Get(), fPid);
    }
    fOutputPipe.fWrite.Reset();
    fErrorPipe.fWrite.Reset();
    if (!error) {
        fPidFd = TUniqueFd(::pidfd_open(fPid, 0));
    }
    return error;
}

bool TChildProcess::AwaitExit(TClock::time_point deadline)
{
    while (!HasExited()) {
        if (!PollOnce(deadline)) {
            return HasExited();
        }
        DrainBoth();
    }
    return true;
}

// Waits for output, for the exit, for the deadline or for a cancellation. Returns: false for the latter two.
bool TChildProcess::PollOnce(TClock::time_point deadline)
{
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(deadline - TClock::now());
    if (left.count() <= 0 || TProcessControl::Instance().IsCancelled()) {
        return false;
    }
    const auto wait = fPidFd ? left : std::min(left, kExitPollInterval);
    // poll skips negative descriptors: closed pipes and a missing pid descriptor.
    pollfd fds[] = {{fOutputPipe.fRead.Get(), POLLIN, 0},
                    {fErrorPipe.fRead.Get(), POLLIN, 0},
                    {fPidFd.Get(), POLLIN, 0},
                    {TProcessControl::Instance().GetWakeFd(), POLLIN, 0}};
    constexpr long kMaxWaitMs = 60L * 60 * 1000; // poll takes an int
    ::poll(fds, std::size(fds), static_cast<int>(std::min<long>(wait.count(), kMaxWaitMs)));
    return true;
}

// Leaves the child waitable, so that its process id stays reserved until Kill and Reap.
bool TChildProcess::HasExited() const
{
    siginfo_t info{};
    const int result = ::waitid(P_PID, static_cast<id_t>(fPid), &info, WEXITED | WNOHANG | WNOWAIT);
    return result == 0 ? info.si_pid == fPid : errno == ECHILD;
}

void TChildProcess::Drain(TUniqueFd& from, std::string& into, std::size_t limit)
{
    char buffer[64 * 1024];
    for (int reads = 0; from && reads < kMaxReadsAtOnce; ++reads) {
        const ssize_t count = ::read(from.Get(), buffer, sizeof buffer);
        if (count > 0) {
            const auto bytes = static_cast<std::size_t>(count);
            const std::size_t kept = std::min(bytes, limit - into.size());
            into.append(buffer, kept);
            fOutcome.fDroppedBytes += bytes - kept;
        } else if (count < 0 && errno == EAGAIN) {
            return;
        } else if (count == 0 || errno != EINTR) {
            from.Reset();
        }
    }
}

void TChildProcess::DrainBoth()
{
    Drain(fOutputPipe.fRead, fOutcome.fOutput, kMaxOutputBytes);
    Drain(fErrorPipe.fRead, fOutcome.fErrorOutput, kMaxErrorOutputBytes);
}

// Kills the group, and the child itself in case it left the group.
void TChildProcess::Kill()
{
    ::killpg(fPid, SIGKILL);
    if (fPidFd) {
        ::pidfd_send_signal(fPidFd.Get(), SIGKILL, nullptr, 0);
    } else {
        ::kill(fPid, SIGKILL);
    }
}

void TChildProcess::Reap()
{
    int status = 0;
    pid_t reaped = -1;
    do {
        reaped = ::waitpid(fPid, &status, 0);
    } while (reaped < 0 && errno == EINTR);

    if (reaped != fPid) {
        fOutcome.fEnd = TProcessOutcome::kUnknown;
    } else if (WIFEXITED(status)) {
        fOutcome.fEnd = TProcessOutcome::kExited;
        fOutcome.fStatus = WEXITSTATUS(status);
    } else {
        fOutcome.fEnd = TProcessOutcome::kSignaled;
        fOutcome.fStatus = WTERMSIG(status);
    }
}

} // namespace NKOLVRX20
