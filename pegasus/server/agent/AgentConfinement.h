// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/admin/Capabilities.h"

#include <string>
#include <vector>

namespace Pegasus::server {

// What an agent's process may take and do. The server writes it on the agent's command line.
//
// The limits guard against faults of a provider: its agent runs as the server's user, so they contain no malice.
struct AgentConfinement
{
    std::uint64_t memoryMegabytes = 0; // private writable memory (RLIMIT_DATA); 0: any. Address space stays free:
                                       // runtimes reserve much more of it than they use
    std::uint64_t fileMegabytes = 0;   // largest file that it may write; 0: any
    std::uint64_t coreMegabytes = 0;
    std::uint64_t processes = 0;     // that it may add to the machine's as RLIMIT_NPROC counts them; 0: any
    std::uint64_t newPrivileges = 1; // whether programs may gain it privileges by set-user-id bits
    CapabilitySet capabilities = kAllCapabilities;
    std::uint64_t strictOwners = 1;    // whether a library that other users can change is refused
    std::uint64_t strictProviders = 0; // whether calls fail that would fail on OpenPegasus 2.14
};

// As words of a command line, "name=number", and back. Unknown words are passed over.
std::vector<std::string> agentWords(const AgentConfinement& confinement);
AgentConfinement agentConfinement(char** words);

// Holds this process, and those that it starts, to the confinement. What the process's user lacks the right to change
// stays as it is. Requires: the process has one thread.
void confine(const AgentConfinement& confinement);

// The process between the server and an agent: the agent's parent, and the reaper of everything that its provider
// starts.
//
// A process that a provider starts may leave the agent's group and session; when its parent ends, it becomes the
// keeper's child (PR_SET_CHILD_SUBREAPER), so the agent's own wait calls return its own children only. When the agent
// ends, or the server asks for it (SIGTERM), or the server has gone (its end of the control socket closes) and the
// agent does not end in time, the keeper kills all of them.
//
// Splits the process in two. Returns: in the agent. The keeper itself ends here, as the agent ended: with its exit
// status, or by its signal.
// Requires: the process has one thread.
void splitOffKeeper(int control);

} // namespace Pegasus::server
