#include "pegasus/base/TcpOwner.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <vector>

#include <arpa/inet.h>
#include <linux/inet_diag.h>
#include <linux/netlink.h>
#include <linux/sock_diag.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>
#include <sys/time.h>
#include <unistd.h>

namespace Pegasus::base {

namespace {

using AddressWords = std::array<std::uint32_t, 4>; // in network order; IPv4 uses the first

// An address and port. An IPv4 address that an IPv6 socket reports as ::ffff:a.b.c.d is held as IPv4.
struct Endpoint
{
    int family = AF_UNSPEC;
    AddressWords words = {};
    std::uint16_t port = 0; // in network order

    bool operator==(const Endpoint& other) const
    {
        return family == other.family && words == other.words && port == other.port;
    }
    bool isAnyAddress() const { return words == AddressWords{}; }
};

Endpoint makeEndpoint(int family, const void* address, std::uint16_t port)
{
    Endpoint endpoint = {family, {}, port};
    std::memcpy(endpoint.words.data(), address, family == AF_INET ? sizeof(in_addr) : sizeof(in6_addr));
    const AddressWords words = endpoint.words;
    if (family == AF_INET6 && words[0] == 0 && words[1] == 0 && words[2] == htonl(0xffff)) {
        endpoint.family = AF_INET;
        endpoint.words = {words[3]};
    }
    return endpoint;
}

using NameGetter = int (*)(int, sockaddr*, socklen_t*);

std::optional<Endpoint> endpointOf(int fd, NameGetter getName)
{
    sockaddr_storage address = {};
    socklen_t size = sizeof address;
    if (getName(fd, reinterpret_cast<sockaddr*>(&address), &size) != 0) {
        return std::nullopt;
    }
    if (address.ss_family == AF_INET) {
        const auto& ip = reinterpret_cast<const sockaddr_in&>(address);
        return makeEndpoint(AF_INET, &ip.sin_addr, ip.sin_port);
    }
    if (address.ss_family == AF_INET6) {
        const auto& ip = reinterpret_cast<const sockaddr_in6&>(address);
        return makeEndpoint(AF_INET6, &ip.sin6_addr, ip.sin6_port);
    }
    return std::nullopt;
}

int getPeerName(int fd, sockaddr* address, socklen_t* size)
{
    return ::getpeername(fd, address, size);
}

int getOwnName(int fd, sockaddr* address, socklen_t* size)
{
    return ::getsockname(fd, address, size);
}

// Returns: the state of our own end; 0 if it cannot be asked.
unsigned stateOf(int fd)
{
    tcp_info info = {};
    socklen_t size = sizeof info;
    return ::getsockopt(fd, IPPROTO_TCP, TCP_INFO, &info, &size) == 0 ? info.tcpi_state : 0;
}

bool isOpenState(unsigned state)
{
    return state == TCP_ESTABLISHED || state == TCP_CLOSE_WAIT;
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
// Returns: its size; 0 when there is none.
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

// One line of /proc/net/tcp.
struct TableRow
{
    std::string local;
    std::string remote;
    unsigned state = 0;
    unsigned uid = 0;
    unsigned long inode = 0;
};

template <typename Match> std::optional<TableRow> findRow(const std::string& table, const Match& matches)
{
    std::ifstream lines(table);
    for (std::string line; std::getline(lines, line);) {
        TableRow row;
        char local[64];
        char remote[64];
        // slot: local remote state tx:rx timer:when retries uid timeout inode
        if (std::sscanf(line.c_str(), " %*u: %63s %63s %x %*s %*s %*s %u %*u %lu", local, remote, &row.state, &row.uid,
                        &row.inode) == 5)
        {
            row.local = local;
            row.remote = remote;
            if (matches(row)) {
                return row;
            }
        }
    }
    return std::nullopt;
}

std::string hexWords(const std::uint32_t* words, std::size_t count)
{
    std::string text;
    for (std::size_t i = 0; i < count; ++i) {
        char word[16];
        std::snprintf(word, sizeof word, "%08X", words[i]);
        text += word;
    }
    return text;
}

std::string hexPort(const Endpoint& endpoint)
{
    char text[16];
    std::snprintf(text, sizeof text, ":%04X", ntohs(endpoint.port));
    return text;
}

// Returns: how the tables spell an endpoint: as IPv4 and as mapped IPv4, or as IPv6.
std::vector<std::string> spellings(const Endpoint& endpoint)
{
    if (endpoint.family == AF_INET6) {
        return {hexWords(endpoint.words.data(), 4) + hexPort(endpoint)};
    }
    const AddressWords mapped = {0, 0, htonl(0xffff), endpoint.words[0]};
    return {hexWords(endpoint.words.data(), 1) + hexPort(endpoint), hexWords(mapped.data(), 4) + hexPort(endpoint)};
}

bool contains(const std::vector<std::string>& texts, const std::string& text)
{
    return std::find(texts.begin(), texts.end(), text) != texts.end();
}

} // namespace

// The socket that is asked for: one end of a connection, or a listener, whose `remote` is empty.
struct TcpOwnerLookup::Wanted
{
    Endpoint local;
    Endpoint remote;

