// SPDX-License-Identifier: MIT
#pragma once

#include <cstdlib>

namespace fuzz {

// Ends the run, which reports the input, unless the condition holds.
inline void require(bool holds)
{
    if (!holds) {
        std::abort();
    }
}

} // namespace fuzz
