// SPDX-License-Identifier: MIT
#include "pegasus/base/SocketDiag.h"

#include <algorithm>
#include <cerrno>
#include <cstring>

#include <linux/inet_diag.h>
#include <linux/netlink.h>
#include <linux/sock_diag.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <sys/time.h>

namespace Pegasus::base {

namespace {

struct Request
{
    nlmsghdr header;
    inet_diag_req_v2 body;
};

// Asks for exactly one socket.
Request makeRequest(const TcpSocketQuery& query, std::uint32_t sequence)
{
    Request request = {};
    request.header.nlmsg_len = sizeof request;
    request.header.nlmsg_type = SOCK_DIAG_BY_FAMILY;
    request.header.nlmsg_flags = NLM_F_REQUEST;
    request.header.nlmsg_seq = sequence;
    request.body.sdiag_family = static_cast<__u8>(query.local.family);
    request.body.sdiag_protocol = IPPROTO_TCP;
    request.body.idiag_states = ~0u;
    request.body.id.idiag_sport = query.local.port;
    request.body.id.idiag_dport = query.remote.port;
    std::copy(query.local.words.begin(), query.local.words.end(), request.body.id.idiag_src);
    std::copy(query.remote.words.begin(), query.remote.words.end(), request.body.id.idiag_dst);
    request.body.id.idiag_cookie[0] = INET_DIAG_NOCOOKIE;
    request.body.id.idiag_cookie[1] = INET_DIAG_NOCOOKIE;
    return request;
}

Descriptor openNetlink()
{
    Descriptor netlink(::socket(AF_NETLINK, SOCK_RAW | SOCK_CLOEXEC, NETLINK_SOCK_DIAG));
    if (netlink) {
        const timeval timeout = {1, 0};
        ::setsockopt(netlink.get(), SOL_SOCKET, SO_RCVTIMEO, &timeout, sizeof timeout);
    }
    return netlink;
}

// Reads the answer to one request; answers to earlier ones, which came too late, are dropped.
// Returns: its size; 0 when receiving fails or the answer is cut off.
std::size_t receiveAnswer(const Descriptor& netlink, std::uint32_t sequence, char* answer, std::size_t capacity)
{
    for (;;) {
        const ssize_t size = ::recv(netlink.get(), answer, capacity, 0);
        if (size < 0 && errno == EINTR) {
            continue;
        }
        nlmsghdr header = {};
        if (size < static_cast<ssize_t>(sizeof header)) {
            return 0;
        }
        std::memcpy(&header, answer, sizeof header);
        if (header.nlmsg_seq == sequence) {
            return header.nlmsg_len <= static_cast<std::size_t>(size) ? static_cast<std::size_t>(size) : 0;
        }
    }
}

// Returns: whether the kernel lacks the facility. ENOENT comes from the facility itself: the socket is absent.
bool isUnsupported(const char* answer, std::size_t size)
{
    nlmsghdr header = {};
    nlmsgerr error = {};
    std::memcpy(&header, answer, sizeof header);
    if (header.nlmsg_type != NLMSG_ERROR || size < NLMSG_HDRLEN + sizeof error.error) {
        return false;
    }
    std::memcpy(&error.error, answer + NLMSG_HDRLEN, sizeof error.error);
    return error.error != -ENOENT;
}

// Returns: the socket in an answer; nullopt when the answer is an error or is about another socket.
std::optional<TcpSocketRecord> socketIn(const char* answer, std::size_t size, const TcpSocketQuery& query)
{
    nlmsghdr header = {};
    std::memcpy(&header, answer, sizeof header);
    if (header.nlmsg_type != SOCK_DIAG_BY_FAMILY || size < NLMSG_HDRLEN + sizeof(inet_diag_msg)) {
        return std::nullopt;
    }
    inet_diag_msg message = {};
    std::memcpy(&message, answer + NLMSG_HDRLEN, sizeof message);
    if (message.idiag_family != AF_INET && message.idiag_family != AF_INET6) {
        return std::nullopt;
    }
    const TcpSocketRecord socket = {makeTcpEndpoint(message.idiag_family, message.id.idiag_src, message.id.idiag_sport),
                                    makeTcpEndpoint(message.idiag_family, message.id.idiag_dst, message.id.idiag_dport),
                                    message.idiag_state, message.idiag_uid, message.idiag_inode};
    return query.matches(socket) ? std::optional<TcpSocketRecord>(socket) : std::nullopt;
}

} // namespace

SocketDiag::Answer SocketDiag::find(const TcpSocketQuery& query)
{
    if (!fNetlink) {
        fNetlink = openNetlink();
    }
    const Request request = makeRequest(query, ++fSequence);
    char answer[4096];
    std::size_t size = 0;
    if (fNetlink && ::send(fNetlink.get(), &request, sizeof request, 0) == static_cast<ssize_t>(sizeof request)) {
        size = receiveAnswer(fNetlink, fSequence, answer, sizeof answer);
    }
    if (size == 0 || isUnsupported(answer, size)) {
        fNetlink.reset();
        return {};
    }
    return {true, socketIn(answer, size, query)};
}

} // namespace Pegasus::base
