// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Deadline.h"
#include "pegasus/base/Descriptor.h"

#include <chrono>
#include <cstddef>
#include <stdexcept>

#include <sys/uio.h>

namespace Pegasus::server {

// The peer stayed silent, or left our bytes unread, for too long.
class SocketTimeout : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// A connected stream socket with bounded waits. It owns the socket.
//
// Throws: SocketTimeout; std::system_error when the connection breaks.
// Thread: one reads and writes; shutDown() and shutDownReading() may come from any.
class SocketStream
{
  public:
    explicit SocketStream(base::Descriptor socket) : fSocket(std::move(socket)) {}

    // Returns: the number of bytes read, at least one; 0 at the end of the stream.
    // Blocks: until the deadline.
    std::size_t readSome(char* data, std::size_t size, const base::Deadline& deadline);

    // Sends everything. The vectors are changed.
    // Blocks: for as long as the peer takes something at least every `timeout`; 0 allows any time.
    void writeAll(iovec* parts, std::size_t count, std::chrono::milliseconds timeout);

    // Ends both directions, so that a thread that waits on the socket returns.
    void shutDown() noexcept;
    // Ends reading only: a running answer can still be sent.
    void shutDownReading() noexcept;

    // Lets our last bytes arrive although the peer still sends: ends writing, then reads and drops what comes until the
    // peer closes. Closing at once would reset the connection and lose them.
    // Blocks: at most for `timeout`.
    void lingeringClose(std::chrono::milliseconds timeout) noexcept;

    int fd() const { return fSocket.get(); }

  private:
    base::Descriptor fSocket;
    bool fIsDrained = true; // whether the last read took all that had arrived
};

} // namespace Pegasus::server
