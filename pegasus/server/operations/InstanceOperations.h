#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/operations/ServerCore.h"

namespace Pegasus::server::operations {

// Operations on instances (DSP0200, 5.3.2): of classes with a provider through its agent, of the others in the
// repository, of the server's own ones here.
// Throws: CIMException, wire::XmlError; what the sink throws.
void getInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer);
void enumerateInstances(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateInstanceNames(ServerCore& core, const CimRequest& request, ElementSink& answer);
void createInstance(ServerCore& core, const CimRequest& request, ElementSink& answer);

} // namespace Pegasus::server::operations
