#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/operations/ServerCore.h"

namespace Pegasus::server::operations {

// InvokeMethod: the server's own services, or the class's method provider through its agent. Parameters reach a
// provider as they were sent; checking them is the provider's. Throws: CIMException; what the sink throws.
void invokeMethod(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer);

} // namespace Pegasus::server::operations
