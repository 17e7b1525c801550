// SPDX-License-Identifier: MIT
#pragma once

#include <stdexcept>
#include <string>
#include <vector>

namespace Pegasus::programs {

// What the arguments of cimconfig ask for.
struct ConfigCommand
{
    enum class Action
    {
        kSet,
        kReset,
        kGet,
        kList,
        kVersion,
        kHelp
    };

    Action action = Action::kList;
    std::string name;
    std::string value;
    bool current = false;
    bool planned = false;
    bool defaults = false; // -g -d
};

// Throws: std::runtime_error whose what() follows "cimconfig: ".
ConfigCommand parseConfigCommand(const std::vector<std::string>& words);

extern const char* const kConfigUsage;

// Carry a command out, on the running server for current values and on the planned file for planned ones, and print the
// outcome.
// Returns: the exit status.
// Throws: Pegasus::Exception, std::system_error. Blocks: for a minute when the server stays silent.
int setProperty(const ConfigCommand& command, const std::string& home);
int getProperty(const ConfigCommand& command, const std::string& home);
int listProperties(const ConfigCommand& command, const std::string& home);

} // namespace Pegasus::programs
