#include "pegasus/server/net/Acceptor.h"

#include "pegasus/server/admin/Log.h"
#include "pegasus/server/net/Listener.h"
#include "pegasus/server/net/PeerCheck.h"

#include <cerrno>

#include <poll.h>

namespace Pegasus::server {

namespace {

constexpr int kRetryMs = 200; // out of descriptors, or refused connections to close

} // namespace

// Returns: false when it is time to stop. `ready` says which sources have a connection.
bool Acceptor::waitForWork(bool listening, std::vector<bool>& ready)
{
    std::vector<pollfd> waits = {{fStop, POLLIN, 0}};
    if (listening) {
        for (const Source& source : fSources) {
            waits.push_back({source.listener.get(), POLLIN, 0});
        }
    }
    const int timeout = listening && fRefused.empty() ? -1 : kRetryMs;
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
    Descriptor connection = acceptConnection(source.listener, exhausted);
    if (!connection) {
        return !exhausted;
    }
    const std::optional<uid_t> user = source.peerUser(connection.get());
    if (!mayConnect(user)) {
        Log::write(Severity::kWarning, user ? "Refused a connection of user " + std::to_string(*user) + "."
                                            : "Refused a connection: the kernel does not say whose it is.");
        return true;
    }
    if (!source.group->serve(connection, fMaxConnections())) {
        fRefused.refuse(std::move(connection));
    }
    return true;
}

void Acceptor::run()
{
    bool listening = true;
    for (std::vector<bool> ready; waitForWork(listening, ready);) {
        listening = true;
        for (std::size_t i = 0; i < fSources.size(); ++i) {
            if (ready[i] && !accept(fSources[i])) {
                listening = false;
            }
        }
        fRefused.expire();
    }
    fSources.clear();
}

} // namespace Pegasus::server
