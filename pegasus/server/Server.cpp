// SPDX-License-Identifier: MIT
#include "pegasus/server/Server.h"

#include "pegasus/base/LocalSocket.h"
#include "pegasus/base/TcpOwner.h"
#include "pegasus/server/ServerSettings.h"
#include "pegasus/server/admin/ConfigFile.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/admin/StopSignal.h"
#include "pegasus/server/admin/TreeClaim.h"
#include "pegasus/server/net/Acceptor.h"
#include "pegasus/server/net/Listener.h"
#include "pegasus/server/operations/Dispatcher.h"

#include <condition_variable>
#include <functional>
#include <memory>
#include <mutex>
#include <thread>

namespace Pegasus::server {

namespace {

constexpr std::chrono::seconds kGraceAfterBreak{5};
constexpr std::chrono::seconds kHousekeepingInterval{2};

// Calls a function at an interval, on a thread of its own, as long as it exists.
class Housekeeper
{
  public:
    explicit Housekeeper(std::function<void()> work)
    {
        fThread = std::thread([this, call = std::move(work)] {
            std::unique_lock<std::mutex> lock(fMutex);
            while (!fChanged.wait_for(lock, kHousekeepingInterval, [&] { return fEnded; })) {
                lock.unlock();
                call();
                lock.lock();
            }
        });
    }
    // Blocks: until a running call has returned.
    ~Housekeeper()
    {
        {
            const std::lock_guard<std::mutex> lock(fMutex);
            fEnded = true;
        }
        fChanged.notify_all();
        fThread.join();
    }
    Housekeeper(const Housekeeper&) = delete;
    Housekeeper& operator=(const Housekeeper&) = delete;

  private:
    std::mutex fMutex;
    std::condition_variable fChanged;
    bool fEnded = false;
    std::thread fThread;
};

// Removes the local socket when the server ends.
class LocalSocketFile
{
  public:
    explicit LocalSocketFile(const std::string& home) : fHome(home) {}
    ~LocalSocketFile() { base::removeLocalSocket(fHome); }
    LocalSocketFile(const LocalSocketFile&) = delete;
    LocalSocketFile& operator=(const LocalSocketFile&) = delete;

  private:
    std::string fHome;
};

// The sockets that connections come in by.
struct Listeners
{
    base::Descriptor remote; // empty when the configuration switches TCP off
    base::Descriptor local;

    explicit Listeners(const Config& config)
    {
        if (config.flag("enableHttpConnection")) {
            const auto port = static_cast<std::uint16_t>(config.number("httpPort"));
            remote = listenOnLoopback(port);
            Log::write(LogLevel::kInformation, "Listening on 127.0.0.1:" + std::to_string(port) + ".");
        }
        local = listenLocally(config.home());
    }
};

std::vector<Acceptor::Source> acceptFrom(Listeners listeners, ConnectionGroup& remote, ConnectionGroup& local)
{
    std::vector<Acceptor::Source> sources;
    if (listeners.remote) {
        const auto lookup = std::make_shared<base::TcpOwnerLookup>();
        sources.push_back({std::move(listeners.remote), [lookup](int fd) { return lookup->userOf(fd); }, &remote});
    }
    sources.push_back({std::move(listeners.local), localPeerUser, &local});
    return sources;
}

// Running requests get their time, then agents and connections are ended under them.
void endConnections(ConnectionGroup& remote, ConnectionGroup& local, AgentPool& agents, std::chrono::seconds grace)
{
    remote.endReading();
    const base::Deadline deadline = base::Deadline::after(grace);
    const bool remoteEnded = remote.waitForEnd(deadline);
    // Agents call back over local connections as long as they work for remote ones.
    local.endReading();
    const bool localEnded = local.waitForEnd(deadline);
    agents.shutDown();
    if (remoteEnded && localEnded) {
        return;
    }
    remote.breakAll();
    local.breakAll();
    if (!remote.waitForEnd(base::Deadline::after(kGraceAfterBreak)) ||
        !local.waitForEnd(base::Deadline::after(kGraceAfterBreak)))
    {
        Log::write(LogLevel::kError, "Requests do not end; the server ends without them.");
        base::removeLocalSocket(defaultHome());
        ::_exit(1);
    }
}

} // namespace

void Server::run(LaunchSignal& signal)
{
    TreeClaim claim;
    claim.take(fConfig);
    Log::open(fConfig.home(), !fConfig.flag("daemon"));
    Log::setLevel(logLevel(fConfig));
    for (const std::string& value : fConfig.ignored()) {
        Log::write(LogLevel::kWarning, "Ignored " + value + " in " + plannedConfigPath(fConfig.home()) +
                                           ": no such property, or no such value; cimconfig -l lists them.");
    }
    StopSignal stop;
    // The port first: a server that fails to get it leaves the repository as it is.
    const LocalSocketFile socketFile(fConfig.home());
    Listeners listeners(fConfig);
    repository::Repository repository(repositoryPath(fConfig));
    ProviderRegistry registry(repository);
    SettingsCache<AgentSettings> agentCache(fConfig, agentSettings);
    AgentPool agents([&] { return agentCache.get(); });
    ServerCore core = {fConfig, repository, registry, agents, [&] { stop.raise(); }};
    Dispatcher dispatcher(core);
    SettingsCache<ConnectionSettings> connectionCache(fConfig, connectionSettings);
    const auto settings = [&] { return connectionCache.get(); };
    ConnectionGroup remote(dispatcher, settings);
    ConnectionGroup local(dispatcher, settings);
    Acceptor acceptor(acceptFrom(std::move(listeners), remote, local), stop.fd(),
                      [&] { return fConfig.number("maxConnections"); });
    claim.announce(repositoryPath(fConfig));
    Log::write(LogLevel::kInformation, "Started CIM Server, process " + std::to_string(::getpid()) + ".");
    const Housekeeper housekeeper([&] {
        Log::setLevel(logLevel(fConfig));
        agents.endIdleAgents();
    });
    signal.ready();
    acceptor.run();
    endConnections(remote, local, agents, fConfig.seconds("shutdownTimeout"));
    Log::write(LogLevel::kInformation, "CIM Server stopped.");
}

} // namespace Pegasus::server