    bool isListener() const { return remote.port == 0; }
    bool isState(unsigned state) const { return isListener() ? state == TCP_LISTEN : isOpenState(state); }

    bool isAddressed(const Endpoint& from, const Endpoint& to) const
    {
        if (!isListener()) {
            return from == local && to == remote;
        }
        return from == local || (from.isAnyAddress() && from.port == local.port);
    }

    std::optional<uid_t> ownerIn(const std::string& table) const
    {
        std::vector<std::string> from = spellings(local);
        if (isListener()) { // also one on all addresses
            const AddressWords any = {};
            from.push_back(hexWords(any.data(), 1) + hexPort(local));
            from.push_back(hexWords(any.data(), 4) + hexPort(local));
        }
        const std::vector<std::string> to = spellings(remote);
        const auto matches = [&](const TableRow& row) {
            return contains(from, row.local) && (isListener() ? isState(row.state) : contains(to, row.remote));
        };
        std::optional<TableRow> row = findRow(table, matches);
        if (!row) {
            row = findRow(table + "6", matches);
        }
        return row && row->inode != 0 && isState(row->state) ? std::optional<uid_t>(row->uid) : std::nullopt;
    }

    // Asks for exactly one socket.
    auto request(std::uint32_t sequence) const
    {
        struct
        {
            nlmsghdr header;
            inet_diag_req_v2 body;
        } request = {};
        request.header.nlmsg_len = sizeof request;
        request.header.nlmsg_type = SOCK_DIAG_BY_FAMILY;
        request.header.nlmsg_flags = NLM_F_REQUEST;
        request.header.nlmsg_seq = sequence;
        request.body.sdiag_family = static_cast<__u8>(local.family);
        request.body.sdiag_protocol = IPPROTO_TCP;
        request.body.idiag_states = ~0u;
        request.body.id.idiag_sport = local.port;
        request.body.id.idiag_dport = remote.port;
        std::copy(local.words.begin(), local.words.end(), request.body.id.idiag_src);
        std::copy(remote.words.begin(), remote.words.end(), request.body.id.idiag_dst);
        request.body.id.idiag_cookie[0] = INET_DIAG_NOCOOKIE;
        request.body.id.idiag_cookie[1] = INET_DIAG_NOCOOKIE;
        return request;
    }

    // Returns: the owner in an answer; nothing when the answer is an error or is about another socket.
    std::optional<uid_t> ownerIn(const char* answer, std::size_t size) const
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
        const Endpoint from = makeEndpoint(message.idiag_family, message.id.idiag_src, message.id.idiag_sport);
        const Endpoint to = makeEndpoint(message.idiag_family, message.id.idiag_dst, message.id.idiag_dport);
        if (!isAddressed(from, to) || message.idiag_inode == 0 || !isState(message.idiag_state)) {
            return std::nullopt;
        }
        return message.idiag_uid;
    }

