#pragma once

#include "pegasus/server/net/Connection.h"

#include <condition_variable>
#include <mutex>
#include <set>

namespace Pegasus::server {

// The connections that came over one listener, each with a thread of its own.
//
// Thread: any.
class ConnectionGroup
{
  public:
    ConnectionGroup(RequestHandler& handler, std::function<ConnectionSettings()> settings)
        : fHandler(handler), fSettings(std::move(settings))
    {
    }
    // Requires: every connection has ended.
    ~ConnectionGroup() = default;
    ConnectionGroup(const ConnectionGroup&) = delete;
    ConnectionGroup& operator=(const ConnectionGroup&) = delete;

    // Serves a connection. Returns: false if `most` are being served already, or no thread can be had; `socket` is the
    // caller's then.
    bool serve(Descriptor& socket, std::size_t most);

    // Lets no connection read a further request; answers that are under way go out.
    void endReading();
    // Breaks every connection.
    void breakAll();
    // Returns: false if some are left at the deadline.
    bool waitForEnd(Deadline deadline);

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
