#pragma once

#include "pegasus/server/net/SocketStream.h"

#include <deque>

namespace Pegasus::server {

// Connections that were told "503" and now get a moment to read it: closed at once, with their request unread, they
// would lose the answer to a reset.
class RefusedConnections
{
  public:
    static constexpr std::size_t kMost = 64;
    static constexpr std::chrono::seconds kMoment{1};

    void refuse(Descriptor connection);
    // Closes those whose moment is over.
    void expire();
    bool empty() const { return fWaiting.empty(); }

  private:
    struct Waiting
    {
        Descriptor connection;
        Deadline deadline;
    };
    std::deque<Waiting> fWaiting;
};

} // namespace Pegasus::server
