// SPDX-License-Identifier: MIT
#include "pegasus/server/net/Acceptor.h"

#include "pegasus/base/TcpOwner.h"
#include "pegasus/base/Users.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/net/Listener.h"

#include <cerrno>

#include <poll.h>
#include <sys/socket.h>

namespace Pegasus::server {

namespace {

constexpr int kRetryMs = 200; // out of descriptors, or refused connections to close
constexpr std::chrono::seconds kRefusalLogInterval{1};

} // namespace

void RefusedConnections::refuse(base::Descriptor connection)
{
    static const char kAnswer[] = "HTTP/1.1 503 Service Unavailable\r\nPGErrorDetail: "
                                  "maxConnections%20are%20being%20served%20already.\r\n"
                                  "Content-Length: 0\r\nConnection: close\r\n\r\n";
    if (::send(connection.get(), kAnswer, sizeof kAnswer - 1, MSG_DONTWAIT | MSG_NOSIGNAL) < 0) {
        return;
    }
    ::shutdown(connection.get(), SHUT_WR);
    if (fWaiting.size() == kMaxWaiting) {
        fWaiting.pop_front();
    }
    fWaiting.push_back({std::move(connection), base::Deadline::after(kMoment)});
}

void RefusedConnections::expire()
{
    while (!fWaiting.empty() && fWaiting.front().deadline.hasPassed()) {
        fWaiting.pop_front();
    }
}

void RefusalLog::note(std::optional<uid_t> user, Clock::time_point now)
{
    if (now < fNext) {
        ++fUnreported;
        return;
    }
    fNext = now + kRefusalLogInterval;
    std::string line = user ? "Refused a connection of user " + std::to_string(*user) + "."
                            : "Refused a connection: the kernel does not say whose it is.";
    if (fUnreported > 0) {
        line += " Others refused since the last such line: " + std::to_string(fUnreported) + ".";
    }
    fUnreported = 0;
    Log::write(LogLevel::kWarning, line);
}

// Returns: false when it is time to stop. `ready` says which sources have a connection.
bool Acceptor::waitForWork(std::vector<bool>& ready)
{
    std::vector<pollfd> waits = {{fStop, POLLIN, 0}};
    if (fListening) {
        for (const Source& source : fSources) {
            waits.push_back({source.listener.get(), POLLIN, 0});
        }
    }
    const int timeout = fListening && fRefused.empty() ? -1 : kRetryMs;
    const int count = ::poll(waits.data(), waits.size(), timeout);
    ready.assign(fSources.size(), false);
    if (count < 0) {
        return errno == EINTR;
    }
    for (std::size_t i = 1; i < waits.size(); ++i) {
        ready[i - 1] = waits[i].revents != 0;
    }
    return waits[0].revents == 0;
}

bool Acceptor::accept(Source& source)
{
    bool exhausted = false;
    base::Descriptor connection = acceptConnection(source.listener, exhausted);
    if (!connection) {
        return !exhausted;
    }
    const std::optional<uid_t> user = source.peerUser(connection.get());
    if (!base::isTrustedUser(user)) {
        fRefusalLog.note(user);
        return true;
    }
    if (!source.group->serve(connection, fMaxConnections())) {
        fRefused.refuse(std::move(connection));
    }
    return true;
}

// Returns: whether it is time to stop, after at most kRetryMs. It allocates nothing.
bool Acceptor::waitForStop() const
{
    pollfd wait = {fStop, POLLIN, 0};
    return ::poll(&wait, 1, kRetryMs) > 0;
}

// Returns: false when it is time to stop.
bool Acceptor::serveReady()
{
    std::vector<bool> ready;
    if (!waitForWork(ready)) {
        return false;
    }
    fListening = true;
    for (std::size_t i = 0; i < fSources.size(); ++i) {
        if (ready[i] && !accept(fSources[i])) {
            fListening = false;
        }
    }
    fRefused.expire();
    return true;
}

void Acceptor::run()
{
    for (bool stopped = false; !stopped;) {
        try {
            stopped = !serveReady();
        } catch (const std::exception&) { // out of memory: this connection is dropped, the next ones wait a moment
            stopped = waitForStop();
        }
    }
    fSources.clear();
}

} // namespace Pegasus::server
