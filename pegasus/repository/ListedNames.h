// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/NameIndex.h"

#include <Pegasus/Common/CIMPropertyList.h>

namespace Pegasus::repository {

// The names of a property list, which comes from a client and may be long, for many look-ups. A null list has every
// name.
class ListedNames
{
  public:
    explicit ListedNames(const CIMPropertyList& list)
        : fIsAll(list.isNull()), fNames(list.getPropertyNameArray()), fIndex(fNames)
    {
    }
    ListedNames(const ListedNames&) = delete;
    ListedNames& operator=(const ListedNames&) = delete;

    bool areAll() const { return fIsAll; }
    bool has(const CIMName& name) const { return fIsAll || fIndex.has(name); }

  private:
    bool fIsAll;
    Array<CIMName> fNames;
    NameIndex<CIMName> fIndex;
};

} // namespace Pegasus::repository
