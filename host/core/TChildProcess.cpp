#include "TChildProcess.h"

#include "TProcessControl.h"

#include <algorithm>
#include <cerrno>
#include <csignal>

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/wait.h>

extern "C" {
#include <sys/pidfd.h> // C only in glibc 2.36
}

extern char** environ;

namespace NKOLVRX20 {
namespace {

// How often the child is looked at where the kernel cannot announce its exit.
constexpr std::chrono::milliseconds kExitPollInterval{20};

// Read at a time: more than a pipe holds, so that nothing is missed after the exit, but bounded, so that a program that
// never stops writing cannot keep the deadline from being looked at.
constexpr int kMaxReadsAtOnce = 16;

// RAII for the two plain structures of posix_spawn.
struct TSpawnSettings
{
    posix_spawnattr_t fAttributes;
    posix_spawn_file_actions_t fActions;

    TSpawnSettings()
    {
        posix_spawnattr_init(&fAttributes);
        posix_spawn_file_actions_init(&fActions);
    }
    ~TSpawnSettings()
    {
        posix_spawn_file_actions_destroy(&fActions);
        posix_spawnattr_destroy(&fAttributes);
    }
    TSpawnSettings(const TSpawnSettings&) = delete;
    TSpawnSettings& operator=(const TSpawnSettings&) = delete;
};

void SetFreshSignalsAndGroup(posix_spawnattr_t& attributes)
{
    sigset_t all, none;
    sigfillset(&all);
    sigemptyset(&none);
    posix_spawnattr_setsigdefault(&attributes, &all);
    posix_spawnattr_setsigmask(&attributes, &none);
    posix_spawnattr_setpgroup(&attributes, 0);
    posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETPGROUP);
}

int SetStandardStreams(posix_spawn_file_actions_t& actions, int output, int errorOutput)
{
    int error = posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    if (!error)
        error = posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
    if (!error)
        error = posix_spawn_file_actions_adddup2(&actions, errorOutput, STDERR_FILENO);
    if (!error)
        error = posix_spawn_file_actions_addclosefrom_np(&actions, STDERR_FILENO + 1);
    return error;
}

std::vector<char*> ToPointers(const std::vector<std::string>& texts)
{
    std::vector<char*> pointers;
    pointers.reserve(texts.size() + 1);
    for (const std::string& text : texts)
        pointers.push_back(const_cast<char*>(text.c_str()));
    pointers.push_back(nullptr);
    return pointers;
}

// In a process whose standard streams are closed, a pipe could land on 0 to 2 and be overwritten in the child.
int MoveAboveStandardStreams(UniqueFd& fd)
{
    if (fd.Get() > STDERR_FILENO)
        return 0;
    UniqueFd moved(::fcntl(fd.Get(), F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
    if (!moved)
        return errno;
    fd = std::move(moved);
    return 0;
}

int OpenPipe(UniqueFd& readEnd, UniqueFd& writeEnd)
{
    int ends[2];
    if (::pipe2(ends, O_CLOEXEC) != 0)
        return errno;
    readEnd = UniqueFd(ends[0]);
    writeEnd = UniqueFd(ends[1]);
    int error = MoveAboveStandardStreams(readEnd);
    if (!error)
        error = MoveAboveStandardStreams(writeEnd);
    // Only our end: the child's stays as a program expects it.
    if (!error && ::fcntl(readEnd.Get(), F_SETFL, O_NONBLOCK) != 0)
        error = errno;
    return error;
}

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
    if (!exited)
        Kill();
    Reap();
    DrainBoth();
    if (!exited)
        fOutcome.fEnd =
            TProcessControl::Instance().IsCancelled() ? TProcessOutcome::kCancelled : TProcessOutcome::kTimedOut;
    return std::move(fOutcome);
}

int TChildProcess::Start()
{
    int error = OpenPipe(fOutputPipe.fRead, fOutputPipe.fWrite);
    if (!error)
        error = OpenPipe(fErrorPipe.fRead, fErrorPipe.fWrite);
    if (!error)
        error = Spawn();
    fOutputPipe.fWrite.Reset();
    fErrorPipe.fWrite.Reset();
    if (!error)
        fPidFd = UniqueFd(::pidfd_open(fPid, 0));
    return error;
}

int TChildProcess::Spawn()
{
    TSpawnSettings settings;
    SetFreshSignalsAndGroup(settings.fAttributes);
    if (const int error = SetStandardStreams(settings.fActions, fOutputPipe.fWrite.Get(), fErrorPipe.fWrite.Get()))
        return error;
    const auto arguments = ToPointers(fRequest.fArguments);
    const auto environment = ToPointers(fRequest.fEnvironment);
    const auto spawn = fRequest.fSearchPath ? posix_spawnp : posix_spawn;
    return spawn(&fPid, fRequest.fProgram.c_str(), &settings.fActions, &settings.fAttributes, arguments.data(),
                 fRequest.fInheritEnvironment ? environ : environment.data());
}

bool TChildProcess::AwaitExit(TClock::time_point deadline)
{
    while (!HasExited()) {
        if (!PollOnce(deadline))
            return HasExited();
        DrainBoth();
    }
    return true;
}

// Waits for output, for the exit, for the deadline or for a cancellation. Returns: false for the latter two.
bool TChildProcess::PollOnce(TClock::time_point deadline)
{
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(deadline - TClock::now());
    if (left.count() <= 0 || TProcessControl::Instance().IsCancelled())
        return false;
    const auto wait = fPidFd ? left : std::min(left, kExitPollInterval);
    // A negative descriptor is skipped, so closed pipes and a missing pid descriptor need no special case.
    pollfd fds[] = {{fOutputPipe.fRead.Get(), POLLIN, 0},
                    {fErrorPipe.fRead.Get(), POLLIN, 0},
                    {fPidFd.Get(), POLLIN, 0},
                    {TProcessControl::Instance().GetWakeFd(), POLLIN, 0}};
    constexpr long kMaxWaitMs = 60 * 60 * 1000; // poll takes an int
    ::poll(fds, std::size(fds), static_cast<int>(std::min<long>(wait.count(), kMaxWaitMs)));
    return true;
}

// Leaves the child waitable, so that its process id cannot be taken by another process before Kill and Reap.
bool TChildProcess::HasExited() const
{
    siginfo_t info{};
    const int result = ::waitid(P_PID, static_cast<id_t>(fPid), &info, WEXITED | WNOHANG | WNOWAIT);
    return result == 0 ? info.si_pid == fPid : errno == ECHILD;
}

void TChildProcess::Drain(UniqueFd& from, std::string& into, std::size_t limit)
{
    char buffer[64 * 1024];
    while (from) {
        const ssize_t count = ::read(from.Get(), buffer, sizeof buffer);
        if (count > 0) {
            const auto bytes = static_cast<std::size_t>(count);
            const std::size_t kept = std::min(bytes, limit - into.size());
            into.append(buffer, kept);
            fOutcome.fDroppedBytes += bytes - kept;
        } else if (count == 0)
            from.Reset();
        else if (errno == EAGAIN)
            return;
        else if (errno != EINTR)
            from.Reset();
    }
}

void TChildProcess::DrainBoth()
{
    Drain(fOutputPipe.fRead, fOutcome.fOutput, kMaxOutputBytes);
    Drain(fErrorPipe.fRead, fOutcome.fErrorOutput, kMaxErrorOutputBytes);
}

// The group, and the child itself in case that it left the group.
void TChildProcess::Kill()
{
    ::killpg(fPid, SIGKILL);
    if (fPidFd)
        ::pidfd_send_signal(fPidFd.Get(), SIGKILL, nullptr, 0);
    else
        ::kill(fPid, SIGKILL);
}

void TChildProcess::Reap()
{
    int status = 0;
    pid_t reaped;
    do
        reaped = ::waitpid(fPid, &status, 0);
    while (reaped < 0 && errno == EINTR);

    if (reaped != fPid)
        fOutcome.fEnd = TProcessOutcome::kUnknown;
    else if (WIFEXITED(status)) {
        fOutcome.fEnd = TProcessOutcome::kExited;
        fOutcome.fStatus = WEXITSTATUS(status);
    } else {
        fOutcome.fEnd = TProcessOutcome::kSignaled;
        fOutcome.fStatus = WTERMSIG(status);
    }
}

} // namespace NKOLVRX20
