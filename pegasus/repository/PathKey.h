#pragma once

#include <Pegasus/Common/CIMObjectPath.h>

#include <string>

namespace Pegasus::repository {

// Instances are stored under one text for all paths that are equal (DSP0004): case of names, order of keys and
// spelling of numbers do not matter. The path's own host and namespace are left out.
// Returns: that text.
// Throws: Pegasus::Exception for a reference key that is not a path.
std::string pathKey(const CIMObjectPath& path);

} // namespace Pegasus::repository
