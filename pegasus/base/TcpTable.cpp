// SPDX-License-Identifier: MIT
#include "pegasus/base/TcpSocket.h"

#include <cstdio>
#include <cstring>
#include <fstream>

#include <arpa/inet.h>
#include <sys/socket.h>

namespace Pegasus::base {

namespace {

// "0100007F:1770", or four words before the colon: each is the address's word as this machine reads it.
std::optional<TcpEndpoint> parseEndpoint(const char* text)
{
    constexpr std::size_t kWordDigits = 8;
    std::uint32_t words[4] = {};
    const std::size_t digits = std::strcspn(text, ":");
    if (digits != kWordDigits && digits != 4 * kWordDigits) {
        return std::nullopt;
    }
    for (std::size_t i = 0; i < digits / kWordDigits; ++i) {
        if (std::sscanf(text + i * kWordDigits, "%8x", &words[i]) != 1) {
            return std::nullopt;
        }
    }
    unsigned port = 0;
    if (std::sscanf(text + digits, ":%4x", &port) != 1) {
        return std::nullopt;
    }
    return makeTcpEndpoint(digits == kWordDigits ? AF_INET : AF_INET6, words, htons(static_cast<std::uint16_t>(port)));
}

std::optional<TcpSocketRecord> parseRow(const std::string& line)
{
    TcpSocketRecord row;
    char local[64];
    char remote[64];
    // slot: local remote state tx:rx timer:when retries uid timeout inode
    if (std::sscanf(line.c_str(), " %*u: %63s %63s %x %*s %*s %*s %u %*u %lu", local, remote, &row.state, &row.user,
                    &row.inode) != 5)
    {
        return std::nullopt;
    }
    const std::optional<TcpEndpoint> from = parseEndpoint(local);
    const std::optional<TcpEndpoint> to = parseEndpoint(remote);
    if (!from || !to) {
        return std::nullopt;
    }
    row.local = *from;
    row.remote = *to;
    return row;
}

std::optional<TcpSocketRecord> findInOneTable(const std::string& table, const TcpSocketQuery& query)
{
    std::ifstream lines(table);
    for (std::string line; std::getline(lines, line);) {
        const std::optional<TcpSocketRecord> row = parseRow(line);
        if (row && query.matches(*row)) {
            return row;
        }
    }
    return std::nullopt;
}

} // namespace

std::optional<TcpSocketRecord> findInTcpTable(const std::string& table, const TcpSocketQuery& query)
{
    const std::optional<TcpSocketRecord> found = findInOneTable(table, query);
    return found ? found : findInOneTable(table + "6", query);
}

} // namespace Pegasus::base
