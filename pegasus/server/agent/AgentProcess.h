// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/agent/AgentChannel.h"
#include "pegasus/server/agent/AgentConfinement.h"
#include "pegasus/server/agent/AgentOutput.h"

#include <condition_variable>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

namespace Pegasus::server {

// One running agent: the server's own program in agent mode, which has loaded one provider module.
//
// The two are joined by a control socket. Over it the agent receives its end of each channel; when it closes, however
// the server ended, the agent ends too. The process that is started is the agent's keeper, which ends as the agent ends
// (splitOffKeeper). A thread waits for it, so that it is reaped and the cause of its end is known, and logs what the
// agent writes to its standard output and error.
//
// Thread: any.
class AgentProcess
{
  public:
    // Starts the process. Throws: std::system_error.
    AgentProcess(const std::string& module, const AgentConfinement& confinement);
    // Closes the control socket, and kills the process if it still runs after a grace period.
    ~AgentProcess();
    AgentProcess(const AgentProcess&) = delete;
    AgentProcess& operator=(const AgentProcess&) = delete;

    // Returns: an idle channel, or a new one. Throws: AgentGone; std::system_error when descriptors run out.
    // A request that waits on it fails when the process ends, also when children of the process keep its sockets open.
    std::shared_ptr<AgentChannel> takeChannel();
    void giveBack(std::shared_ptr<AgentChannel> channel);

    // Asks the agent to end: it sees the end of its control socket.
    void close() noexcept;
    // Has the process killed, and everything that it started.
    void kill() noexcept;
    bool isRunning() const;
    // Returns: false if it still runs at the deadline.
    bool waitForEnd(const base::Deadline& deadline) const;
    // Returns: how it ended, human-readable: "killed by signal 11 (Segmentation fault)", "exit status 3". Empty while
    // it runs.
    std::string causeOfDeath() const;
    // Returns: the last lines that it wrote to its standard output or error, as OutputLines::tail().
    std::string lastOutput() const { return fOutput.tail(); }

    // Returns: the id of the agent's keeper.
    pid_t pid() const { return fPid; }

  private:
    void watch();
    void signal(int number) noexcept;
    std::shared_ptr<AgentChannel> inUse(std::shared_ptr<AgentChannel> channel);

    std::string fModule;
    base::Descriptor fControl;
    AgentOutput fOutput;
    pid_t fPid = -1;
    base::Descriptor fEnd; // readable when the process has ended
    mutable std::mutex fMutex;
    mutable std::condition_variable fChanged;
    bool fEnded = false;
    int fStatus = 0;
    std::vector<std::shared_ptr<AgentChannel>> fIdle;
    std::vector<std::weak_ptr<AgentChannel>> fInUse; // those that are gone are removed with the next one
    std::thread fWatcher;
};

// The name under which agents run, as ps shows it.
extern const char* const kAgentProcessName;

} // namespace Pegasus::server
