// SPDX-License-Identifier: MIT
#include "pegasus/base/TcpSocket.h"

#include <cstring>

#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>

namespace Pegasus::base {

namespace {

std::optional<TcpEndpoint> endpointIn(const sockaddr_storage& address)
{
    if (address.ss_family == AF_INET) {
        const auto& ip = reinterpret_cast<const sockaddr_in&>(address);
        return makeTcpEndpoint(AF_INET, &ip.sin_addr, ip.sin_port);
    }
    if (address.ss_family == AF_INET6) {
        const auto& ip = reinterpret_cast<const sockaddr_in6&>(address);
        return makeTcpEndpoint(AF_INET6, &ip.sin6_addr, ip.sin6_port);
    }
    return std::nullopt;
}

} // namespace

TcpEndpoint makeTcpEndpoint(int family, const void* address, std::uint16_t port)
{
    TcpEndpoint endpoint = {family, {}, port};
    std::memcpy(endpoint.words.data(), address, family == AF_INET ? sizeof(in_addr) : sizeof(in6_addr));
    const auto words = endpoint.words;
    if (family == AF_INET6 && words[0] == 0 && words[1] == 0 && words[2] == htonl(0xffff)) {
        endpoint.family = AF_INET;
        endpoint.words = {words[3]};
    }
    return endpoint;
}

std::optional<TcpEndpoint> ownEndpoint(int fd)
{
    sockaddr_storage address = {};
    socklen_t size = sizeof address;
    return ::getsockname(fd, reinterpret_cast<sockaddr*>(&address), &size) == 0 ? endpointIn(address) : std::nullopt;
}

std::optional<TcpEndpoint> peerEndpoint(int fd)
{
    sockaddr_storage address = {};
    socklen_t size = sizeof address;
    return ::getpeername(fd, reinterpret_cast<sockaddr*>(&address), &size) == 0 ? endpointIn(address) : std::nullopt;
}

unsigned tcpState(int fd)
{
    tcp_info info = {};
    socklen_t size = sizeof info;
    return ::getsockopt(fd, IPPROTO_TCP, TCP_INFO, &info, &size) == 0 ? info.tcpi_state : 0;
}

bool TcpSocketQuery::matches(const TcpSocketRecord& socket) const
{
    if (!isListener()) {
        return socket.local == local && socket.remote == remote;
    }
    return socket.state == TCP_LISTEN && socket.local.port == local.port &&
           (socket.local == local || socket.local.isAnyAddress());
}

} // namespace Pegasus::base
