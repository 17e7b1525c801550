// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentMessages.h"

#include "pegasus/base/Text.h"
#include "pegasus/wire/RequestEnvelope.h"

namespace Pegasus::server {

const char* const kUnloadMethod = "PG_Unload";

namespace {

AgentRequest makeRequest(wire::IntrinsicCall& call)
{
    AgentRequest request;
    request.method = call.method();
    request.object = base::utf8(call.nameSpace());
    request.body = wire::encodeRequestMessage("1", call.finish());
    return request;
}

} // namespace

AgentRequest passedOn(const HttpRequest& http, const CimRequest& request)
{
    AgentRequest passed;
    passed.method = request.method;
    passed.object = base::utf8(request.nameSpace);
    passed.body = http.body;
    return passed;
}

AgentRequest makeEnumerateInstancesRequest(const CIMNamespaceName& nameSpace, const CIMName& className,
                                           const CIMPropertyList& properties)
{
    return makeRequest(wire::IntrinsicCall("EnumerateInstances", nameSpace)
                           .className("ClassName", className)
                           .propertyList(properties));
}

AgentRequest makeEnumerateInstanceNamesRequest(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    return makeRequest(wire::IntrinsicCall("EnumerateInstanceNames", nameSpace).className("ClassName", className));
}

AgentRequest makeGetInstanceRequest(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                    const CIMPropertyList& properties)
{
    return makeRequest(wire::IntrinsicCall("GetInstance", nameSpace).instanceName(path).propertyList(properties));
}

AgentRequest makeModifyInstanceRequest(const CIMNamespaceName& nameSpace, const CIMInstance& modified,
                                       const CIMPropertyList& properties)
{
    return makeRequest(
        wire::IntrinsicCall("ModifyInstance", nameSpace).modifiedInstance(modified).propertyList(properties));
}

AgentRequest makeUnloadRequest()
{
    wire::IntrinsicCall call(kUnloadMethod, CIMNamespaceName("root"));
    return makeRequest(call);
}

} // namespace Pegasus::server
