#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"

#include <Pegasus/Common/CIMName.h>

#include <string>

// Names compare without regard to the case of ASCII letters. Maps, caches and path keys look them up by one text for
// all spellings of a name.
namespace Pegasus::repository {

// Returns: the key of a name; empty for a null name.
inline std::string nameKey(const CIMName& name)
{
    return base::foldCase(base::utf8(name));
}

inline std::string nameKey(const CIMNamespaceName& name)
{
    return base::foldCase(base::utf8(name));
}

} // namespace Pegasus::repository