    // Returns: the socket at the other end of a connection.
    static std::optional<Wanted> peerOf(int fd)
    {
        const std::optional<Endpoint> own = endpointOf(fd, getOwnName);
        const std::optional<Endpoint> peer = endpointOf(fd, getPeerName);
        return own && peer ? std::optional<Wanted>({*peer, *own}) : std::nullopt;
    }
    static std::optional<Wanted> listenerOf(int fd)
    {
        const std::optional<Endpoint> peer = endpointOf(fd, getPeerName);
        return peer ? std::optional<Wanted>({*peer, {}}) : std::nullopt;
    }
};

TcpOwnerLookup::Answer TcpOwnerLookup::askKernel(const Wanted& wanted)
{
    if (!fNetlink) {
        fNetlink = openNetlink();
    }
    const auto request = wanted.request(++fSequence);
    char answer[4096];
    std::size_t size = 0;
    if (fNetlink && ::send(fNetlink.get(), &request, sizeof request, 0) == static_cast<ssize_t>(sizeof request)) {
        size = receiveAnswer(fNetlink, fSequence, answer, sizeof answer);
    }
    if (size == 0 || isUnsupported(answer, size)) {
        fNetlink.reset();
        return {};
    }
    return {true, wanted.ownerIn(answer, size)};
}

TcpOwnerLookup::Answer TcpOwnerLookup::askForPeer(int fd)
{
    const std::optional<Wanted> peer = Wanted::peerOf(fd);
    if (!peer) {
        return {true, std::nullopt};
    }
    const Answer answer = askKernel(*peer);
    return isOpenState(stateOf(fd)) ? answer : Answer{answer.known, std::nullopt};
}

TcpOwnerLookup::Answer TcpOwnerLookup::askForListener(int fd)
{
    const std::optional<Wanted> listener = Wanted::listenerOf(fd);
    return listener ? askKernel(*listener) : Answer{true, std::nullopt};
}

std::optional<uid_t> TcpOwnerLookup::userFromNetlink(int fd)
{
    return askForPeer(fd).user;
}

std::optional<uid_t> TcpOwnerLookup::userFromTable(int fd) const
{
    const std::optional<Wanted> peer = Wanted::peerOf(fd);
    const std::optional<uid_t> user = peer ? peer->ownerIn(fTable) : std::nullopt;
    return isOpenState(stateOf(fd)) ? user : std::nullopt;
}

std::optional<uid_t> TcpOwnerLookup::listenerFromNetlink(int fd)
{
    return askForListener(fd).user;
}

std::optional<uid_t> TcpOwnerLookup::listenerFromTable(int fd) const
{
    const std::optional<Wanted> listener = Wanted::listenerOf(fd);
    return listener ? listener->ownerIn(fTable) : std::nullopt;
}

std::optional<uid_t> TcpOwnerLookup::userOf(int fd)
{
    const Answer answer = askForPeer(fd);
    return answer.known ? answer.user : userFromTable(fd);
}

// The listener first: a connection that is not accepted when it is looked at afterwards is still in the queue of the
// listener that it came to, which therefore was the one on the port all the time. A connection that its server has
// accepted and closed has no owner, and is not ESTABLISHED.
std::optional<uid_t> TcpOwnerLookup::serverOf(int fd)
{
    const Answer answer = askForListener(fd);
    const std::optional<uid_t> listener = answer.known ? answer.user : listenerFromTable(fd);
    const std::optional<uid_t> accepted = userOf(fd);
    if (accepted) {
        return accepted;
    }
    return stateOf(fd) == TCP_ESTABLISHED ? listener : std::nullopt;
}

bool isTrustedUser(std::optional<uid_t> user)
{
    return user && (*user == 0 || *user == ::geteuid());
}

} // namespace Pegasus::base
