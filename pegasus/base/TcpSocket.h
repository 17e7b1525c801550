// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>

#include <sys/types.h>

// TCP sockets of this machine as the kernel lists them.
// Thread: any.
namespace Pegasus::base {

// An address and port. An IPv4 address that an IPv6 socket reports as ::ffff:a.b.c.d is held as IPv4.
struct TcpEndpoint
{
    int family = 0;                       // AF_INET or AF_INET6
    std::array<std::uint32_t, 4> words{}; // in network order; IPv4 uses the first
    std::uint16_t port = 0;               // in network order

    bool isAnyAddress() const { return words == std::array<std::uint32_t, 4>{}; }
    bool operator==(const TcpEndpoint& other) const
    {
        return family == other.family && words == other.words && port == other.port;
    }
};

// `address` is an in_addr or in6_addr, by the family; `port` is in network order.
TcpEndpoint makeTcpEndpoint(int family, const void* address, std::uint16_t port);
// Returns: the addresses of a connected socket; nullopt on failure.
std::optional<TcpEndpoint> ownEndpoint(int fd);
std::optional<TcpEndpoint> peerEndpoint(int fd);
// Returns: the state of a socket, as TCP_ESTABLISHED; 0 on failure.
unsigned tcpState(int fd);

struct TcpSocketRecord
{
    TcpEndpoint local;
    TcpEndpoint remote;
    unsigned state = 0;
    uid_t user = 0;
    unsigned long inode = 0; // 0: the socket belongs to no process
};

// The socket that is asked for: one end of a connection, or the listener for an address, whose `remote` is empty.
struct TcpSocketQuery
{
    TcpEndpoint local;
    TcpEndpoint remote;

    bool isListener() const { return remote.port == 0; }
    // Whether a socket is the one that is asked for. A listener on all addresses is.
    bool matches(const TcpSocketRecord& socket) const;
};

// Looks a socket up in a table such as /proc/net/tcp, and then in the one of IPv6, with a "6" after its name.
// Returns: nullopt when the socket is absent from both, or the tables themselves are absent.
std::optional<TcpSocketRecord> findInTcpTable(const std::string& table, const TcpSocketQuery& query);

} // namespace Pegasus::base
