// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/agent/AgentChannel.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMPropertyList.h>

namespace Pegasus::server {

// Requests that the server makes for agents itself. A client's GetInstance, CreateInstance, ModifyInstance and
// DeleteInstance are passed on as they came, and its method calls too if every parameter comes with its type.
// Thread: any.

// A client's intrinsic request as it came.
AgentRequest passedOn(const HttpRequest& http, const CimRequest& request);

// EnumerateInstances, with everything that the provider has, of one class alone.
AgentRequest makeEnumerateInstancesRequest(const CIMNamespaceName& nameSpace, const CIMName& className,
                                           const CIMPropertyList& properties);
AgentRequest makeEnumerateInstanceNamesRequest(const CIMNamespaceName& nameSpace, const CIMName& className);
AgentRequest makeGetInstanceRequest(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                    const CIMPropertyList& properties);
AgentRequest makeModifyInstanceRequest(const CIMNamespaceName& nameSpace, const CIMInstance& modified,
                                       const CIMPropertyList& properties);

// Asks whether the module may be unloaded. A status other than success refuses.
AgentRequest makeUnloadRequest();
extern const char* const kUnloadMethod;

} // namespace Pegasus::server
