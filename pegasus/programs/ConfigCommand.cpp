// SPDX-License-Identifier: MIT
#include "pegasus/programs/ConfigCommand.h"

#include <optional>

namespace Pegasus::programs {

const char* const kConfigUsage =
    "Usage: cimconfig -s NAME=VALUE [-c] [-p]   set a property\n"
    "       cimconfig -u NAME [-c] [-p]         set a property back to its default\n"
    "       cimconfig -g NAME [-c] [-p] [-d]    print a property's value\n"
    "       cimconfig -l [-c | -p]              list the properties: name, default and meaning, or name=value\n"
    "  -c  the running server's current value (what is meant when nothing is given)\n"
    "  -p  the planned value, which the next server takes over; needs no running server\n"
    "  -d  the default\n"
    "  --version, --help\n";

namespace {

using Action = ConfigCommand::Action;

std::optional<Action> actionOf(const std::string& word)
{
    if (word == "-s") {
        return Action::kSet;
    }
    if (word == "-u") {
        return Action::kReset;
    }
    if (word == "-g") {
        return Action::kGet;
    }
    if (word == "-l") {
        return Action::kList;
    }
    if (word == "--version") {
        return Action::kVersion;
    }
    if (word == "-h" || word == "--help") {
        return Action::kHelp;
    }
    return std::nullopt;
}

bool takesArgument(Action action)
{
    return action == Action::kSet || action == Action::kReset || action == Action::kGet;
}

void readArgument(ConfigCommand& command, const std::string& option, const std::string& argument)
{
    const std::size_t equals = argument.find('=');
    if ((command.action == Action::kSet) != (equals != std::string::npos) || equals == 0 || argument.empty()) {
        throw std::runtime_error("argument \"" + argument + "\" is not valid for option \"" + option + "\"");
    }
    command.name = argument.substr(0, equals);
    if (equals != std::string::npos) {
        command.value = argument.substr(equals + 1);
    }
}

bool readFlag(ConfigCommand& command, const std::string& word)
{
    bool* const flag = word == "-c"   ? &command.current
                       : word == "-p" ? &command.planned
                       : word == "-d" ? &command.defaults
                                      : nullptr;
    if (flag != nullptr) {
        *flag = true;
    }
    return flag != nullptr;
}

} // namespace

ConfigCommand parseConfigCommand(const std::vector<std::string>& words)
{
    ConfigCommand command;
    bool chosen = false;
    for (std::size_t i = 0; i < words.size(); ++i) {
        if (readFlag(command, words[i])) {
            continue;
        }
        const std::optional<Action> action = actionOf(words[i]);
        if (!action) {
            throw std::runtime_error("Unknown flag " + words[i]);
        }
        if (chosen) {
            throw std::runtime_error("option \"" + words[i] + "\" cannot be combined with the one before it");
        }
        chosen = true;
        command.action = *action;
        if (!takesArgument(*action)) {
            continue;
        }
        if (i + 1 == words.size()) {
            throw std::runtime_error("missing argument for option \"" + words[i] + "\"");
        }
        readArgument(command, words[i], words[i + 1]);
        ++i;
    }
    if (!chosen) {
        throw std::runtime_error("Required arguments missing.");
    }
    return command;
}

} // namespace Pegasus::programs
