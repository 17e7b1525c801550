// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentPool.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/module/ProviderLibrary.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/agent/AgentMessages.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>
#include <system_error>

namespace Pegasus::server {

namespace {

constexpr std::chrono::seconds kWaitForCause{2};
constexpr std::chrono::seconds kUnloadTimeout{5};

[[noreturn]] void fail(const std::string& text)
{
    throw CIMException(CIM_ERR_FAILED, base::fromUtf8Repaired(text));
}

std::chrono::seconds backOff(unsigned deaths)
{
    if (deaths < AgentPool::kFreeRestarts) {
        return std::chrono::seconds::zero();
    }
    const unsigned doublings = std::min(deaths - AgentPool::kFreeRestarts, 10u);
    return std::min(AgentPool::kFirstBackOff * (1 << doublings), AgentPool::kLastBackOff);
}

// Throws: AgentGone; CIMException when descriptors run out.
std::shared_ptr<AgentChannel> channelTo(AgentProcess& process)
try {
    return process.takeChannel();
} catch (const std::system_error& error) { // one of the sink's would mean that the client has gone
    fail(error.what());
}

// Runs its function at the end of the scope.
class ScopeGuard
{
  public:
    explicit ScopeGuard(std::function<void()> action) : fAction(std::move(action)) {}
    ~ScopeGuard() { fAction(); }
    ScopeGuard(const ScopeGuard&) = delete;
    ScopeGuard& operator=(const ScopeGuard&) = delete;

  private:
    std::function<void()> fAction;
};

} // namespace

AgentPool::AgentPool(std::function<AgentSettings()> settings) : fMakeSettings(std::move(settings)) {}

AgentPool::~AgentPool()
{
    shutDown();
}

CimStatus AgentPool::request(const ProviderReference& provider, AgentRequest request, ElementSink& sink)
{
    if (provider.interfaceType != "CMPI") {
        fail("Provider module \"" + provider.module + "\" has the interface type " + provider.interfaceType +
             "; this server loads CMPI modules only.");
    }
    const AgentSettings settings = fMakeSettings();
    request.provider = provider.provider;
    request.library = cmpi::findProviderLibrary(settings.providerDirectories, provider.location, provider.module);
    try {
        return requestOnce(provider.module, request, sink, settings.timeout);
    } catch (const AgentGone&) {
        // It died while idle, before the request could reach it.
    }
    try {
        return requestOnce(provider.module, request, sink, settings.timeout);
    } catch (const AgentGone& error) {
        fail("Lost connection with cimprovagt \"" + provider.module + "\". " + error.what());
    }
}

CimStatus AgentPool::requestOnce(const std::string& module, const AgentRequest& request, ElementSink& sink,
                                 std::chrono::milliseconds timeout)
{
    const std::shared_ptr<AgentProcess> process = acquire(module);
    const ScopeGuard releaser([&] { release(module); });
    try {
        std::shared_ptr<AgentChannel> channel = channelTo(*process);
        CimStatus status = channel->request(request, sink, timeout);
        process->giveBack(std::move(channel));
        succeeded(module);
        return status;
    } catch (const AgentGone&) {
        process->kill();
        process->waitForEnd(base::Deadline::after(kWaitForCause));
        throw;
    } catch (const AgentLost& error) {
        lost(module, process, error.what());
    } catch (const AgentSilent&) {
        process->kill();
        lost(module, process, "ended after " + std::to_string(timeout.count() / 1000) + " s without an answer");
    }
}

// Returns: the module's running agent, started if absent; it counts as used until release().
std::shared_ptr<AgentProcess> AgentPool::acquire(const std::string& name)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (fShutDown) {
        throw CIMException(CIM_ERR_SERVER_IS_SHUTTING_DOWN, String());
    }
    Module& module = fModules[name];
    if (!module.process || !module.process->isRunning()) {
        if (Clock::now() < module.nextStart) {
            fail("The agent of provider module \"" + name + "\" ended " + std::to_string(module.deaths) +
                 " times without an answer; it is not started again yet.");
        }
        try {
            module.process = std::make_shared<AgentProcess>(name, fMakeSettings().confinement);
        } catch (const std::system_error& error) {
            fail(error.what());
        }
        Log::write(LogLevel::kInformation, "Started " + std::string(kAgentProcessName) + " \"" + name +
                                               "\" under process " + std::to_string(module.process->pid()) + ".");
    }
    ++module.running;
    return module.process;
}

