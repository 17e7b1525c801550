// SPDX-License-Identifier: MIT
#include "pegasus/programs/ServerCommand.h"

namespace Pegasus::programs {

const char* const kServerUsage =
    "Usage: cimserver [options] [property=value ...]\n"
    "  property=value  a configuration property for this run; cimconfig -l lists them\n"
    "  -s              stop the running server\n"
    "  --status        say whether a server runs; exit status 0 if so, else 2\n"
    "  --foreground    stay in the foreground and log to standard error too (as daemon=false)\n"
    "  -D DIR          the server's home directory (else PEGASUS_HOME, else the folder above this program's)\n"
    "  -v, --version   print the version\n"
    "  -h, --help      print this text\n";

namespace {

void addProperty(ServerCommand& command, const std::string& word)
{
    const std::size_t equals = word.find('=');
    if (equals == std::string::npos) {
        throw std::runtime_error("Unrecognized config property: " + word);
    }
    command.properties.emplace_back(word.substr(0, equals), word.substr(equals + 1));
}

void readOption(ServerCommand& command, const std::string& word)
{
    using Action = ServerCommand::Action;
    if (word == "-s") {
        command.action = Action::kStop;
    } else if (word == "--status") {
        command.action = Action::kStatus;
    } else if (word == "-v" || word == "--version") {
        command.action = Action::kVersion;
    } else if (word == "-h" || word == "--help") {
        command.action = Action::kHelp;
    } else if (word == "--foreground") {
        command.foreground = true;
    } else {
        throw std::runtime_error("Unrecognized command line option. ");
    }
}

} // namespace

ServerCommand parseServerCommand(const std::vector<std::string>& words)
{
    ServerCommand command;
    for (std::size_t i = 0; i < words.size(); ++i) {
        if (words[i] == "-D" && i + 1 < words.size()) {
            command.home = words[++i];
        } else if (!words[i].empty() && words[i][0] == '-') {
            readOption(command, words[i]);
        } else {
            addProperty(command, words[i]);
        }
    }
    return command;
}

} // namespace Pegasus::programs
