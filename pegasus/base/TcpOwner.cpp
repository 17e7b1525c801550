// SPDX-License-Identifier: MIT
#include "pegasus/base/TcpOwner.h"

#include <netinet/tcp.h>

namespace Pegasus::base {

namespace {

bool isOpen(unsigned state)
{
    return state == TCP_ESTABLISHED || state == TCP_CLOSE_WAIT;
}

std::optional<TcpSocketQuery> queryForPeer(int fd)
{
    const std::optional<TcpEndpoint> own = ownEndpoint(fd);
    const std::optional<TcpEndpoint> peer = peerEndpoint(fd);
    return own && peer ? std::optional<TcpSocketQuery>({*peer, *own}) : std::nullopt;
}

std::optional<TcpSocketQuery> queryForListener(int fd)
{
    const std::optional<TcpEndpoint> peer = peerEndpoint(fd);
    return peer ? std::optional<TcpSocketQuery>({*peer, {}}) : std::nullopt;
}

// Returns: the user of a socket that the kernel may be believed about.
std::optional<uid_t> ownerOf(const std::optional<TcpSocketRecord>& socket)
{
    const bool counts = socket && socket->inode != 0 && (socket->state == TCP_LISTEN || isOpen(socket->state));
    return counts ? std::optional<uid_t>(socket->user) : std::nullopt;
}

} // namespace

TcpOwnerLookup::Answer TcpOwnerLookup::askForPeer(int fd)
{
    const std::optional<TcpSocketQuery> query = queryForPeer(fd);
    if (!query) {
        return {true, std::nullopt};
    }
    const SocketDiag::Answer answer = fKernel.find(*query);
    return {answer.known, isOpen(tcpState(fd)) ? ownerOf(answer.socket) : std::nullopt};
}

TcpOwnerLookup::Answer TcpOwnerLookup::askForListener(int fd)
{
    const std::optional<TcpSocketQuery> query = queryForListener(fd);
    if (!query) {
        return {true, std::nullopt};
    }
    const SocketDiag::Answer answer = fKernel.find(*query);
    return {answer.known, ownerOf(answer.socket)};
}

std::optional<uid_t> TcpOwnerLookup::userFromNetlink(int fd)
{
    return askForPeer(fd).user;
}

std::optional<uid_t> TcpOwnerLookup::userFromTable(int fd) const
{
    const std::optional<TcpSocketQuery> query = queryForPeer(fd);
    const std::optional<uid_t> user = query ? ownerOf(findInTcpTable(fTable, *query)) : std::nullopt;
    return isOpen(tcpState(fd)) ? user : std::nullopt;
}

std::optional<uid_t> TcpOwnerLookup::listenerFromNetlink(int fd)
{
    return askForListener(fd).user;
}

std::optional<uid_t> TcpOwnerLookup::listenerFromTable(int fd) const
{
    const std::optional<TcpSocketQuery> query = queryForListener(fd);
    return query ? ownerOf(findInTcpTable(fTable, *query)) : std::nullopt;
}

std::optional<uid_t> TcpOwnerLookup::userOf(int fd)
{
    const Answer answer = askForPeer(fd);
    return answer.known ? answer.user : userFromTable(fd);
}

// The listener first: a connection that still waits to be accepted when it is looked at afterwards is in the queue of
// the listener that it came to, which therefore was the one on the port all the time. A connection that its server has
// accepted and closed lacks an owner, and has left the state ESTABLISHED.
std::optional<uid_t> TcpOwnerLookup::serverOf(int fd)
{
    const Answer answer = askForListener(fd);
    const std::optional<uid_t> listener = answer.known ? answer.user : listenerFromTable(fd);
    const std::optional<uid_t> accepted = userOf(fd);
    if (accepted) {
        return accepted;
    }
    return tcpState(fd) == TCP_ESTABLISHED ? listener : std::nullopt;
}

} // namespace Pegasus::base
