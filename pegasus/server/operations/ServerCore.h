// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/Repository.h"
#include "pegasus/server/admin/Config.h"
#include "pegasus/server/agent/AgentPool.h"
#include "pegasus/server/operations/MethodParameters.h"
#include "pegasus/server/operations/ProviderRegistry.h"

#include <functional>

namespace Pegasus::server {

// What the operations work on. One per server; it outlives every connection.
// Thread: any; each part is safe by itself.
struct ServerCore
{
    Config& config;
    repository::Repository& repository;
    ProviderRegistry& registry;
    AgentPool& agents;
    std::function<void()> requestShutdown; // returns at once; the server ends when its answers have gone out
    ParameterWarnings parameterWarnings = {};
};

// Throws: CIM_ERR_INVALID_NAMESPACE.
inline void requireNamespace(const ServerCore& core, const CIMNamespaceName& nameSpace)
{
    if (!core.repository.hasNamespace(nameSpace)) {
        throw CIMException(CIM_ERR_INVALID_NAMESPACE, nameSpace.getString());
    }
}

// Sends a request to the agent of a class's provider, and its answer's elements to the sink.
// Throws: OperationFailed with the provider's status; what AgentPool::request() throws.
// Blocks: as AgentPool::request().
inline void askProvider(ServerCore& core, const ProviderReference& provider, const AgentRequest& request,
                        ElementSink& sink)
{
    const CimStatus status = core.agents.request(provider, request, sink);
    if (status.code != 0) {
        throw OperationFailed(status);
    }
}

} // namespace Pegasus::server
