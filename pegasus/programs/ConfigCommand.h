#pragma once

#include <stdexcept>
#include <string>
#include <vector>

namespace Pegasus::programs {

// What the words behind "cimconfig" ask for.
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

// Throws: std::runtime_error, whose what() follows "cimconfig: ".
ConfigCommand parseConfigCommand(const std::vector<std::string>& words);

extern const char* const kConfigUsage;

} // namespace Pegasus::programs
