// SPDX-License-Identifier: MIT
#include "pegasus/base/PercentCoding.h"
#include "pegasus/server/operations/ConfigService.h"
#include "pegasus/server/operations/Operations.h"
#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/RequestEnvelope.h"

namespace Pegasus::server::operations {

namespace {

bool isShutdownClass(const CimRequest& request)
{
    static const CIMName kClass("PG_ShutdownService");
    static const CIMNamespaceName kNamespace("root/PG_Internal");
    return request.object.getClassName() == kClass && request.nameSpace == kNamespace;
}

CIMValue invokeShutdown(ServerCore& core, const CimRequest& request)
{
    if (CIMName(String(request.method.c_str())) != CIMName("shutdown")) {
        throw CIMException(CIM_ERR_METHOD_NOT_AVAILABLE, String(request.method.c_str()));
    }
    core.requestShutdown();
    return CIMValue(Sint32(0));
}

bool areAllTyped(const Array<CIMParamValue>& parameters)
{
    for (Uint32 i = 0; i < parameters.size(); ++i) {
        if (!parameters[i].isTyped()) {
            return false;
        }
    }
    return true;
}

// Throws: CIM_ERR_NOT_FOUND when the class is absent, CIM_ERR_INVALID_NAMESPACE.
MethodDeclaration declarationOf(ServerCore& core, const CimRequest& request)
{
    return {core.repository.getWholeClass(request.nameSpace, request.object.getClassName()),
            CIMName(String(request.method.c_str()))};
}

// Returns: the message for the provider: the client's own if every argument has its type.
std::string providerMessage(ServerCore& core, const HttpRequest& http, const CimRequest& request)
{
    if (request.arguments.size() == 0) {
        return http.body;
    }
    const MethodDeclaration declaration = declarationOf(core, request);
    declaration.warnOfDifferences(request.arguments, core.parameterWarnings);
    if (areAllTyped(request.arguments)) {
        return http.body;
    }
    const Array<CIMParamValue> typed = declaration.withTypes(request.arguments);
    return wire::encodeRequestMessage(
        "1", wire::encodeMethodCall(request.nameSpace, request.object, CIMName(String(request.method.c_str())), typed));
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
    passed.body = providerMessage(core, http, request);
    askProvider(core, *provider, passed, answer);
}

} // namespace

void invokeMethod(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer)
{
    if (!core.repository.hasClass(request.nameSpace, request.object.getClassName())) { // or CIM_ERR_INVALID_NAMESPACE
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
