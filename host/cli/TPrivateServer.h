// SPDX-License-Identifier: MIT
#pragma once

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

  private:
    std::string fRoot;
    std::string fConsumer;
};

} // namespace vrxhost
