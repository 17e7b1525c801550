// SPDX-License-Identifier: MIT
#include "pegasus/server/net/SocketStream.h"

#include <cerrno>
#include <system_error>

#include <poll.h>
#include <sys/socket.h>

namespace Pegasus::server {

namespace {

// Returns: false at the deadline.
bool waitFor(int fd, short events, const base::Deadline& deadline)
{
    for (;;) {
        pollfd wait = {fd, events, 0};
        const int ready = ::poll(&wait, 1, deadline.pollTimeoutMs());
        if (ready > 0) {
            return true;
        }
        if (ready < 0 && errno != EINTR) {
            throw std::system_error(errno, std::generic_category(), "cannot wait for the connection");
        }
        if (deadline.hasPassed()) {
            return false;
        }
    }
}

[[noreturn]] void fail(const char* what)
{
    throw std::system_error(errno, std::generic_category(), what);
}

// Takes `sent` bytes off the front of the vectors.
void advance(iovec*& parts, std::size_t& count, std::size_t sent)
{
    while (count > 0 && sent >= parts->iov_len) {
        sent -= parts->iov_len;
        ++parts;
        --count;
    }
    if (count > 0) {
        parts->iov_base = static_cast<char*>(parts->iov_base) + sent;
        parts->iov_len -= sent;
    }
}

} // namespace

std::size_t SocketStream::readSome(char* data, std::size_t size, const base::Deadline& deadline)
{
    for (;;) {
        // A peer that sent less than there was room for is waited for before it is read from.
        if (fIsDrained && !waitFor(fSocket.get(), POLLIN, deadline)) {
            throw SocketTimeout("the peer sends nothing");
        }
        const ssize_t n = ::recv(fSocket.get(), data, size, MSG_DONTWAIT);
        fIsDrained = n < static_cast<ssize_t>(size);
        if (n >= 0) {
            return static_cast<std::size_t>(n);
        }
        if (errno != EAGAIN && errno != EINTR) {
            fail("cannot read from the connection");
        }
    }
}

void SocketStream::writeAll(iovec* parts, std::size_t count, std::chrono::milliseconds timeout)
{
    advance(parts, count, 0);
    while (count > 0) {
        msghdr message = {};
        message.msg_iov = parts;
        message.msg_iovlen = count;
        const ssize_t n = ::sendmsg(fSocket.get(), &message, MSG_DONTWAIT | MSG_NOSIGNAL);
        if (n >= 0) {
            advance(parts, count, static_cast<std::size_t>(n));
        } else if (errno == EAGAIN) {
            if (!waitFor(fSocket.get(), POLLOUT, base::Deadline::afterOrNever(timeout))) {
                throw SocketTimeout("the peer takes nothing");
            }
        } else if (errno != EINTR) {
            fail("cannot write to the connection");
        }
    }
}

void SocketStream::shutDown() noexcept
{
    ::shutdown(fSocket.get(), SHUT_RDWR);
}

void SocketStream::shutDownReading() noexcept
{
    ::shutdown(fSocket.get(), SHUT_RD);
}

void SocketStream::lingeringClose(std::chrono::milliseconds timeout) noexcept
try {
    ::shutdown(fSocket.get(), SHUT_WR);
    const base::Deadline deadline = base::Deadline::after(timeout);
    char scrap[4096];
    while (!deadline.hasPassed() && readSome(scrap, sizeof scrap, deadline) > 0) {
    }
} catch (const std::exception&) { // broken or too slow: it is closed either way
}

} // namespace Pegasus::server
