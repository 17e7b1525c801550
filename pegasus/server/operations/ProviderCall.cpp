#include "pegasus/server/operations/ProviderCall.h"

#include "pegasus/base/Text.h"

namespace Pegasus::server {

void askProvider(ServerCore& core, const ProviderReference& provider, const AgentRequest& request, ElementSink& sink)
{
    const CimStatus status = core.agents.request(provider, request, sink);
    if (status.code != 0) {
        throw OperationFailed(status);
    }
}

AgentRequest passedOn(const HttpRequest& http, const CimRequest& request)
{
    AgentRequest passed;
    passed.method = request.method;
    passed.object = base::utf8(request.nameSpace);
    passed.body = http.body;
    return passed;
}

} // namespace Pegasus::server
