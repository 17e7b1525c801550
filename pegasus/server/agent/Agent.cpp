// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/Agent.h"

#include "pegasus/server/admin/ConfigFile.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/agent/AgentConfinement.h"
#include "pegasus/server/agent/AgentHandler.h"
#include "pegasus/server/agent/AgentProcess.h"
#include "pegasus/server/agent/AgentServices.h"

#include <cerrno>
#include <condition_variable>
#include <cstdio>
#include <cstring>
#include <thread>

#include <fcntl.h>
#include <signal.h>
#include <sys/prctl.h>
#include <sys/socket.h>

namespace Pegasus::server {

namespace {

constexpr int kControlFd = 3;
constexpr std::chrono::seconds kGraceForProviders{2};

// The threads that serve channels. They are detached; the count says when the last one has ended.
class ChannelThreads
{
  public:
    void serve(base::Descriptor channel, AgentHandler& handler)
    {
        {
            const std::lock_guard<std::mutex> lock(fMutex);
            ++fCount;
        }
        std::thread([this, &handler, fd = channel.release()] {
            run(base::Descriptor(fd), handler);
            const std::lock_guard<std::mutex> lock(fMutex);
            --fCount;
            fChanged.notify_all();
        }).detach();
    }

    // Returns: false if some still run at the deadline.
    bool waitForEnd(const base::Deadline& deadline)
    {
        std::unique_lock<std::mutex> lock(fMutex);
        return fChanged.wait_until(lock, deadline.time(), [&] { return fCount == 0; });
    }

  private:
    // The server has checked its client's limits already; it decides how long anything may take.
    static ConnectionSettings settings()
    {
        ConnectionSettings settings;
        settings.http = {16u << 20, 1u << 30};
        settings.times = {std::chrono::milliseconds::zero(), std::chrono::milliseconds::zero()};
        settings.writeTimeout = std::chrono::milliseconds::zero();
        settings.maxXmlDepth = 1024;
        return settings;
    }

    static void run(base::Descriptor channel, AgentHandler& handler)
    {
        SocketStream stream(std::move(channel));
        serveConnection(stream, handler, settings, CimAnswer::Envelope::kBare);
    }

    std::mutex fMutex;
    std::condition_variable fChanged;
    unsigned fCount = 0;
};

// Returns: the next channel; an empty descriptor when the server has gone.
base::Descriptor receiveChannel()
{
    char byte = 0;
    iovec data = {&byte, 1};
    int fd = -1;
    alignas(cmsghdr) char space[CMSG_SPACE(sizeof fd)] = {};
    msghdr message = {};
    message.msg_iov = &data;
    message.msg_iovlen = 1;
    message.msg_control = space;
    message.msg_controllen = sizeof space;
    ssize_t n = -1;
    do {
        n = ::recvmsg(kControlFd, &message, MSG_CMSG_CLOEXEC);
    } while (n < 0 && errno == EINTR);
    const cmsghdr* header = n == 1 ? CMSG_FIRSTHDR(&message) : nullptr;
    if (header != nullptr && header->cmsg_level == SOL_SOCKET && header->cmsg_type == SCM_RIGHTS) {
        std::memcpy(&fd, CMSG_DATA(header), sizeof fd);
    }
    return base::Descriptor(fd);
}

// A provider that writes to a closed pipe, or beyond the limit of a file, gets an error; the signal would end its
// agent. What it prints arrives line by line.
void prepareForProviders()
{
    ::signal(SIGPIPE, SIG_IGN);
    ::signal(SIGXFSZ, SIG_IGN);
    std::setvbuf(stdout, nullptr, _IOLBF, BUFSIZ);
}

} // namespace

bool isAgentCommand(int argc, char** argv)
{
    return argc >= 3 && std::strcmp(argv[1], "--agent") == 0;
}

int runAgent(int, char** argv)
{
    ::fcntl(kControlFd, F_SETFD, FD_CLOEXEC);
    splitOffKeeper(kControlFd);
    ::prctl(PR_SET_NAME, kAgentProcessName);
    const AgentConfinement confinement = agentConfinement(argv + 3);
    confine(confinement);
    prepareForProviders();
    Log::open(defaultHome(), false);
    AgentServices services(argv[2], confinement.strictProviders != 0);
    auto handler = std::make_unique<AgentHandler>(argv[2], services, confinement.strictOwners != 0);
    ChannelThreads threads;
    while (base::Descriptor channel = receiveChannel()) {
        threads.serve(std::move(channel), *handler);
    }
    // When every request has ended in time, providers are asked to clean up. A provider that still works is cut off.
    if (threads.waitForEnd(base::Deadline::after(kGraceForProviders))) {
        handler.reset();
    }
    ::_exit(0);
}

} // namespace Pegasus::server
