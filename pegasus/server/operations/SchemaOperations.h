#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/operations/ServerCore.h"

namespace Pegasus::server::operations {

// Operations on classes and qualifier declarations (DSP0200, 5.3.2). Each decodes its parameters, does its work on the
// repository and writes what it returns.
// Throws: CIMException, wire::XmlError.
void getClass(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateClasses(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateClassNames(ServerCore& core, const CimRequest& request, ElementSink& answer);
void createClass(ServerCore& core, const CimRequest& request, ElementSink& answer);
void getQualifier(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateQualifiers(ServerCore& core, const CimRequest& request, ElementSink& answer);
void setQualifier(ServerCore& core, const CimRequest& request, ElementSink& answer);

} // namespace Pegasus::server::operations
