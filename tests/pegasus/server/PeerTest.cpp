// SPDX-License-Identifier: MIT
// Who may talk to the server: whose process is at the other end of a connection, and what the kernel says when that
// changes while it is asked.
#include "pegasus/base/TcpOwner.h"
#include "pegasus/base/Users.h"
#include "pegasus/server/net/Listener.h"
#include "tests/support/TemporaryDirectory.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <functional>
#include <vector>

#include <arpa/inet.h>
#include <dlfcn.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace {
std::function<void()> fgAfterGetpeername; // run once, when the look-up has taken the address pair
} // namespace

// The library's calls come here: this is the moment that an attacker has to hit.
extern "C" int getpeername(int fd, sockaddr* address, socklen_t* size) noexcept
{
    static const auto kNext = reinterpret_cast<decltype(&getpeername)>(::dlsym(RTLD_NEXT, "getpeername"));
    const int result = kNext(fd, address, size);
    if (fgAfterGetpeername) {
        std::exchange(fgAfterGetpeername, nullptr)();
    }
    return result;
}

namespace Pegasus::server {
namespace {

sockaddr_in loopback(std::uint16_t port)
{
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    return address;
}

std::uint16_t portOf(const base::Descriptor& socket)
{
    sockaddr_in address = {};
    socklen_t size = sizeof address;
    EXPECT_EQ(::getsockname(socket.get(), reinterpret_cast<sockaddr*>(&address), &size), 0);
    return ntohs(address.sin_port);
}

// A connected client socket, from the given port; 0 leaves the choice to the kernel.
base::Descriptor connectTo(std::uint16_t port, std::uint16_t from = 0)
{
    base::Descriptor socket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    const int yes = 1;
    ::setsockopt(socket.get(), SOL_SOCKET, SO_REUSEADDR, &yes, sizeof yes);
    sockaddr_in address = loopback(from);
    EXPECT_EQ(::bind(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    address = loopback(port);
    EXPECT_EQ(::connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    return socket;
}

// A connection from an IPv6 socket to the mapped IPv4 address.
base::Descriptor connectMapped(std::uint16_t port)
{
    base::Descriptor socket(::socket(AF_INET6, SOCK_STREAM | SOCK_CLOEXEC, 0));
    sockaddr_in6 address = {};
    address.sin6_family = AF_INET6;
    address.sin6_port = htons(port);
    ::inet_pton(AF_INET6, "::ffff:127.0.0.1", &address.sin6_addr);
    if (::connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
        socket.reset();
    }
    return socket;
}

// Returns: whether the connection stands, or does so within a moment: on the loopback interface the kernel may finish
// it on another processor.
bool isConnected(const base::Descriptor& socket)
{
    pollfd wait = {socket.get(), POLLOUT, 0};
    return ::poll(&wait, 1, 500) == 1 && (wait.revents & (POLLERR | POLLHUP)) == 0;
}

void resetConnection(base::Descriptor& socket)
{
    const linger now = {1, 0};
    ::setsockopt(socket.get(), SOL_SOCKET, SO_LINGER, &now, sizeof now);
    socket.reset();
}

class PeerTest : public testing::Test
{
  protected:
    PeerTest() : fListener(listenOnLoopback(0)), fPort(portOf(fListener)) {}
    ~PeerTest() override { fgAfterGetpeername = nullptr; }

    base::Descriptor accept() const
    {
        bool exhausted = false;
        return acceptConnection(fListener, exhausted);
    }

    base::Descriptor fListener;
    std::uint16_t fPort;
    base::TcpOwnerLookup fLookup;
};

TEST_F(PeerTest, theKernelSaysWhoThePeerIs)
{
    base::Descriptor client = connectTo(fPort);
    const base::Descriptor server = accept();
    for (int i = 0; i < 3; ++i) { // on one netlink socket
        EXPECT_EQ(fLookup.userFromNetlink(server.get()), ::geteuid());
    }
    EXPECT_EQ(fLookup.userFromTable(server.get()), ::geteuid());
    EXPECT_EQ(fLookup.userOf(server.get()), ::geteuid());
    client.reset(); // the kernel now reports the socket as user 0's, which must not pass for root's
    EXPECT_FALSE(fLookup.userFromNetlink(server.get()));
    EXPECT_FALSE(fLookup.userFromTable(server.get()));
    EXPECT_FALSE(fLookup.userOf(server.get()));
}

// Before the connection is accepted the listener counts, afterwards the accepted socket; one that the server has closed
// lacks an owner.
TEST_F(PeerTest, theKernelSaysWhoServes)
{
    for (const bool isMapped : {false, true}) {
        SCOPED_TRACE(isMapped ? "mapped" : "IPv4");
        const base::Descriptor client = isMapped ? connectMapped(fPort) : connectTo(fPort);
        if (!client) {
            GTEST_SKIP() << "this machine has no IPv6";
        }
        EXPECT_EQ(fLookup.listenerFromNetlink(client.get()), ::geteuid());
        EXPECT_EQ(fLookup.listenerFromTable(client.get()), ::geteuid());
        EXPECT_FALSE(fLookup.userOf(client.get()));
        EXPECT_EQ(fLookup.serverOf(client.get()), ::geteuid());
        base::Descriptor server = accept();
        EXPECT_EQ(fLookup.userFromNetlink(client.get()), ::geteuid());
        EXPECT_EQ(fLookup.userFromTable(client.get()), ::geteuid());
        server.reset();
        EXPECT_EQ(fLookup.listenerFromNetlink(client.get()), ::geteuid()) << "the listener is still there";
        EXPECT_FALSE(fLookup.serverOf(client.get()));
    }
    const base::Descriptor last = connectTo(fPort);
    const base::Descriptor accepted = accept();
    fListener.reset();
    EXPECT_FALSE(fLookup.listenerFromNetlink(last.get()));
    EXPECT_FALSE(fLookup.listenerFromTable(last.get()));
    EXPECT_EQ(fLookup.serverOf(last.get()), ::geteuid());
}

TEST_F(PeerTest, aMappedAddressIsTheSamePeer)
{
    const base::Descriptor client = connectMapped(fPort);
    if (!client) {
        GTEST_SKIP() << "this machine has no IPv6";
    }
    EXPECT_EQ(fLookup.userFromNetlink(accept().get()), ::geteuid());
}

// An attacker queues a request, resets its connection while the kernel is asked, and another user's connection gets its
// port: the pair's new owner must not be taken for the owner of the queued request.
TEST_F(PeerTest, aPortThatChangesHandsDuringTheLookUpIsNobodys)
{
    using Look = std::optional<uid_t> (*)(base::TcpOwnerLookup&, int);
    const std::pair<const char*, Look> rows[] = {
        {"netlink", [](base::TcpOwnerLookup& lookup, int fd) { return lookup.userFromNetlink(fd); }},
        {"table", [](base::TcpOwnerLookup& lookup, int fd) { return lookup.userFromTable(fd); }},
        {"either", [](base::TcpOwnerLookup& lookup, int fd) { return lookup.userOf(fd); }}};
    for (const auto& [name, look] : rows) {
        SCOPED_TRACE(name);
        base::Descriptor attacker = connectTo(fPort);
        const std::uint16_t port = portOf(attacker);
        const base::Descriptor server = accept();
        ASSERT_EQ(::send(attacker.get(), "POST", 4, MSG_NOSIGNAL), 4);
        base::Descriptor successor;
        fgAfterGetpeername = [&] {
            resetConnection(attacker);
            successor = connectTo(fPort, port);
        };
        EXPECT_FALSE(look(fLookup, server.get()));
        ASSERT_TRUE(successor) << "the port did not change hands";
        EXPECT_EQ(fLookup.userOf(accept().get()), ::geteuid()) << "the successor's own connection is served";
    }
}

// While the server is busy with others, connections wait: a full queue costs root's client a second and more.
TEST_F(PeerTest, manyConnectionsWaitToBeAccepted)
{
    std::size_t allowed = 0;
    std::ifstream("/proc/sys/net/core/somaxconn") >> allowed;
    const std::size_t expected = std::min<std::size_t>(allowed, 600); // descriptors of one process: 1024
    const test::TemporaryDirectory home;
    const base::Descriptor local = listenLocally(home.path());
    sockaddr_un byName = {AF_UNIX, {}};
    (home.path() + "/cimxml.socket").copy(byName.sun_path, sizeof byName.sun_path - 1);
    const sockaddr_in byPort = loopback(fPort);
    const std::pair<const void*, socklen_t> addresses[] = {{&byPort, sizeof byPort}, {&byName, sizeof byName}};
    for (const auto& [bytes, size] : addresses) {
        const auto* const address = static_cast<const sockaddr*>(bytes);
        std::vector<base::Descriptor> clients;
        while (clients.size() < expected) {
            clients.emplace_back(::socket(address->sa_family, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
            if (::connect(clients.back().get(), address, size) != 0 && !isConnected(clients.back())) {
                break;
            }
        }
        EXPECT_EQ(clients.size(), expected) << "family " << address->sa_family;
        EXPECT_TRUE(clients.empty() || isConnected(clients.back()));
    }
}

struct TableRow
{
    const char* name;
    const char* state;
    unsigned uid;
    unsigned inode;
    bool known;
};

TEST_F(PeerTest, theTableIsReadUnderTheSameRule)
{
    const base::Descriptor client = connectTo(fPort);
    const base::Descriptor server = accept();
    const std::string table = std::filesystem::temp_directory_path() / ("peer-table-" + std::to_string(::getpid()));
    const base::TcpOwnerLookup lookup(table);
    const auto write = [&](std::uint16_t from, const TableRow& row) {
        char text[200];
        std::snprintf(text, sizeof text,
                      "   0: %08X:%04X %08X:%04X %s 00000000:00000000 00:00000000 00000000 %5u 0 %u 1\n",
                      htonl(INADDR_LOOPBACK), from, htonl(INADDR_LOOPBACK), fPort, row.state, row.uid, row.inode);
        std::ofstream(table) << "  sl  local_address rem_address\n" << text;
    };
    const TableRow established = {"established", "01", 1000, 7, true};
    for (const TableRow& row : {established,
                                {"close wait", "08", 1000, 7, true},
                                {"no inode", "01", 0, 0, false},
                                {"fin wait", "04", 1000, 7, false},
                                {"time wait", "06", 0, 0, false}})
    {
        write(portOf(client), row);
        const std::optional<uid_t> user = lookup.userFromTable(server.get());
        EXPECT_EQ(user.has_value(), row.known) << row.name;
        EXPECT_EQ(user.value_or(row.uid), row.uid) << row.name;
    }
    write(static_cast<std::uint16_t>(portOf(client) ^ 1), established); // another connection
    EXPECT_FALSE(lookup.userFromTable(server.get()));
    std::filesystem::remove(table);
    EXPECT_FALSE(lookup.userFromTable(server.get()));
}

TEST(PeerRuleTest, onlyRootAndTheServersUserMayConnect)
{
    EXPECT_TRUE(base::isTrustedUser(0));
    EXPECT_TRUE(base::isTrustedUser(::geteuid()));
    EXPECT_FALSE(base::isTrustedUser(::geteuid() + 4711));
    EXPECT_FALSE(base::isTrustedUser(std::nullopt));
}

} // namespace
} // namespace Pegasus::server
