#pragma once

#include <string>

namespace NKOLVRX20 {

// Returns: the name as a map key: CIM names do not tell upper from lower case (DSP0004, 5.1.2.8).
std::string NormalizedName(const std::string& name);

} // namespace NKOLVRX20
