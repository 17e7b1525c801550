// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/operations/ServerCore.h"

// The operations of DSP0200, 5.3.2: each decodes its parameters, does its work and writes what it returns.
// Throws: CIMException; wire::XmlError for a parameter; what the sink throws.
// Thread: any.
namespace Pegasus::server::operations {

// On classes and qualifier declarations, in the repository.
void getClass(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateClasses(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateClassNames(ServerCore& core, const CimRequest& request, ElementSink& answer);
void createClass(ServerCore& core, const CimRequest& request, ElementSink& answer);
void getQualifier(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateQualifiers(ServerCore& core, const CimRequest& request, ElementSink& answer);
void setQualifier(ServerCore& core, const CimRequest& request, ElementSink& answer);

// On instances: of classes with a provider through its agent, of the server's own classes here, of the others in the
// repository.
void getInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer);
void enumerateInstances(ServerCore& core, const CimRequest& request, ElementSink& answer);
void enumerateInstanceNames(ServerCore& core, const CimRequest& request, ElementSink& answer);
void createInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer);
void modifyInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer);
void deleteInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer);
void getProperty(ServerCore& core, const CimRequest& request, ElementSink& answer);
void setProperty(ServerCore& core, const CimRequest& request, ElementSink& answer);

// A method of the server's own services, or of the class's method provider through its agent. Parameters that
// came with a type reach the provider as they were sent, and checking them is the provider's task; the others get the
// types that the class declares.
void invokeMethod(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer);

} // namespace Pegasus::server::operations
