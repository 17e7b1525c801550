#ifndef PEGASUS_CLIENT_CONNECTION_H
#define PEGASUS_CLIENT_CONNECTION_H

#include "pegasus/client/Deadline.h"

#include <Pegasus/Common/String.h>

#include <cstddef>
#include <string>
#include <string_view>

namespace Pegasus::client {

/// Where a server is.
struct ServerAddress
{
    bool isLocal = false; ///< the private socket; the rest is not used
    std::string host;
    Uint32 port = 0;

    /// "127.0.0.1:5988" as in the Host field; empty for the private socket.
    std::string text() const;
};

/// One socket, close-on-exec and without SIGPIPE. No call lasts beyond the deadline that it is given.
class Connection
{
  public:
    enum class Result
    {
        Done,
        Closed, ///< by the server, orderly or not
        TimedOut
    };

    Connection() = default;
    ~Connection() { close(); }
    Connection(const Connection&) = delete;
    Connection& operator=(const Connection&) = delete;

    /// Throws: InvalidLocatorException, CannotConnectException, ConnectionTimeoutException (the deadline had passed
    /// before a connection was tried). Looking up a host name is bounded by the resolver's own settings.
    void open(const ServerAddress& address, const Deadline& deadline);
    void close();
    bool isOpen() const { return fFd >= 0; }
    /// Has the server ever sent anything on it?
    bool hasReceived() const { return fHasReceived; }
    /// Has the server closed the idle connection, or sent what nobody asked for?
    bool isStale() const;

    Result send(std::string_view bytes, const Deadline& deadline);
    /// Waits for bytes. `received` is how many came.
    Result receive(char* buffer, std::size_t capacity, const Deadline& deadline, std::size_t& received);

  private:
    Result waitFor(short events, const Deadline& deadline) const;
    void openTcp(const ServerAddress& address, const Deadline& deadline);
    void openLocal(const Deadline& deadline);

    int fFd = -1;
    bool fHasReceived = false;
};

} // namespace Pegasus::client

#endif
