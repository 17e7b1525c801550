// SPDX-License-Identifier: MIT
#pragma once

#include <cstdlib>
#include <string>

namespace test {

// Returns: the folder of recorded answers: the environment variable VRX_VECTORS_DIR names one in place of the one that
//     was given to CMake; empty when there is none.
inline std::string vectorsFolder(const char* configured)
{
    const char* other = std::getenv("VRX_VECTORS_DIR");
    return other ? other : configured;
}

} // namespace test
