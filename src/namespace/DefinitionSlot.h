#pragma once

#include "src/common/CoreLog.h"
#include "src/namespace/TPEGASUSNamespace.h"

#include <host/TVRXException.h>

#include <boost/shared_ptr.hpp>

#include <map>
#include <string>

namespace NKOLVRX20 {

// Finds the place of a named definition in a map that is keyed by normalised names.
// Returns: the place; it holds null when the name is new, else the definition to be replaced.
// Throws: TVRXException 25 for a bad name; 16, after a log line, when the name is taken and may not be replaced.
template <typename TDefinition>
boost::shared_ptr<TDefinition>& DefinitionSlot(std::map<std::string, boost::shared_ptr<TDefinition>>& definitions,
                                               const std::string& name, bool mayReplace, const char* kindText)
{
    const std::string key = TPEGASUSNamespace::NormalizeName(name);
    if (!mayReplace && definitions.count(key) != 0) {
        LogProgress(kindText, name, " already defined");
        throw TVRXException(TVRXStatusCode::kAlreadyExists);
    }
    return definitions[key];
}

} // namespace NKOLVRX20
