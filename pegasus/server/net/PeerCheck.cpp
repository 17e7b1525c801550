#include "pegasus/server/net/PeerCheck.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>

#include <arpa/inet.h>
#include <linux/inet_diag.h>
#include <linux/netlink.h>
#include <linux/sock_diag.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>
#include <sys/time.h>

namespace Pegasus::server {

namespace {

struct AddressPair
{
    sockaddr_in own = {};
    sockaddr_in peer = {};
};

std::optional<AddressPair> addressesOf(int fd)
{
    AddressPair pair;
    socklen_t size = sizeof pair.own;
    if (::getsockname(fd, reinterpret_cast<sockaddr*>(&pair.own), &size) != 0 || pair.own.sin_family != AF_INET) {
        return std::nullopt;
    }
    size = sizeof pair.peer;
    if (::getpeername(fd, reinterpret_cast<sockaddr*>(&pair.peer), &size) != 0 || pair.peer.sin_family != AF_INET) {
        return std::nullopt;
    }
    return pair;
}

bool isLive(unsigned state, unsigned long inode)
{
    return inode != 0 && (state == TCP_ESTABLISHED || state == TCP_CLOSE_WAIT);
}

// Returns: whether the accepted connection still is the one that its address pair was taken from.
bool isStillOpen(int fd)
{
    tcp_info info = {};
    socklen_t size = sizeof info;
    return ::getsockopt(fd, IPPROTO_TCP, TCP_INFO, &info, &size) == 0 &&
           (info.tcpi_state == TCP_ESTABLISHED || info.tcpi_state == TCP_CLOSE_WAIT);
}

struct DiagRequest
{
    nlmsghdr header;
    inet_diag_req_v2 body;
};

// Asks for exactly one socket: the one whose source is our peer and whose destination is us.
DiagRequest makeRequest(const AddressPair& pair, std::uint32_t sequence)
{
    DiagRequest request = {};
    request.header.nlmsg_len = sizeof request;
    request.header.nlmsg_type = SOCK_DIAG_BY_FAMILY;
    request.header.nlmsg_flags = NLM_F_REQUEST;
    request.header.nlmsg_seq = sequence;
    request.body.sdiag_family = AF_INET;
    request.body.sdiag_protocol = IPPROTO_TCP;
    request.body.idiag_states = ~0u;
    request.body.id.idiag_sport = pair.peer.sin_port;
    request.body.id.idiag_dport = pair.own.sin_port;
    request.body.id.idiag_src[0] = pair.peer.sin_addr.s_addr;
    request.body.id.idiag_dst[0] = pair.own.sin_addr.s_addr;
    request.body.id.idiag_cookie[0] = INET_DIAG_NOCOOKIE;
    request.body.id.idiag_cookie[1] = INET_DIAG_NOCOOKIE;
    return request;
}

// An IPv6 socket that talks IPv4 reports the mapped address ::ffff:a.b.c.d.
bool isAddress(const __be32 (&words)[4], int family, in_addr_t address)
{
    return family == AF_INET    ? words[0] == address
           : family == AF_INET6 ? words[0] == 0 && words[1] == 0 && words[2] == htonl(0xffff) && words[3] == address
                                : false;
}

bool isAbout(const inet_diag_msg& message, const AddressPair& pair)
{
    return message.id.idiag_sport == pair.peer.sin_port && message.id.idiag_dport == pair.own.sin_port &&
           isAddress(message.id.idiag_src, message.idiag_family, pair.peer.sin_addr.s_addr) &&
           isAddress(message.id.idiag_dst, message.idiag_family, pair.own.sin_addr.s_addr);
}

// Returns: the owner in an answer; nothing when the answer is an error or is about a socket that is not live.
std::optional<uid_t> readDiagAnswer(const char* data, std::size_t size, const AddressPair& pair)
{
    nlmsghdr header = {};
    std::memcpy(&header, data, sizeof header);
    if (header.nlmsg_type != SOCK_DIAG_BY_FAMILY || size < NLMSG_HDRLEN + sizeof(inet_diag_msg)) {
        return std::nullopt;
    }
    inet_diag_msg message = {};
    std::memcpy(&message, data + NLMSG_HDRLEN, sizeof message);
    if (!isAbout(message, pair) || !isLive(message.idiag_state, message.idiag_inode)) {
        return std::nullopt;
    }
    return message.idiag_uid;
}

base::Descriptor openNetlink()
{
    base::Descriptor netlink(::socket(AF_NETLINK, SOCK_RAW | SOCK_CLOEXEC, NETLINK_SOCK_DIAG));
    if (netlink) {
        const timeval timeout = {1, 0};
        ::setsockopt(netlink.get(), SOL_SOCKET, SO_RCVTIMEO, &timeout, sizeof timeout);
    }
    return netlink;
}

// Reads the answer to one request; answers to earlier ones, which came too late, are dropped.
// Returns: its size; 0 when there is none.
std::size_t receiveAnswer(const base::Descriptor& netlink, std::uint32_t sequence, char* answer, std::size_t capacity)
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

// Returns: whether the kernel lacks the facility. ENOENT comes from the facility itself: the socket does not exist.
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

std::string hexAddress(const sockaddr_in& address)
{
    char text[16];
    std::snprintf(text, sizeof text, "%08X:%04X", address.sin_addr.s_addr, ntohs(address.sin_port));
    return text;
}

} // namespace

TcpPeerLookup::Answer TcpPeerLookup::askKernel(int fd)
{
    const std::optional<AddressPair> pair = addressesOf(fd);
    if (!pair) {
        return {true, std::nullopt};
    }
    if (!fNetlink) {
        fNetlink = openNetlink();
    }
    const DiagRequest request = makeRequest(*pair, ++fSequence);
    char answer[4096];
    std::size_t size = 0;
    if (fNetlink && ::send(fNetlink.get(), &request, sizeof request, 0) == static_cast<ssize_t>(sizeof request)) {
        size = receiveAnswer(fNetlink, fSequence, answer, sizeof answer);
    }
    if (size == 0 || isUnsupported(answer, size)) {
        fNetlink.reset();
        return {};
    }
    const std::optional<uid_t> user = readDiagAnswer(answer, size, *pair);
    return {true, isStillOpen(fd) ? user : std::nullopt};
}

std::optional<uid_t> TcpPeerLookup::userFromNetlink(int fd)
{
    return askKernel(fd).user;
}

std::optional<uid_t> TcpPeerLookup::userFromTable(int fd) const
{
    const std::optional<AddressPair> pair = addressesOf(fd);
    if (!pair) {
        return std::nullopt;
    }
    const std::string source = hexAddress(pair->peer);
    const std::string destination = hexAddress(pair->own);
    std::ifstream lines(fTable);
    for (std::string line; std::getline(lines, line);) {
        char from[32];
        char to[32];
        unsigned state = 0;
        unsigned uid = 0;
        unsigned long inode = 0;
        // slot: from to state tx:rx timer:when retries uid timeout inode
        if (std::sscanf(line.c_str(), " %*u: %31s %31s %x %*s %*s %*s %u %*u %lu", from, to, &state, &uid, &inode) ==
                5 &&
            source == from && destination == to)
        {
            return isLive(state, inode) && isStillOpen(fd) ? std::optional<uid_t>(uid) : std::nullopt;
        }
    }
    return std::nullopt;
}

std::optional<uid_t> TcpPeerLookup::userOf(int fd)
{
    const Answer answer = askKernel(fd);
    return answer.known ? answer.user : userFromTable(fd);
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

bool mayConnect(std::optional<uid_t> peer)
{
    return peer && (*peer == 0 || *peer == ::geteuid());
}

} // namespace Pegasus::server
