// SPDX-License-Identifier: MIT
#pragma once

#include <cmpi/cmpi.h>

#include <cstdarg>
#include <string>

namespace Pegasus::cmpi {

// Puts the arguments, `count` pairs of (int type code, value), in the place of "$0", "$1", ... of a provider's message.
// Small integers arrive as int and reals as double, as C passes them. Null text gives "".
// Requires: `args` is open and holds that many pairs.
std::string formatMessage(const char* text, CMPICount count, va_list args);

} // namespace Pegasus::cmpi
