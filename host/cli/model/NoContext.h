// SPDX-License-Identifier: MIT
#pragma once

#include <host/TCIMValue.h>

namespace vrxhost {

// The call options of a question without any.
inline const NKOLVRX20::TCIMContext kNoContext;

} // namespace vrxhost
