// SPDX-License-Identifier: MIT
// The names of objects in memory, as keys of maps and as text.
#pragma once

#include <host/TCIMValue.h>

#include <string>
#include <utility>
#include <vector>

namespace NKOLVRX20 {

// Returns: the name in lower case, as a map key: CIM ignores the case of names (DSP0004, 5.1.2.8).
std::string NormalizedName(const std::string& name);

// A key property's name and value.
using TKeyBinding = std::pair<std::string, TCIMValue>;

// Returns: the local instance path "Class.key1=value1,key2=\"text\"" (DSP0004, 8.2.5), with the keys in the order
// given. Booleans are TRUE and FALSE, reals have 16 decimals and an exponent, as OpenPegasus writes
// them; integers are decimal. Everything else is quoted with backslash escapes, a char16 as its character.
std::string ObjectPathText(const std::string& className, const std::vector<TKeyBinding>& keys);

} // namespace NKOLVRX20
