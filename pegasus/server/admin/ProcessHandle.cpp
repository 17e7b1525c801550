// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/ProcessHandle.h"

#include <string>

#include <poll.h>
#include <signal.h>
#include <sys/stat.h>
#include <sys/syscall.h>

namespace Pegasus::server {

namespace {

std::string programOf(pid_t pid)
{
    return "/proc/" + std::to_string(pid) + "/exe";
}

} // namespace

ProcessHandle::ProcessHandle(pid_t pid) : fPid(pid)
{
    if (pid > 0) {
        fHandle.reset(static_cast<int>(::syscall(SYS_pidfd_open, pid, 0)));
    }
}

bool ProcessHandle::runsThisProgram() const
{
    struct stat theirs = {};
    struct stat ours = {};
    // The process is asked for after its program, so that the number was still its own then.
    return fHandle && ::stat(programOf(fPid).c_str(), &theirs) == 0 && ::stat("/proc/self/exe", &ours) == 0 &&
           theirs.st_dev == ours.st_dev && theirs.st_ino == ours.st_ino &&
           !waitForEnd(std::chrono::milliseconds::zero());
}

bool ProcessHandle::hasProgram() const
{
    struct stat info = {};
    return ::stat(programOf(fPid).c_str(), &info) == 0;
}

bool ProcessHandle::waitForEnd(std::chrono::milliseconds timeout) const
{
    pollfd wait = {fHandle.get(), POLLIN, 0};
    return !fHandle || ::poll(&wait, 1, static_cast<int>(timeout.count())) > 0;
}

void ProcessHandle::end(std::chrono::milliseconds grace) const
{
    send(SIGTERM);
    if (!waitForEnd(grace)) {
        send(SIGKILL);
        waitForEnd(kKillTimeout);
    }
}

void ProcessHandle::send(int signal) const
{
    if (fHandle) {
        ::syscall(SYS_pidfd_send_signal, fHandle.get(), signal, nullptr, 0);
    }
}

} // namespace Pegasus::server
