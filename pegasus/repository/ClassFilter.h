#pragma once

#include "pegasus/repository/Repository.h"

namespace Pegasus::repository {

// The part of a resolved class that the options ask for; shares what it can with it.
CIMClass filterClass(CIMClass resolved, const ClassOptions& options);

// Is the name asked for by a property list?
bool isListed(const CIMPropertyList& list, const CIMName& name);

} // namespace Pegasus::repository
