// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/admin/Config.h"
#include "pegasus/server/admin/Daemon.h"

#include <string>
#include <vector>

namespace Pegasus::server {

// One run of the server, from its configuration to its orderly end.
//
// It ends on SIGTERM, SIGINT and SIGHUP, and when a client calls PG_ShutdownService.shutdown: reading ends, running
// requests get shutdownTimeout, then the agents are ended; socket, start file and lock are removed.
class Server
{
  public:
    explicit Server(Config& config) : fConfig(config) {}

    // Serves. Reports to `signal` when connections are accepted.
    // Throws: StartError, std::exception or Pegasus::Exception before that.
    // Requires: the caller has one thread; called once a process, because it takes the process's signals.
    // Blocks: until the server has ended.
    void run(LaunchSignal& signal);

  private:
    Config& fConfig;
};

} // namespace Pegasus::server
