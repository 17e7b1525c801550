// SPDX-License-Identifier: MIT
#pragma once

#include "host/core/TUniqueFd.h"

#include <string>
#include <vector>

#include <sys/types.h>

namespace NKOLVRX20 {

// What to run.
struct TProcessRequest
{
    std::string fProgram;                  // a path, or a name to be searched in PATH
    bool fSearchPath = false;              // PATH of this process
    std::vector<std::string> fArguments;   // argv, the program's name first
    std::vector<std::string> fEnvironment; // "NAME=value"
    bool fInheritEnvironment = false;      // instead of fEnvironment
};

// Opens a close-on-exec pipe above the standard streams. Its read end is non-blocking.
// Returns: an errno, 0 for success.
int OpenPipe(TUniqueFd& readEnd, TUniqueFd& writeEnd);

// Starts a child with default signal dispositions, an empty mask, its own process group, standard input from /dev/null,
// and the two descriptors as standard output and error. The child inherits only these three.
// Returns: an errno, also of a failed exec; 0 for success, pid is then the child's.
int SpawnChild(const TProcessRequest& request, int output, int errorOutput, pid_t& pid);

} // namespace NKOLVRX20
