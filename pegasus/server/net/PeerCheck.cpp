#include "pegasus/server/net/PeerCheck.h"

#include "pegasus/base/Descriptor.h"

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

struct DiagRequest
{
    nlmsghdr header;
    inet_diag_req_v2 body;
};

// Asks for exactly one socket: the one whose source is our peer and whose destination is us.
DiagRequest makeRequest(const AddressPair& pair)
{
    DiagRequest request = {};
    request.header.nlmsg_len = sizeof request;
    request.header.nlmsg_type = SOCK_DIAG_BY_FAMILY;
    request.header.nlmsg_flags = NLM_F_REQUEST;
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

bool isAbout(const inet_diag_msg& message, const AddressPair& pair)
{
    return message.idiag_family == AF_INET && message.id.idiag_sport == pair.peer.sin_port &&
           message.id.idiag_dport == pair.own.sin_port && message.id.idiag_src[0] == pair.peer.sin_addr.s_addr &&
           message.id.idiag_dst[0] == pair.own.sin_addr.s_addr;
}

std::optional<uid_t> readDiagAnswer(const char* data, std::size_t size, const AddressPair& pair)
{
    nlmsghdr header = {};
    if (size < NLMSG_HDRLEN + sizeof(inet_diag_msg)) {
        return std::nullopt;
    }
    std::memcpy(&header, data, sizeof header);
    if (header.nlmsg_type != SOCK_DIAG_BY_FAMILY || header.nlmsg_len > size) {
        return std::nullopt;
    }
    inet_diag_msg message = {};
    std::memcpy(&message, data + NLMSG_HDRLEN, sizeof message);
    if (!isAbout(message, pair) || !isLive(message.idiag_state, message.idiag_inode)) {
        return std::nullopt;
    }
    return message.idiag_uid;
}

std::string hexAddress(const sockaddr_in& address)
{
    char text[16];
    std::snprintf(text, sizeof text, "%08X:%04X", address.sin_addr.s_addr, ntohs(address.sin_port));
    return text;
}

} // namespace

std::optional<uid_t> tcpPeerUserFromNetlink(int fd)
{
    const std::optional<AddressPair> pair = addressesOf(fd);
    const Descriptor netlink(::socket(AF_NETLINK, SOCK_RAW | SOCK_CLOEXEC, NETLINK_SOCK_DIAG));
    if (!pair || !netlink) {
        return std::nullopt;
    }
    timeval patience = {1, 0};
    ::setsockopt(netlink.get(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof patience);
    const DiagRequest request = makeRequest(*pair);
    if (::send(netlink.get(), &request, sizeof request, 0) != static_cast<ssize_t>(sizeof request)) {
        return std::nullopt;
    }
    char answer[4096];
    ssize_t size = -1;
    do {
        size = ::recv(netlink.get(), answer, sizeof answer, 0);
    } while (size < 0 && errno == EINTR);
    return size < 0 ? std::nullopt : readDiagAnswer(answer, static_cast<std::size_t>(size), *pair);
}

std::optional<uid_t> tcpPeerUserFromTable(int fd, const std::string& table)
{
    const std::optional<AddressPair> pair = addressesOf(fd);
    if (!pair) {
        return std::nullopt;
    }
    const std::string source = hexAddress(pair->peer);
    const std::string destination = hexAddress(pair->own);
    std::ifstream lines(table);
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
            return isLive(state, inode) ? std::optional<uid_t>(uid) : std::nullopt;
        }
    }
    return std::nullopt;
}

std::optional<uid_t> tcpPeerUser(int fd)
{
    const std::optional<uid_t> user = tcpPeerUserFromNetlink(fd);
    return user ? user : tcpPeerUserFromTable(fd);
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
