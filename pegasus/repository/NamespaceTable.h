// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/Storage.h"

#include <Pegasus/Common/CIMName.h>

#include <map>
#include <string>
#include <vector>

namespace Pegasus::repository {

// The namespaces, held in memory and written through. Errors and limits: see Repository.
// Thread: one thread at a time.
class NamespaceTable
{
  public:
    // Creates root if it is missing.
    // Requires: `storage` outlives the table.
    NamespaceTable(Storage& storage, std::size_t maxCount);

    NamespaceId id(const CIMNamespaceName& name) const;
    bool has(const CIMNamespaceName& name) const;
    // Returns: the names in order of creation.
    std::vector<CIMNamespaceName> list() const;
    void create(const CIMNamespaceName& name);

  private:
    Storage& fStorage;
    std::size_t fMaxCount;
    std::map<std::string, NamespaceId> fIds; // by name key
    std::map<NamespaceId, CIMNamespaceName> fNames;
};

} // namespace Pegasus::repository
