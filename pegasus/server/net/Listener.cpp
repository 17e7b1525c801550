// SPDX-License-Identifier: MIT
#include "pegasus/server/net/Listener.h"

#include "pegasus/base/LocalSocket.h"

#include <cerrno>
#include <cstring>
#include <stdexcept>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>

namespace Pegasus::server {

namespace {

constexpr int kBacklog = 4096; // the kernel cuts it down to net.core.somaxconn

[[noreturn]] void failToBind(std::uint16_t port)
{
    const int error = errno;
    throw std::runtime_error("Bind failed: Failed to bind socket on port " + std::to_string(port) + ": " +
                             std::strerror(error) + " (error code " + std::to_string(error) + ").");
}

} // namespace

base::Descriptor listenOnLoopback(std::uint16_t port)
{
    base::Descriptor listener(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
    if (!listener) {
        failToBind(port);
    }
    const int yes = 1;
    ::setsockopt(listener.get(), SOL_SOCKET, SO_REUSEADDR, &yes, sizeof yes);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    if (::bind(listener.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 ||
        ::listen(listener.get(), kBacklog) != 0)
    {
        failToBind(port);
    }
    return listener;
}

base::Descriptor listenLocally(const std::string& home)
{
    base::Descriptor listener = base::listenLocalSocket(home, kBacklog);
    ::fcntl(listener.get(), F_SETFL, ::fcntl(listener.get(), F_GETFL) | O_NONBLOCK);
    return listener;
}

base::Descriptor acceptConnection(const base::Descriptor& listener, bool& exhausted)
{
    base::Descriptor connection(::accept4(listener.get(), nullptr, nullptr, SOCK_CLOEXEC));
    exhausted = !connection && (errno == EMFILE || errno == ENFILE || errno == ENOBUFS || errno == ENOMEM);
    if (connection) {
        const int yes = 1;
        ::setsockopt(connection.get(), IPPROTO_TCP, TCP_NODELAY, &yes, sizeof yes);
    }
    return connection;
}

std::optional<uid_t> localPeerUser(int fd)
{
    ucred peer = {};
    socklen_t size = sizeof peer;
    if (::getsockopt(fd, SOL_SOCKET, SO_PEERCRED, &peer, &size) != 0) {
        return std::nullopt;
    }
    return peer.uid;
}

} // namespace Pegasus::server
