#pragma once

#include "pegasus/server/net/ConnectionGroup.h"
#include "pegasus/server/net/RefusedConnections.h"

#include <optional>

#include <sys/types.h>

namespace Pegasus::server {

// Takes connections from the listeners, asks the kernel who is there, and hands them to their group, until it is told
// to stop.
class Acceptor
{
  public:
    struct Source
    {
        Descriptor listener;
        std::function<std::optional<uid_t>(int fd)> peerUser; // nothing: unknown
        ConnectionGroup* group;
    };

    // `stop` becomes readable when it is time to end.
    Acceptor(std::vector<Source> sources, int stop, std::function<std::size_t()> maxConnections)
        : fSources(std::move(sources)), fStop(stop), fMaxConnections(std::move(maxConnections))
    {
    }

    // Blocks: until `stop` is readable. The listeners are closed then.
    void run();

  private:
    bool waitForWork(std::vector<bool>& ready);
    bool waitForStop() const;
    bool serveReady();
    // Returns: false if there are no descriptors left.
    bool accept(Source& source);

    std::vector<Source> fSources;
    int fStop;
    std::function<std::size_t()> fMaxConnections;
    RefusedConnections fRefused;
    bool fListening = true; // false for a while when connections cannot be accepted
};

} // namespace Pegasus::server
