// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>

#include <string>

// Maps, caches and tables look names and paths up by one text for all their spellings.
namespace Pegasus::repository {

// Returns: the key of a name, in lower case; empty for a null name.
inline std::string nameKey(const CIMName& name)
{
    return base::foldCase(base::utf8(name));
}

inline std::string nameKey(const CIMNamespaceName& name)
{
    return base::foldCase(base::utf8(name));
}

// Returns: the key of an instance's path. Paths are equal (DSP0004) whatever the case of names, the order of keys and
//     the spelling of numbers. The path's own host and namespace are left out.
// Throws: Pegasus::Exception for a reference key that holds a malformed path.
std::string pathKey(const CIMObjectPath& path);

} // namespace Pegasus::repository
