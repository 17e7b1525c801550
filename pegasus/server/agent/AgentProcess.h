#pragma once

#include "pegasus/server/agent/AgentChannel.h"

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
// the server ended, the agent ends too. A thread waits for the process, so that it is reaped and the cause of its end
// is known.
//
// Thread: any.
class AgentProcess
{
  public:
    struct Options
    {
        std::size_t memoryMegabytes = 0; // bound of its address space; 0: any
        bool strictOwners = true;        // whether a library that other users can change is refused
    };

    // Starts the process. Throws: std::system_error.
    AgentProcess(const std::string& module, const Options& options);
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
    // Kills the process and its process group.
    void kill() noexcept;
    bool isRunning() const;
    // Returns: false if it still runs at the deadline.
    bool waitForEnd(const base::Deadline& deadline) const;
    // Returns: how it ended, human-readable: "killed by signal 11 (Segmentation fault)", "exit status 3". Empty while
    // it runs.
    std::string causeOfDeath() const;

    pid_t pid() const { return fPid; }

  private:
    void watch();
    std::shared_ptr<AgentChannel> inUse(std::shared_ptr<AgentChannel> channel);

    std::string fModule;
    base::Descriptor fControl;
    pid_t fPid = -1;
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
