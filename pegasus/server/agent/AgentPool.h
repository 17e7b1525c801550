// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/agent/AgentProcess.h"

#include <functional>
#include <map>

namespace Pegasus::server {

// Which provider serves a class in a namespace.
struct ProviderReference
{
    std::string module;
    std::string provider;
    std::string location;      // of the module's library: lib<location>.so
    std::string interfaceType; // "CMPI" or "C++Default"
};

// Pool settings, read again on every use.
struct AgentSettings
{
    std::vector<std::string> providerDirectories;
    std::chrono::milliseconds timeout = std::chrono::minutes(10); // of a provider's silence
    std::chrono::milliseconds idle = std::chrono::minutes(5);     // until an idle agent is ended; 0: never
    AgentConfinement confinement;
};

// The agents, one a provider module: started at a module's first request, ended when idle, started again after a crash.
//
// After kFreeRestarts deaths of a module's agent without a good answer between them, requests fail at once for a time
// that doubles with each further death.
//
// Thread: any.
class AgentPool
{
  public:
    static constexpr unsigned kFreeRestarts = 3;
    static constexpr std::chrono::seconds kFirstBackOff{1};
    static constexpr std::chrono::seconds kLastBackOff{60};

    explicit AgentPool(std::function<AgentSettings()> settings);
    // Ends all agents. Requires: all requests have ended.
    ~AgentPool();
    AgentPool(const AgentPool&) = delete;
    AgentPool& operator=(const AgentPool&) = delete;

    // Carries a request to the provider's agent and its answer's elements to the sink. `request.provider` and
    // `request.library` are filled in here.
    // Returns: the status that the provider gave.
    // Throws: CIMException with CIM_ERR_FAILED and a text that names module and cause: the module is of another
    // interface type than CMPI, its library is missing, the agent is lost or silent; what the sink throws.
    // Blocks: as long as the provider keeps sending, and for the timeout of its silence.
    CimStatus request(const ProviderReference& provider, AgentRequest request, ElementSink& sink);

    // Makes every running and future request fail. Blocks: for the grace period of agents that hang.
    void shutDown() noexcept;

    // Ends the agents that have been idle for long enough. To be called now and then.
    void endIdleAgents();

  private:
    using Clock = base::Deadline::Clock;

    struct Module
    {
        std::shared_ptr<AgentProcess> process;
        unsigned running = 0;
        unsigned deaths = 0; // without a good answer between them
        Clock::time_point nextStart = Clock::time_point::min();
        Clock::time_point lastUse;
    };

    struct Candidate
    {
        std::string module;
        std::shared_ptr<AgentProcess> process;
        Clock::time_point lastUse;
    };

    // Throws: AgentGone, besides what request() throws.
    CimStatus requestOnce(const std::string& module, const AgentRequest& request, ElementSink& sink,
                          std::chrono::milliseconds timeout);
    std::shared_ptr<AgentProcess> acquire(const std::string& module);
    void release(const std::string& module);
    void succeeded(const std::string& module);
    [[noreturn]] void lost(const std::string& module, const std::shared_ptr<AgentProcess>& process,
                           const std::string& reason);
    std::vector<Candidate> findIdle(std::chrono::milliseconds idle);
    bool mayEnd(AgentProcess& process);
    void retire(const Candidate& candidate);

    std::function<AgentSettings()> fMakeSettings;
    std::mutex fMutex;
    std::map<std::string, Module> fModules;
    bool fShutDown = false;
};

} // namespace Pegasus::server
