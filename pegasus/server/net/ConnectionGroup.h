// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/RequestLoop.h"

#include <condition_variable>
#include <mutex>
#include <set>

namespace Pegasus::server {

// The connections that came over one listener, each with a thread of its own. The threads are detached: waitForEnd()
// says when the last one is done with the group.
//
// Thread: any.
class ConnectionGroup
{
  public:
    // Requires: the handler outlives this.
    ConnectionGroup(RequestHandler& handler, std::function<ConnectionSettings()> settings)
        : fHandler(handler), fSettings(std::move(settings))
    {
    }
    // Requires: waitForEnd() has returned true.
    ~ConnectionGroup() = default;
    ConnectionGroup(const ConnectionGroup&) = delete;
    ConnectionGroup& operator=(const ConnectionGroup&) = delete;

    // Serves a connection. Returns: false if `most` are being served already, or starting a thread fails.
    // Ownership: `socket` passes to the group only when the connection is served.
    bool serve(base::Descriptor& socket, std::size_t most);

    // Ends reading on every connection. Running requests are still answered.
    void endReading();
    // Breaks every connection.
    void breakAll();
    // Returns: false if some are left at the deadline. Blocks: until then.
    bool waitForEnd(const base::Deadline& deadline);

  private:
    void run(SocketStream& stream);

    RequestHandler& fHandler;
    std::function<ConnectionSettings()> fSettings;
    std::mutex fMutex;
    std::condition_variable fChanged;
    std::set<SocketStream*> fStreams;
    bool fEnding = false;
};

} // namespace Pegasus::server
