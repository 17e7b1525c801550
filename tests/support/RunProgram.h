// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <string>
#include <vector>

namespace test {

// How a child process ended and what it wrote.
struct ProgramResult
{
    int exitStatus = -1; // -1 if a signal ended it
    int signal = 0;      // the signal that ended it
    std::string out;
    std::string err;
};

// Runs a program to its end. `environment` holds "NAME=value" entries that are added to this process's environment and
// replace entries of the same name. The call returns when the program ends, even while a daemon that it started keeps
// its output open.
// Throws: std::runtime_error when the program fails to start, or exceeds the limit and is killed.
ProgramResult runProgram(const std::vector<std::string>& arguments, const std::vector<std::string>& environment,
                         std::chrono::milliseconds limit = std::chrono::seconds(60));

} // namespace test
