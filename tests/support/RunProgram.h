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

// Runs a program to its end. environment holds "NAME=value" entries that come on top of this process's own.
// A daemon that the program leaves behind does not hold the call up, even if it keeps the output open.
// Throws std::runtime_error if the program cannot be started or does not end in time (it is killed then).
ProgramResult runProgram(const std::vector<std::string>& arguments, const std::vector<std::string>& environment,
                         std::chrono::milliseconds limit = std::chrono::seconds(60));

} // namespace test
