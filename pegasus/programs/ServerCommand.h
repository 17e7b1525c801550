#pragma once

#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace Pegasus::programs {

// What the words behind "cimserver" ask for.
struct ServerCommand
{
    enum class Action
    {
        kStart,
        kStop,
        kStatus,
        kVersion,
        kHelp
    };

    Action action = Action::kStart;
    bool foreground = false;
    std::string home; // of -D; empty: from the environment
    std::vector<std::pair<std::string, std::string>> properties;
};

// Throws: std::runtime_error, whose what() follows "cimserver not started: ".
ServerCommand parseServerCommand(const std::vector<std::string>& words);

extern const char* const kServerUsage;

} // namespace Pegasus::programs
