// SPDX-License-Identifier: MIT
#include "pegasus/base/Deadline.h"
#include "pegasus/base/Descriptor.h"
#include "pegasus/server/agent/AgentConfinement.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <optional>
#include <string>
#include <system_error>

#include <poll.h>
#include <signal.h>
#include <sys/prctl.h>
#include <sys/signalfd.h>
#include <sys/wait.h>
#include <unistd.h>

namespace Pegasus::server {

namespace {

constexpr const char* kKeeperName = "cimprovkeep";
constexpr std::chrono::seconds kGraceWithoutServer{5}; // longer than the agent's own for its providers
constexpr std::chrono::seconds kKillTimeout{2};        // a process that a device driver holds may take for ever
constexpr std::chrono::milliseconds kKillPause{10};

sigset_t keeperSignals()
{
    sigset_t signals;
    ::sigemptyset(&signals);
    ::sigaddset(&signals, SIGCHLD);
    ::sigaddset(&signals, SIGTERM);
    return signals;
}

// Returns: 0 when the process has gone.
pid_t parentOf(const std::string& pid)
{
    std::ifstream file("/proc/" + pid + "/stat"); // 7 (a name) S 1 ...
    std::string text;
    std::getline(file, text, '\0');
    const std::size_t name = text.rfind(')');
    return name == std::string::npos || name + 4 > text.size() ? 0 : std::atoi(text.c_str() + name + 4);
}

void killChildren()
{
    std::error_code error;
    for (const auto& entry : std::filesystem::directory_iterator("/proc", error)) {
        const std::string name = entry.path().filename();
        if (name[0] >= '1' && name[0] <= '9' && parentOf(name) == ::getpid()) {
            ::kill(std::atoi(name.c_str()), SIGKILL);
        }
    }
}

class Keeper
{
  public:
    Keeper(pid_t agent, int control) : fAgent(agent), fControl(control)
    {
        const sigset_t signals = keeperSignals();
        fSignals.reset(::signalfd(-1, &signals, SFD_CLOEXEC | SFD_NONBLOCK));
    }

    // Returns: how the agent ended. Nothing that it started is left.
    int keep()
    {
        bool ends = false;
        while (!fStatus && !ends) {
            ends = !waitForSignal() || fStopped;
            reap();
        }
        const base::Deadline deadline = base::Deadline::after(kKillTimeout);
        while (reap() && !deadline.hasPassed()) {
            killChildren();
            pollfd wait = {fSignals.get(), POLLIN, 0};
            ::poll(&wait, 1, static_cast<int>(kKillPause.count()));
            takeSignals();
        }
        return fStatus.value_or(SIGKILL);
    }

  private:
    // Returns: false when the server has been gone for the grace period.
    bool waitForSignal()
    {
        pollfd waits[] = {{fSignals.get(), POLLIN, 0}, {fControl, POLLRDHUP, 0}};
        const int ready = ::poll(waits, std::size(waits), fServerEnd.pollTimeoutMs());
        if (ready > 0 && waits[1].revents != 0) {
            fControl = -1;
            fServerEnd = base::Deadline::after(kGraceWithoutServer);
        }
        takeSignals();
        return ready != 0;
    }

    void takeSignals()
    {
        signalfd_siginfo info = {};
        while (::read(fSignals.get(), &info, sizeof info) == static_cast<ssize_t>(sizeof info)) {
            fStopped = fStopped || info.ssi_signo == SIGTERM;
        }
    }

    // Returns: whether children are left.
    bool reap()
    {
        int status = 0;
        pid_t pid = 0;
        while ((pid = ::waitpid(-1, &status, WNOHANG)) > 0) {
            if (pid == fAgent) {
                fStatus = status;
            }
        }
        return pid == 0;
    }

    pid_t fAgent;
    int fControl; // -1 when the server has gone
    base::Descriptor fSignals;
    bool fStopped = false;
    base::Deadline fServerEnd = base::Deadline::never();
    std::optional<int> fStatus;
};

[[noreturn]] void endAs(int status)
{
    if (WIFSIGNALED(status)) {
        ::prctl(PR_SET_DUMPABLE, 0); // the agent's own core file is the one of interest
        ::signal(WTERMSIG(status), SIG_DFL);
        sigset_t all;
        ::sigfillset(&all);
        ::sigprocmask(SIG_UNBLOCK, &all, nullptr);
        ::kill(::getpid(), WTERMSIG(status));
    }
    ::_exit(WEXITSTATUS(status));
}

// The agent's part: a group of its own, so that a provider's signal to its group spares the keeper.
void becomeAgent(pid_t keeper, const sigset_t& mask)
{
    ::setpgid(0, 0);
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    if (::getppid() != keeper) {
        ::_exit(0);
    }
    ::sigprocmask(SIG_SETMASK, &mask, nullptr);
}

} // namespace

void splitOffKeeper(int control)
{
    const pid_t keeper = ::getpid();
    const sigset_t signals = keeperSignals();
    sigset_t before;
    ::sigprocmask(SIG_BLOCK, &signals, &before);
    ::prctl(PR_SET_CHILD_SUBREAPER, 1);
    const pid_t agent = ::fork();
    if (agent < 0) {
        std::perror("cannot create a process for an agent"); // into the server's log
        ::_exit(1);
    }
    if (agent == 0) {
        return becomeAgent(keeper, before);
    }
    ::prctl(PR_SET_NAME, kKeeperName);
    // The agent's output ends with the agent.
    ::dup2(STDIN_FILENO, STDOUT_FILENO);
    ::dup2(STDIN_FILENO, STDERR_FILENO);
    endAs(Keeper(agent, control).keep());
}

} // namespace Pegasus::server
