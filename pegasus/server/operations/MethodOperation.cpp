#include "pegasus/base/PercentCoding.h"
#include "pegasus/server/operations/ConfigService.h"
#include "pegasus/server/operations/Operations.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::server::operations {

namespace {

bool isShutdownClass(const CimRequest& request)
{
    return request.object.getClassName() == CIMName("PG_ShutdownService") &&
           request.nameSpace == CIMNamespaceName("root/PG_Internal");
}

CIMValue invokeShutdown(ServerCore& core, const CimRequest& request)
{
    if (CIMName(String(request.method.c_str())) != CIMName("shutdown")) {
        throw CIMException(CIM_ERR_METHOD_NOT_AVAILABLE, String(request.method.c_str()));
    }
    core.requestShutdown();
    return CIMValue(Sint32(0));
}

void passToProvider(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer)
{
    const auto provider = core.registry.find(request.nameSpace, request.object.getClassName(), ProviderType::kMethod);
    if (!provider) {
        throw CIMException(CIM_ERR_METHOD_NOT_AVAILABLE, String(request.method.c_str()));
    }
    AgentRequest passed;
    passed.method = request.method;
    passed.object = base::percentDecoded(*http.header("CIMObject"));
    passed.body = http.body;
    const CimStatus status = core.agents.request(*provider, passed, answer);
    if (status.code != 0) {
        throw OperationFailed(status);
    }
}

} // namespace

void invokeMethod(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer)
{
    requireNamespace(core, request.nameSpace);
    if (!core.repository.hasClass(request.nameSpace, request.object.getClassName())) {
        throw CIMException(CIM_ERR_NOT_FOUND, request.object.getClassName().getString());
    }
    std::string text;
    if (isShutdownClass(request)) {
        wire::appendReturnValue(text, invokeShutdown(core, request));
    } else if (isConfigClass(request.nameSpace, request.object.getClassName())) {
        wire::appendReturnValue(text, invokeConfigMethod(core, request));
    } else {
        return passToProvider(core, http, request, answer);
    }
    answer.write(text);
}

} // namespace Pegasus::server::operations
