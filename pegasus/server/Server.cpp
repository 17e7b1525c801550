#include "pegasus/server/Server.h"

#include "pegasus/base/LocalSocket.h"
#include "pegasus/server/admin/Housekeeper.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/admin/StopSignal.h"
#include "pegasus/server/admin/TreeClaim.h"
#include "pegasus/server/net/Acceptor.h"
#include "pegasus/server/net/Listener.h"
#include "pegasus/server/net/PeerCheck.h"
#include "pegasus/server/operations/Dispatcher.h"

#include <memory>
#include <mutex>
#include <system_error>

namespace Pegasus::server {

namespace {

constexpr std::chrono::seconds kGraceAfterBreak{5};
constexpr std::chrono::seconds kHousekeepingInterval{2};

Severity logLevel(const Config& config)
{
    const std::string level = config.text("logLevel");
    return level == "ERROR"     ? Severity::kError
           : level == "WARNING" ? Severity::kWarning
           : level == "DEBUG"   ? Severity::kDebug
                                : Severity::kInformation;
}

ConnectionSettings connectionSettings(const Config& config)
{
    ConnectionSettings settings;
    settings.http = {config.number("maxHeaderBytes"), config.number("maxBodyBytes")};
    settings.times = {config.seconds("idleConnectionTimeout"), config.seconds("requestReadTimeout")};
    settings.writePatience = config.seconds("socketWriteTimeout");
    settings.maxXmlDepth = config.number("maxXmlDepth");
    settings.maxBufferedAnswerBytes = config.number("maxBufferedAnswerBytes");
    return settings;
}

AgentSettings agentSettings(const Config& config)
{
    AgentSettings settings;
    settings.providerDirectories = config.directories("providerDir");
    settings.patience = config.seconds("providerTimeout");
    settings.idle = config.seconds("agentIdleTimeout");
    settings.process = {config.number("agentMemoryMegabytes"), config.flag("strictOwners")};
    return settings;
}

// Settings made from the configuration, made anew only when it has changed: they are asked for at every request.
template <typename Settings> class SettingsCache
{
  public:
    SettingsCache(const Config& config, Settings (*make)(const Config&)) : fConfig(config), fMake(make) {}

    Settings get()
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        const unsigned generation = fConfig.generation();
        if (generation != fGeneration) {
            fSettings = fMake(fConfig);
        }
        fGeneration = generation;
        return fSettings;
    }

  private:
    const Config& fConfig;
    Settings (*fMake)(const Config&);
    std::mutex fMutex;
    unsigned fGeneration = 0;
    Settings fSettings;
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

std::string repositoryPath(const Config& config)
{
    const std::string directory = config.text("repositoryDir");
    return directory[0] == '/' ? directory : config.home() + "/" + directory;
}

// The sockets that connections come in by.
struct Listeners
{
    Descriptor remote; // none when the configuration switches TCP off
    Descriptor local;

    explicit Listeners(const Config& config)
    {
        if (config.flag("enableHttpConnection")) {
            const auto port = static_cast<std::uint16_t>(config.number("httpPort"));
            remote = listenOnLoopback(port);
            Log::write(Severity::kInformation, "Listening on 127.0.0.1:" + std::to_string(port) + ".");
        }
        local = listenLocally(config.home());
    }
};

std::vector<Acceptor::Source> acceptFrom(Listeners listeners, ConnectionGroup& remote, ConnectionGroup& local)
{
    std::vector<Acceptor::Source> sources;
    if (listeners.remote) {
        const auto lookup = std::make_shared<TcpPeerLookup>();
        sources.push_back({std::move(listeners.remote), [lookup](int fd) { return lookup->userOf(fd); }, &remote});
    }
    sources.push_back({std::move(listeners.local), localPeerUser, &local});
    return sources;
}

// Running requests get their time, then agents and connections are ended under them.
void endConnections(ConnectionGroup& remote, ConnectionGroup& local, AgentPool& agents, std::chrono::seconds grace)
{
    remote.endReading();
    const Deadline deadline = Clock::now() + grace;
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
    if (!remote.waitForEnd(Clock::now() + kGraceAfterBreak) || !local.waitForEnd(Clock::now() + kGraceAfterBreak)) {
        Log::write(Severity::kError, "Requests do not end; the server ends without them.");
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
    StopSignal stop;
    // The port first: a server that cannot have it leaves the repository as it is.
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
    Log::write(Severity::kInformation, "Started CIM Server, process " + std::to_string(::getpid()) + ".");
    const Housekeeper housekeeper(kHousekeepingInterval, [&] {
        Log::setLevel(logLevel(fConfig));
        agents.endIdleAgents();
    });
    signal.ready();
    acceptor.run();
    endConnections(remote, local, agents, fConfig.seconds("shutdownTimeout"));
    Log::write(Severity::kInformation, "CIM Server stopped.");
}

} // namespace Pegasus::server
