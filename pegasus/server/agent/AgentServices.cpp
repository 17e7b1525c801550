// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentServices.h"

#include "pegasus/server/admin/Log.h"

namespace Pegasus::server {

namespace {

constexpr Uint32 kUpcallTimeoutMs = 600'000;
constexpr std::size_t kMaxIdleClients = 4;

} // namespace

std::unique_ptr<CIMClient> AgentServices::takeClient()
{
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        if (!fIdle.empty()) {
            std::unique_ptr<CIMClient> client = std::move(fIdle.back());
            fIdle.pop_back();
            return client;
        }
    }
    auto client = std::make_unique<CIMClient>();
    client->setTimeout(kUpcallTimeoutMs);
    client->connectLocal();
    return client;
}

void AgentServices::giveBack(std::unique_ptr<CIMClient> client)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (fIdle.size() < kMaxIdleClients) {
        fIdle.push_back(std::move(client));
    }
}

template <typename Call> auto AgentServices::withClient(const Call& call)
{
    std::unique_ptr<CIMClient> client = takeClient();
    try {
        if constexpr (std::is_void_v<decltype(call(*client))>) {
            call(*client);
            giveBack(std::move(client));
        } else {
            auto result = call(*client);
            giveBack(std::move(client));
            return result;
        }
    } catch (const CIMException&) {
        giveBack(std::move(client));
        throw;
    }
}

CIMClass AgentServices::getClass(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    return withClient([&](CIMClient& client) { return client.getClass(nameSpace, className, false, true, false); });
}

CIMInstance AgentServices::getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                       const CIMPropertyList& properties)
{
    return withClient(
        [&](CIMClient& client) { return client.getInstance(nameSpace, path, false, false, false, properties); });
}

Array<CIMInstance> AgentServices::enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                     const CIMPropertyList& properties)
{
    return withClient([&](CIMClient& client) {
        return client.enumerateInstances(nameSpace, className, true, false, false, false, properties);
    });
}

Array<CIMObjectPath> AgentServices::enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    return withClient([&](CIMClient& client) { return client.enumerateInstanceNames(nameSpace, className); });
}

CIMValue AgentServices::invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                     const CIMName& method, const Array<CIMParamValue>& in, Array<CIMParamValue>& out)
{
    return withClient([&](CIMClient& client) { return client.invokeMethod(nameSpace, path, method, in, out); });
}

CIMObjectPath AgentServices::createInstance(const CIMNamespaceName& nameSpace, const CIMInstance& instance)
{
    return withClient([&](CIMClient& client) { return client.createInstance(nameSpace, instance); });
}

void AgentServices::modifyInstance(const CIMNamespaceName& nameSpace, const CIMInstance& instance,
                                   const CIMPropertyList& properties)
{
    withClient([&](CIMClient& client) { client.modifyInstance(nameSpace, instance, false, properties); });
}

void AgentServices::deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path)
{
    withClient([&](CIMClient& client) { client.deleteInstance(nameSpace, path); });
}

void AgentServices::log(Severity severity, const std::string& text) noexcept
try {
    static_assert(static_cast<int>(Severity::kDebug) == static_cast<int>(LogLevel::kDebug));
    Log::write(static_cast<LogLevel>(severity), "provider module \"" + fModule + "\": " + text);
} catch (...) { // out of memory
}

} // namespace Pegasus::server
