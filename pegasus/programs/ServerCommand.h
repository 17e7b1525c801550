// SPDX-License-Identifier: MIT
#pragma once

#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace Pegasus::programs {

// What the arguments of cimserver ask for.
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

// Throws: std::runtime_error whose what() follows "cimserver not started: ".
ServerCommand parseServerCommand(const std::vector<std::string>& words);

extern const char* const kServerUsage;

// "cimserver -s": asks the server that holds the tree at `home` to end and waits until its process has ended; ends it
// by force when it stays silent. Prints what the caller should know. Returns: the exit status. Throws:
// std::system_error when reading the tree's lock file fails. Blocks: for the server's shutdown time, and as long
// again.
int stopServer(const std::string& home);

} // namespace Pegasus::programs
