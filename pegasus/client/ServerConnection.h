// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Deadline.h"

#include <Pegasus/Common/String.h>

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

struct addrinfo;

namespace Pegasus::client {

// Where a server is.
struct ServerAddress
{
    bool isLocal = false; // the private socket; the rest is not used
    std::string host;
    Uint32 port = 0;

    // "127.0.0.1:5988" as in the Host field; empty for the private socket.
    std::string text() const;
};

// One socket, close-on-exec and free of SIGPIPE. Every call ends by the deadline that it is given.
class ServerConnection
{
  public:
    enum class Result
    {
        kDone,
        kClosed, // by the server, orderly or not
        kTimedOut
    };

    ServerConnection() = default;
    ~ServerConnection() { close(); }
    ServerConnection(const ServerConnection&) = delete;
    ServerConnection& operator=(const ServerConnection&) = delete;

    // Sets where open() connects to. A host name is looked up here, once: only the resolver's own settings bound that.
    // Throws: InvalidLocatorException.
    void setAddress(const ServerAddress& address);
    // A loopback address leads to the private socket of the library's own tree if the tree's server serves the port,
    // and otherwise to a server of root or of the process's own user only. Throws: CannotConnectException, also when
    // the deadline passes. Requires: setAddress().
    void open(const base::Deadline& deadline);
    void close();
    bool isOpen() const { return fFd >= 0; }
    // Returns: whether the server has closed the idle connection, or sent unrequested bytes.
    bool isStale() const;

    Result send(std::string_view bytes, const base::Deadline& deadline);
    // Waits for bytes. `received` becomes how many came.
    Result receive(char* buffer, std::size_t capacity, const base::Deadline& deadline, std::size_t& received);

  private:
    Result waitFor(short events, const base::Deadline& deadline) const;
    void openTcp(const base::Deadline& deadline);
    void openLocal(const std::string& home, const std::string& refusal, const base::Deadline& deadline);
    // Throws: CannotConnectException when another user serves the open connection, which is closed then.
    void requireTrustedServer();
    // Whether the tree's own server is meant. Throws: CannotConnectException when it does not serve the port.
    bool isLocalRoute() const;

    ServerAddress fAddress;
    std::shared_ptr<addrinfo> fCandidates; // what a host name was looked up to; null for the private socket
    int fFd = -1;
    bool fIsDrained = true; // whether the last receive() took all that had arrived
};

} // namespace Pegasus::client
