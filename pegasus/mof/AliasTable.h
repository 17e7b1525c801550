// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"

#include <Pegasus/Common/CIMObjectPath.h>

#include <map>
#include <string>

namespace Pegasus::mof {

// The instance (or class) paths for which the aliases of one compilation stand. Names match in any case.
class AliasTable
{
  public:
    // Returns: the path, or null while the alias is undefined.
    // Ownership: the table's; the path stays valid as long as the table.
    const CIMObjectPath* find(const std::string& name) const
    {
        const auto found = fPaths.find(base::foldCase(name));
        return found == fPaths.end() ? nullptr : &found->second;
    }

    // Returns: false when the name is defined already; that definition stays.
    bool define(const std::string& name, const CIMObjectPath& path)
    {
        return fPaths.emplace(base::foldCase(name), path).second;
    }

  private:
    std::map<std::string, CIMObjectPath> fPaths; // by folded name
};

} // namespace Pegasus::mof