void AgentPool::release(const std::string& name)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    Module& module = fModules[name];
    --module.running;
    module.lastUse = Clock::now();
}

void AgentPool::succeeded(const std::string& name)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fModules[name].deaths = 0;
}

// Reports what became of the agent; counted and logged once for all requests that it was working on.
void AgentPool::lost(const std::string& name, const std::shared_ptr<AgentProcess>& process, const std::string& reason)
{
    // An agent that broke the protocol is ended too.
    if (!process->waitForEnd(base::Deadline::after(kWaitForCause))) {
        process->kill();
    }
    process->waitForEnd(base::Deadline::after(kWaitForCause));
    const std::string cause = process->causeOfDeath();
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        if (fShutDown) {
            throw CIMException(CIM_ERR_SERVER_IS_SHUTTING_DOWN, String());
        }
        Module& module = fModules[name];
        if (module.process == process) {
            module.process.reset();
            ++module.deaths;
            module.nextStart = Clock::now() + backOff(module.deaths);
            Log::write(LogLevel::kError,
                       "A failure was detected in provider module " + name + ": " + reason + "; " + cause);
        }
    }
    const std::string output = process->lastOutput();
    fail("Lost connection with cimprovagt \"" + name + "\". " + (cause.empty() ? reason : cause) +
         (output.empty() ? "" : "; its last output: " + output));
}

void AgentPool::shutDown() noexcept
{
    std::vector<std::shared_ptr<AgentProcess>> processes;
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        fShutDown = true;
        for (auto& [name, module] : fModules) {
            if (module.process) {
                processes.push_back(std::move(module.process));
            }
        }
    }
    for (const auto& process : processes) {
        process->close(); // all at once; the destructors wait for each
    }
}

bool AgentPool::mayEnd(AgentProcess& process)
{
    try {
        std::shared_ptr<AgentChannel> channel = process.takeChannel();
        class : public ElementSink
        {
            void write(std::string_view) override {}
        } nothing;
        const CimStatus status = channel->request(makeUnloadRequest(), nothing, kUnloadTimeout);
        process.giveBack(std::move(channel));
        return status.code == 0;
    } catch (const std::exception&) { // the next real request finds out what is wrong with it
        return false;
    }
}

std::vector<AgentPool::Candidate> AgentPool::findIdle(std::chrono::milliseconds idle)
{
    std::vector<Candidate> candidates;
    const std::lock_guard<std::mutex> lock(fMutex);
    for (auto& [name, module] : fModules) {
        if (!module.process || module.running != 0 || Clock::now() < module.lastUse + idle) {
            continue;
        }
        module.lastUse = Clock::now(); // not asked again at once when it refuses
        candidates.push_back({name, module.process, module.lastUse});
    }
    return candidates;
}

// Takes the agent out of use if it is still the same and idle.
void AgentPool::retire(const Candidate& candidate)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    Module& module = fModules[candidate.module];
    if (module.process != candidate.process || module.running != 0 || module.lastUse != candidate.lastUse) {
        return;
    }
    module.process.reset();
    candidate.process->close();
    Log::write(LogLevel::kInformation, "Ended the idle agent of provider module \"" + candidate.module + "\".");
}

void AgentPool::endIdleAgents()
{
    const std::chrono::milliseconds idle = fMakeSettings().idle;
    if (idle.count() == 0) {
        return;
    }
    for (const Candidate& candidate : findIdle(idle)) {
        if (mayEnd(*candidate.process)) {
            retire(candidate);
        }
    }
}

} // namespace Pegasus::server
