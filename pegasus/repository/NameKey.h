#pragma once

#include "pegasus/repository/CimError.h"

#include <Pegasus/Common/CIMName.h>

#include <string>

// Names compare without regard to the case of ASCII letters. Maps, caches and path keys look them up by one text for
// all spellings of a name.
namespace Pegasus::repository {

inline std::string foldCase(std::string text)
{
    for (char& c : text) {
        if (c >= 'A' && c <= 'Z') {
            c = static_cast<char>(c - 'A' + 'a');
        }
    }
    return text;
}

// Returns: the key of a name; empty for a null name.
inline std::string nameKey(const CIMName& name)
{
    return foldCase(utf8(name));
}

inline std::string nameKey(const CIMNamespaceName& name)
{
    return foldCase(utf8(name.getString()));
}

} // namespace Pegasus::repository
