#pragma once

#include "pegasus/repository/Repository.h"

namespace Pegasus::repository {

// Returns: the part of a resolved class that the options ask for. It shares unchanged parts with `resolved`.
CIMClass filterClass(CIMClass resolved, const ClassOptions& options);

// Returns: true when a property list asks for the name; a null list asks for all.
bool isListed(const CIMPropertyList& list, const CIMName& name);

} // namespace Pegasus::repository
