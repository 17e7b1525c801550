#pragma once

namespace Pegasus::server {

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
