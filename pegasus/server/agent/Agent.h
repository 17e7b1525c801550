// SPDX-License-Identifier: MIT
#pragma once

namespace Pegasus::server {

// The program in agent mode: "cimprovagt --agent <module> <confinement>", with the control socket on descriptor 3.
// Returns: the exit status, when the server has closed the control socket.
int runAgent(int argc, char** argv);

// Returns: whether the program was started in agent mode.
bool isAgentCommand(int argc, char** argv);

} // namespace Pegasus::server
