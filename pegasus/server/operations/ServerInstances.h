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

// Throws: CIM_ERR_NOT_SUPPORTED for the classes whose instances clients only read: the server's own, and registrations.
void requireChangeable(ServerCore& core, const CIMNamespaceName& nameSpace, const CIMName& className);

} // namespace Pegasus::server
