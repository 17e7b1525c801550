#pragma once

#include <string>
#include <vector>

namespace Pegasus::mof {

// The first existing file of this name in the including file's directory (with its slash, or empty), the current
// directory, the include directories. An absolute name is looked for as it stands. Empty if there is none.
std::string findInclude(const std::string& name, const std::string& includingDirectory,
                        const std::vector<std::string>& includeDirectories);

} // namespace Pegasus::mof
