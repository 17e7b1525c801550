#pragma once

#include "pegasus/base/Descriptor.h"

#include <chrono>
#include <cstddef>
#include <stdexcept>

#include <sys/uio.h>

namespace Pegasus::server {

using Clock = std::chrono::steady_clock;
using Deadline = Clock::time_point;

inline constexpr Deadline kNoDeadline = Deadline::max();

// A deadline from now; zero is none.
inline Deadline deadlineAfter(std::chrono::milliseconds wait)
{
    return wait.count() == 0 ? kNoDeadline : Clock::now() + wait;
}

class SocketTimeout : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// A connected stream socket with bounded waits.
//
// Throws: SocketTimeout; std::system_error when the connection breaks.
// Thread: one reads and writes; shutDown() may come from any.
class SocketStream
{
  public:
    explicit SocketStream(Descriptor socket) : fSocket(std::move(socket)) {}

    // Returns: bytes read, at least one; 0 at the end of the stream.
    std::size_t readSome(char* data, std::size_t size, Deadline deadline);

    // Waits until something can be read (or the stream has ended) or the deadline passes.
    // Returns: false at the deadline.
    bool waitReadable(Deadline deadline);

    // Sends everything. `patience` bounds each wait for the peer to take more; zero is for ever.
    // The vectors are changed.
    void writeAll(iovec* parts, std::size_t count, std::chrono::milliseconds patience);

    // Ends both directions, so that whoever waits on the socket returns.
    void shutDown() noexcept;
    // Ends reading only: a running answer can still be sent.
    void shutDownReading() noexcept;

    // Closes after our last bytes had a chance to arrive, although the peer still sends: reads and drops until the peer
    // closes, at most for `patience`.
    void lingeringClose(std::chrono::milliseconds patience) noexcept;

    int fd() const { return fSocket.get(); }

  private:
    Descriptor fSocket;
};

} // namespace Pegasus::server
