// SPDX-License-Identifier: MIT
#pragma once

#include <set>
#include <string>

namespace vrxhost {

// The private server as the host sees it: programs below the root, and a start file that names its process.
class TPrivateServer
{
  public:
    TPrivateServer(const std::string& root, const std::string& consumer);

    // Plans the consumer's name for the server's next start.
    // Returns: empty on success, else the reason of the failure.
    // Blocks: up to 30 seconds.
    std::string SetConsumer() const;

    // Ends the running server, if the start file names a process that runs this root's server program: in order, and by
    // force when it still runs after 2 seconds.
    // Thread: safe.
    void End() const;

    // Kills the processes of this root's server that hold a provider module's library; the server reports the loss to
    // whoever waits for an answer, and starts others on demand.
    // Thread: safe.
    void EndAgents(const std::set<std::string>& modules) const;

  private:
    bool IsAgentOf(const std::string& process, const std::set<std::string>& modules) const;

    std::string fRoot;
    std::string fConsumer;
};

} // namespace vrxhost
