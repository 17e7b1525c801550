// SPDX-License-Identifier: MIT
// The private CIM server: starts, stops and asks after it. As "cimprovagt --agent" it is a provider agent.
#include "pegasus/base/Text.h"
#include "pegasus/programs/ServerCommand.h"
#include "pegasus/server/Server.h"
#include "pegasus/server/admin/TreeClaim.h"
#include "pegasus/server/agent/Agent.h"

#include <Pegasus/Common/Exception.h>

#include <cstdlib>
#include <iostream>

using namespace Pegasus;
using programs::ServerCommand;

namespace {

constexpr int kNotRunning = 2;

// Runs the server; whatever keeps it from starting goes to the launcher.
bool serve(server::Config& config, server::LaunchSignal& signal, std::string& error)
{
    try {
        server::Server(config).run(signal);
        return true;
    } catch (const server::StartError& failure) {
        error = failure.what();
    } catch (const std::exception& failure) {
        error = std::string("cimserver not started: ") + failure.what();
    } catch (const Exception& failure) {
        error = "cimserver not started: " + base::utf8(failure.getMessage());
    }
    signal.failed(error);
    return false;
}

int start(const ServerCommand& command, const std::string& home)
{
    server::Config config(home);
    for (const auto& [name, value] : command.properties) {
        config.setFromCommandLine(name, value);
    }
    if (command.foreground) {
        config.setFromCommandLine("daemon", "false");
    }
    server::requireOwnTree(config);
    std::string error;
    if (config.flag("daemon")) {
        error = server::launchDaemon([&](server::LaunchSignal& signal) { serve(config, signal, error); }).error;
    } else {
        server::closeInheritedDescriptors(-1);
        server::LaunchSignal nobody;
        serve(config, nobody, error);
    }
    if (!error.empty()) {
        std::cerr << error << "\n";
    }
    return error.empty() ? 0 : 1;
}

int status(const std::string& home)
{
    const bool running = base::readTreeLock(home).state == base::TreeLockState::kHeld;
    std::cout << (running ? "The CIM Server is running.\n" : "The CIM Server is not running.\n");
    return running ? 0 : kNotRunning;
}

int run(const ServerCommand& command)
{
    const std::string home = command.home.empty() ? server::defaultHome() : command.home;
    ::setenv("PEGASUS_HOME", home.c_str(), 1); // for the client library and for agents
    switch (command.action) {
    case ServerCommand::Action::kStop:
        return programs::stopServer(home);
    case ServerCommand::Action::kStatus:
        return status(home);
    case ServerCommand::Action::kVersion:
        std::cout << VRX_VERSION << "\n";
        return 0;
    case ServerCommand::Action::kHelp:
        std::cout << programs::kServerUsage;
        return 0;
    case ServerCommand::Action::kStart:
        break;
    }
    return start(command, home);
}

} // namespace

int main(int argc, char** argv)
{
    server::openStandardDescriptors();
    if (server::isAgentCommand(argc, argv)) {
        return server::runAgent(argc, argv);
    }
    try {
        return run(programs::parseServerCommand(std::vector<std::string>(argv + 1, argv + argc)));
    } catch (const server::StartError& error) {
        std::cerr << error.what() << "\n";
        return 1;
    } catch (const std::exception& error) {
        std::cerr << "cimserver not started: " << error.what() << "\n";
        return 1;
    }
}
