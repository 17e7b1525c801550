// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/operations/ServerCore.h"

#include <utility>
#include <vector>

namespace Pegasus::server {

// Where the instances of a class and its subclasses come from: some classes have providers, those of the others are
// stored. Made for one request.
//
// Thread: one at a time.
class InstanceSources
{
  public:
    // Requires: the core outlives this. Throws: CIM_ERR_INVALID_CLASS.
    InstanceSources(const ServerCore& core, const CIMNamespaceName& nameSpace, const CIMName& className);

    // The classes with a provider, the named one first if it has one.
    const std::vector<std::pair<CIMName, ProviderReference>>& provided() const { return fProvided; }
    bool isProvided(const CIMName& className) const;

    // Returns: the property list for the providers. When deep inheritance is off, all instances are cut
    // down to the named class's properties.
    CIMPropertyList properties(const repository::InstanceOptions& options) const;

  private:
    const ServerCore& fCore;
    CIMNamespaceName fNameSpace;
    CIMName fClassName;
    std::vector<std::pair<CIMName, ProviderReference>> fProvided;
};

} // namespace Pegasus::server
