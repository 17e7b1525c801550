#pragma once

#include "pegasus/server/operations/ServerInstances.h"

namespace Pegasus::server {

// Two classes whose instances are the namespaces: __Namespace, which every namespace has without a declaration, with
// those below the one that is asked; and CIM_Namespace in root/PG_InterOp, where clients of other makers look, with
// all.

// Returns: whether the class is __Namespace.
bool isNamespaceClass(const CIMName& className);

// Returns: null for other classes, and for CIM_Namespace before it is compiled.
std::unique_ptr<ServerInstances> makeNamespaceInstances(ServerCore& core, const CIMNamespaceName& nameSpace,
                                                        const CIMName& className);

// Makes the namespace that a __Namespace instance names, relative to the one it is created in; an empty name stands for
// that one itself. Returns: the instance's path. Throws: CIM_ERR_ALREADY_EXISTS, CIM_ERR_INVALID_PARAMETER.
CIMObjectPath createNamespace(ServerCore& core, const CIMNamespaceName& nameSpace, const CIMInstance& instance);

} // namespace Pegasus::server
