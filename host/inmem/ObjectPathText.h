#pragma once

#include <host/TCIMValue.h>

#include <string>

namespace NKOLVRX20 {

// Returns: an instance path as text, "Class.key1=value1,key2=\"text\"", keys in byte order of their names
// (DSP0004, 8.2.5): numbers and booleans bare, everything else quoted with backslash escapes.
std::string ObjectPathText(const std::string& className, const TCIMContext& keys);

} // namespace NKOLVRX20
