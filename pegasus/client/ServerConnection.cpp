// SPDX-License-Identifier: MIT
#include "pegasus/client/ServerConnection.h"

#include "pegasus/base/LocalSocket.h"
#include "pegasus/base/Text.h"
#include "pegasus/client/TreeRoute.h"

#include <Pegasus/Common/Exception.h>

#include <cerrno>
#include <limits>
#include <memory>
#include <system_error>

#include <fcntl.h>
#include <netdb.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

namespace Pegasus::client {
namespace {

using base::Deadline;

std::shared_ptr<addrinfo> lookUp(const ServerAddress& address)
{
    addrinfo hints{};
    hints.ai_family = AF_UNSPEC;
    hints.ai_socktype = SOCK_STREAM;
    hints.ai_flags = AI_NUMERICSERV;
    addrinfo* list = nullptr;
    // The resolver would take the lower 16 bits of a number.
    if (address.port > std::numeric_limits<in_port_t>::max() ||
        ::getaddrinfo(address.host.c_str(), std::to_string(address.port).c_str(), &hints, &list) != 0)
    {
        throw InvalidLocatorException(base::fromUtf8Repaired(address.text()));
    }
    return {list, ::freeaddrinfo};
}

// Returns: the result of the connection attempt that is under way, 0 or an errno.
int pendingError(int fd)
{
    int error = 0;
    socklen_t size = sizeof(error);
    return ::getsockopt(fd, SOL_SOCKET, SO_ERROR, &error, &size) < 0 ? errno : error;
}

bool isRetry(int error)
{
    return error == EAGAIN || error == EWOULDBLOCK || error == EINTR;
}

} // namespace

std::string ServerAddress::text() const
{
    return isLocal ? std::string() : host + ":" + std::to_string(port);
}

void ServerConnection::setAddress(const ServerAddress& address)
{
    fCandidates = address.isLocal ? nullptr : lookUp(address);
    fAddress = address;
}

void ServerConnection::open(const Deadline& deadline)
{
    close();
    if (fAddress.isLocal) {
        openLocal(base::localSocketHome(), "Cannot connect to local CIM server. Connection failed.", deadline);
    } else if (isLocalRoute()) {
        openLocal(treeHome(), "Cannot connect to " + fAddress.text() + ". Connection failed.", deadline);
    } else {
        openTcp(deadline);
    }
}

bool ServerConnection::isLocalRoute() const
{
    for (const addrinfo* candidate = fCandidates.get(); candidate; candidate = candidate->ai_next) {
        if (isLoopback(*candidate->ai_addr)) {
            return isReachedBySocket(treeHome(), fAddress.port, fAddress.text());
        }
    }
    return false;
}

void ServerConnection::openTcp(const Deadline& deadline)
{
    for (const addrinfo* candidate = fCandidates.get(); candidate; candidate = candidate->ai_next) {
        fFd = ::socket(candidate->ai_family, candidate->ai_socktype | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
        if (fFd < 0) {
            continue;
        }
        const int started = ::connect(fFd, candidate->ai_addr, candidate->ai_addrlen);
        const bool isPending = started < 0 && (errno == EINPROGRESS || errno == EINTR);
        if (started == 0 || (isPending && waitFor(POLLOUT, deadline) == Result::kDone && pendingError(fFd) == 0)) {
            // A request is one message; waiting to fill a packet would only delay it.
            const int on = 1;
            ::setsockopt(fFd, IPPROTO_TCP, TCP_NODELAY, &on, sizeof(on));
            if (!treeHome().empty() && isLoopback(*candidate->ai_addr)) {
                requireTrustedServer();
            }
            return;
        }
        close();
    }
    throw CannotConnectException(
        base::fromUtf8Repaired("Cannot connect to " + fAddress.text() + ". Connection failed."));
}

void ServerConnection::requireTrustedServer()
{
    const std::string fault = serverFault(fFd, fAddress.port);
    if (!fault.empty()) {
        close();
        throw CannotConnectException(
            base::fromUtf8Repaired("Cannot connect to " + fAddress.text() + ". " + fault + "."));
    }
}

void ServerConnection::openLocal(const std::string& home, const std::string& refusal, const Deadline& deadline)
{
    try {
        fFd = base::connectLocalSocket(home, deadline).release();
    } catch (const std::system_error&) {
        throw CannotConnectException(base::fromUtf8Repaired(refusal));
    }
    const int flags = ::fcntl(fFd, F_GETFL);
    ::fcntl(fFd, F_SETFL, flags | O_NONBLOCK);
}

void ServerConnection::close()
{
    if (fFd >= 0) {
        ::close(fFd);
    }
    fFd = -1;
    fIsDrained = true;
}

bool ServerConnection::isStale() const
{
    char byte = 0;
    const ssize_t count = ::recv(fFd, &byte, 1, MSG_PEEK | MSG_DONTWAIT);
    return count >= 0 || !isRetry(errno);
}

ServerConnection::Result ServerConnection::waitFor(short events, const Deadline& deadline) const
{
    for (;;) {
        pollfd entry{fFd, events, 0};
        const int ready = ::poll(&entry, 1, deadline.pollTimeoutMs());
        if (ready > 0) {
            return Result::kDone;
        }
        if (ready == 0 && deadline.hasPassed()) {
            return Result::kTimedOut;
        }
        if (ready < 0 && errno != EINTR) {
            return Result::kClosed;
        }
    }
}

ServerConnection::Result ServerConnection::send(std::string_view bytes, const Deadline& deadline)
{
    while (!bytes.empty()) {
        const ssize_t count = ::send(fFd, bytes.data(), bytes.size(), MSG_NOSIGNAL);
        if (count >= 0) {
            bytes.remove_prefix(static_cast<std::size_t>(count));
            continue;
        }
        if (!isRetry(errno)) {
            return Result::kClosed;
        }
        const Result waited = waitFor(POLLOUT, deadline);
        if (waited != Result::kDone) {
            return waited;
        }
    }
    return Result::kDone;
}

ServerConnection::Result ServerConnection::receive(char* buffer, std::size_t capacity, const Deadline& deadline,
                                                   std::size_t& received)
{
    for (;;) {
        // A server that sent less than there was room for is waited for before it is read from.
        const Result waited = fIsDrained ? waitFor(POLLIN, deadline) : Result::kDone;
        if (waited != Result::kDone) {
            return waited;
        }
        // Asked before each read: the deadline also bounds a server that goes on sending.
        if (deadline.hasPassed()) {
            return Result::kTimedOut;
        }
        const ssize_t count = ::recv(fFd, buffer, capacity, 0);
        fIsDrained = count < static_cast<ssize_t>(capacity);
        if (count >= 0) {
            received = static_cast<std::size_t>(count);
            return count == 0 ? Result::kClosed : Result::kDone;
        }
        if (!isRetry(errno)) {
            return Result::kClosed;
        }
    }
}

} // namespace Pegasus::client
