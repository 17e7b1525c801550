// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentProcess.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <system_error>

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/socket.h>
#include <sys/syscall.h>
#include <sys/wait.h>

extern char** environ;

namespace Pegasus::server {

const char* const kAgentProcessName = "cimprovagt";

namespace {

constexpr int kAgentControlFd = 3;
constexpr std::chrono::seconds kGraceOfDestructor{3};

struct SocketPair
{
    base::Descriptor ours;
    base::Descriptor theirs;
};

SocketPair makeSocketPair()
{
    int ends[2];
    if (::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0) {
        throw std::system_error(errno, std::generic_category(), "cannot create a socket pair for an agent");
    }
    return {base::Descriptor(ends[0]), base::Descriptor(ends[1])};
}

// What posix_spawn needs; freed with it.
struct SpawnPlan
{
    posix_spawn_file_actions_t actions{};
    posix_spawnattr_t attributes{};

    SpawnPlan(int control, int output)
    {
        ::posix_spawn_file_actions_init(&actions);
        ::posix_spawnattr_init(&attributes);
        ::posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDWR, 0);
        ::posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
        ::posix_spawn_file_actions_adddup2(&actions, output, STDERR_FILENO);
        // spawnAgent() sees to it that `control` differs from 3: dup2 onto itself would keep close-on-exec.
        ::posix_spawn_file_actions_adddup2(&actions, control, kAgentControlFd);
        sigset_t none;
        sigset_t all;
        ::sigemptyset(&none);
        ::sigfillset(&all);
        ::posix_spawnattr_setsigmask(&attributes, &none);
        ::posix_spawnattr_setsigdefault(&attributes, &all);
        ::posix_spawnattr_setpgroup(&attributes, 0);
        ::posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETPGROUP);
    }
    ~SpawnPlan()
    {
        ::posix_spawnattr_destroy(&attributes);
        ::posix_spawn_file_actions_destroy(&actions);
    }
    SpawnPlan(const SpawnPlan&) = delete;
    SpawnPlan& operator=(const SpawnPlan&) = delete;
};

pid_t spawnAgent(const std::string& module, const AgentConfinement& confinement, base::Descriptor control,
                 const base::Descriptor& output)
{
    if (control.get() == kAgentControlFd) {
        control.reset(::fcntl(control.release(), F_DUPFD_CLOEXEC, kAgentControlFd + 1));
    }
    const SpawnPlan plan(control.get(), output.get());
    std::vector<std::string> words = agentWords(confinement);
    words.insert(words.begin(), {kAgentProcessName, "--agent", module});
    std::vector<char*> argv;
    for (std::string& word : words) {
        argv.push_back(word.data());
    }
    argv.push_back(nullptr);
    pid_t pid = -1;
    // A process that runs through this link is called "exe" until it names itself; programs that look for cimserver
    // pass it over.
    const int error = ::posix_spawn(&pid, "/proc/self/exe", &plan.actions, &plan.attributes, argv.data(), environ);
    if (error != 0) {
        throw std::system_error(error, std::generic_category(), "cannot start the agent of module \"" + module + "\"");
    }
    return pid;
}

// Hands a descriptor to the agent.
bool sendDescriptor(int control, int fd)
{
    char byte = 0;
    iovec data = {&byte, 1};
    alignas(cmsghdr) char space[CMSG_SPACE(sizeof fd)] = {};
    msghdr message = {};
    message.msg_iov = &data;
    message.msg_iovlen = 1;
    message.msg_control = space;
    message.msg_controllen = sizeof space;
    cmsghdr* header = CMSG_FIRSTHDR(&message);
    header->cmsg_level = SOL_SOCKET;
    header->cmsg_type = SCM_RIGHTS;
    header->cmsg_len = CMSG_LEN(sizeof fd);
    std::memcpy(CMSG_DATA(header), &fd, sizeof fd);
    ssize_t n = -1;
    do {
        n = ::sendmsg(control, &message, MSG_NOSIGNAL);
    } while (n < 0 && errno == EINTR);
    return n == 1;
}

} // namespace

