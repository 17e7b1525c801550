// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/ConnectionGroup.h"

#include <chrono>
#include <deque>
#include <functional>
#include <optional>
#include <vector>

#include <sys/types.h>

namespace Pegasus::server {

// Connections over the limit, which have been answered with 503 and get a moment to read that: closed at once, with
// their request unread, they would lose the answer to a reset.
class RefusedConnections
{
  public:
    static constexpr std::size_t kMaxWaiting = 64; // the oldest is closed before its moment is over
    static constexpr std::chrono::seconds kMoment{1};

    void refuse(base::Descriptor connection);
    // Closes those whose moment is over.
    void expire();
    bool empty() const { return fWaiting.empty(); }

  private:
    struct Waiting
    {
        base::Descriptor connection;
        base::Deadline deadline;
    };
    std::deque<Waiting> fWaiting;
};

// Log lines about connections of other users: the first at once, then at most one a second with a count of the others,
// so that a flood leaves the rest of the log in place.
class RefusalLog
{
  public:
    using Clock = base::Deadline::Clock;

    void note(std::optional<uid_t> user, Clock::time_point now = Clock::now());

  private:
    Clock::time_point fNext{};
    unsigned fUnreported = 0;
};

// Takes connections from the listeners, asks the kernel whose each is, and hands it to its group.
//
// Failures to serve one connection are logged and end that connection.
// Thread: run() on one; it is the server's own.
class Acceptor
{
  public:
    struct Source
    {
        base::Descriptor listener;
        std::function<std::optional<uid_t>(int fd)> peerUser; // nothing: unknown
        ConnectionGroup* group;
    };

    // `stop` becomes readable when it is time to end. `maxConnections` bounds each group.
    // Requires: stop and the groups outlive this.
    Acceptor(std::vector<Source> sources, int stop, std::function<std::size_t()> maxConnections)
        : fSources(std::move(sources)), fStop(stop), fMaxConnections(std::move(maxConnections))
    {
    }

    // Accepts. The listeners are closed in the end. Blocks: until `stop` is readable.
    void run();

  private:
    bool waitForWork(std::vector<bool>& ready);
    bool waitForStop() const;
    bool serveReady();
    // Returns: false if descriptors have run out.
    bool accept(Source& source);

    std::vector<Source> fSources;
    int fStop;
    std::function<std::size_t()> fMaxConnections;
    RefusedConnections fRefused;
    RefusalLog fRefusalLog;
    bool fListening = true; // false for a while when connections cannot be accepted
};

} // namespace Pegasus::server
