#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/operations/ServerCore.h"

namespace Pegasus::server {

// Sends a request to the agent of a class's provider, and its answer's elements to the sink.
// Throws: OperationFailed with the provider's status; what AgentPool::request() throws.
// Blocks: as AgentPool::request(). Thread: any.
void askProvider(ServerCore& core, const ProviderReference& provider, const AgentRequest& request, ElementSink& sink);

// Returns: a client's intrinsic request, to be passed on as it came.
AgentRequest passedOn(const HttpRequest& http, const CimRequest& request);

} // namespace Pegasus::server