AgentProcess::AgentProcess(const std::string& module, const AgentConfinement& confinement)
    : fModule(module), fOutput(module)
{
    SocketPair control = makeSocketPair();
    fControl = std::move(control.ours);
    fPid = spawnAgent(module, confinement, std::move(control.theirs), fOutput.open());
    try {
        fEnd.reset(static_cast<int>(::syscall(SYS_pidfd_open, fPid, 0)));
        if (!fEnd) {
            throw std::system_error(errno, std::generic_category(), "cannot wait for an agent");
        }
        fWatcher = std::thread([this] { watch(); });
    } catch (...) {
        ::kill(fPid, SIGKILL);
        ::waitpid(fPid, nullptr, 0);
        throw;
    }
}

AgentProcess::~AgentProcess()
{
    close();
    if (!waitForEnd(base::Deadline::after(kGraceOfDestructor))) {
        kill();
    }
    if (!waitForEnd(base::Deadline::after(kGraceOfDestructor))) { // the keeper has been stopped
        signal(SIGKILL);
    }
    fWatcher.join();
}

void AgentProcess::watch()
{
    for (bool ended = false; !ended;) {
        pollfd waits[] = {{fEnd.get(), POLLIN, 0}, {fOutput.fd(), POLLIN, 0}};
        ::poll(waits, std::size(waits), fOutput.pollTimeoutMs());
        fOutput.read();
        ended = waits[0].revents != 0;
    }
    fOutput.finish();
    const std::lock_guard<std::mutex> lock(fMutex);
    // The process id stays ours until fEnded is set under the lock, so that signal() hits this process only.
    while (::waitpid(fPid, &fStatus, 0) < 0 && errno == EINTR) {
    }
    fEnded = true;
    fIdle.clear();
    for (const std::weak_ptr<AgentChannel>& entry : fInUse) {
        if (const std::shared_ptr<AgentChannel> channel = entry.lock()) {
            channel->shutDown(); // a process that survived its killing may hold the other end
        }
    }
    fChanged.notify_all();
}

// Enters a channel among those in use.
std::shared_ptr<AgentChannel> AgentProcess::inUse(std::shared_ptr<AgentChannel> channel)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (fEnded) {
        throw AgentGone("the agent has ended");
    }
    const auto isGone = [](const std::weak_ptr<AgentChannel>& entry) { return entry.expired(); };
    fInUse.erase(std::remove_if(fInUse.begin(), fInUse.end(), isGone), fInUse.end());
    fInUse.push_back(channel);
    return channel;
}

std::shared_ptr<AgentChannel> AgentProcess::takeChannel()
{
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        if (!fIdle.empty()) { // it is among those in use already
            std::shared_ptr<AgentChannel> channel = std::move(fIdle.back());
            fIdle.pop_back();
            return channel;
        }
    }
    SocketPair pair = makeSocketPair();
    if (!sendDescriptor(fControl.get(), pair.theirs.get())) {
        throw AgentGone("the agent takes no request");
    }
    return inUse(std::make_shared<AgentChannel>(std::move(pair.ours)));
}

void AgentProcess::giveBack(std::shared_ptr<AgentChannel> channel)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (!fEnded) {
        fIdle.push_back(std::move(channel));
    }
}

void AgentProcess::close() noexcept
{
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        fIdle.clear(); // the agent's threads at their other ends end
    }
    ::shutdown(fControl.get(), SHUT_RDWR);
}

void AgentProcess::kill() noexcept
{
    signal(SIGTERM); // to the keeper, which kills
}

void AgentProcess::signal(int number) noexcept
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (!fEnded) {
        ::kill(fPid, number);
    }
}

bool AgentProcess::isRunning() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return !fEnded;
}

bool AgentProcess::waitForEnd(const base::Deadline& deadline) const
{
    std::unique_lock<std::mutex> lock(fMutex);
    return fChanged.wait_until(lock, deadline.time(), [&] { return fEnded; });
}

std::string AgentProcess::causeOfDeath() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (!fEnded) {
        return {};
    }
    if (WIFSIGNALED(fStatus)) {
        return "killed by signal " + std::to_string(WTERMSIG(fStatus)) + " (" + ::strsignal(WTERMSIG(fStatus)) + ")";
    }
    return "exit status " + std::to_string(WEXITSTATUS(fStatus));
}

} // namespace Pegasus::server
