// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/operations/ServerCore.h"

#include <functional>
#include <memory>
#include <vector>

namespace Pegasus::server {

// Instances that the server makes up itself: namespaces, and the configuration. They are made at each call.
//
// Thread: one at a time.
class ServerInstances
{
  public:
    virtual ~ServerInstances() = default;

    // Returns: null for a class other than the server's own.
    // Throws: CIM_ERR_NOT_FOUND for one of the server's own whose definition has yet to be compiled.
    static std::unique_ptr<ServerInstances> find(ServerCore& core, const CIMNamespaceName& nameSpace,
                                                 const CIMName& className);

    // Returns: the instances. Their paths have keys only.
    std::vector<CIMInstance> all(const CIMPropertyList& properties) const;
    // Throws: CIM_ERR_NOT_FOUND.
    CIMInstance get(const CIMObjectPath& path, const CIMPropertyList& properties) const;

  private:
    virtual std::vector<CIMInstance> make() const = 0;
};

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

// Throws: CIM_ERR_NOT_SUPPORTED for the classes whose instances clients only read: the server's own, and registrations.
void requireChangeable(ServerCore& core, const CIMNamespaceName& nameSpace, const CIMName& className);

} // namespace Pegasus::server
