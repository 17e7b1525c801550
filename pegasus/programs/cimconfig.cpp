// SPDX-License-Identifier: MIT
// Shows and changes the private server's configuration.
#include "pegasus/base/Text.h"
#include "pegasus/programs/ConfigCommand.h"
#include "pegasus/server/admin/ConfigFile.h"
#include "pegasus/server/admin/Daemon.h"

#include <Pegasus/Common/Exception.h>

#include <cstdlib>
#include <iostream>

using namespace Pegasus;
using programs::ConfigCommand;

namespace {

int run(const ConfigCommand& command)
{
    const std::string home = server::defaultHome();
    ::setenv("PEGASUS_HOME", home.c_str(), 1); // for the client library
    switch (command.action) {
    case ConfigCommand::Action::kSet:
    case ConfigCommand::Action::kReset:
        return programs::setProperty(command, home);
    case ConfigCommand::Action::kGet:
        return programs::getProperty(command, home);
    case ConfigCommand::Action::kList:
        return programs::listProperties(command, home);
    case ConfigCommand::Action::kVersion:
        std::cout << VRX_VERSION << "\n";
        return 0;
    case ConfigCommand::Action::kHelp:
        break;
    }
    std::cout << programs::kConfigUsage;
    return 0;
}

} // namespace

int main(int argc, char** argv)
{
    server::openStandardDescriptors();
    ConfigCommand command;
    try {
        command = programs::parseConfigCommand(std::vector<std::string>(argv + 1, argv + argc));
    } catch (const std::exception& error) {
        std::cerr << "cimconfig: " << error.what() << "\ncimconfig: Use '--help' to obtain command syntax.\n";
        return 1;
    }
    try {
        return run(command);
    } catch (const std::exception& error) {
        std::cerr << "cimconfig: " << error.what() << "\n";
    } catch (const Exception& error) {
        std::cerr << "cimconfig: " << base::utf8(error.getMessage()) << "\n";
    }
    return 1;
}
