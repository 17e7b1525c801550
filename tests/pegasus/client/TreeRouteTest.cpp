// SPDX-License-Identifier: MIT
// Which server the client library of a staged tree talks to when it is asked for a port of this machine.
#include "pegasus/client/TreeRoute.h"

#include "pegasus/base/LocalSocket.h"
#include "pegasus/base/TreeLockFile.h"
#include "pegasus/base/Utf8.h"
#include "tests/support/RunProgram.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <system_error>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <poll.h>
#include <signal.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

namespace Pegasus::client {
namespace {

namespace fs = std::filesystem;
using base::TreeLockState;

constexpr uid_t kOtherUser = 65534;

TEST(TreeRouteTest, theLockDecides)
{
    struct Row
    {
        const char* name;
        TreeLockState state;
        std::uint16_t served;
        Uint32 asked;
        Route route;
    };
    const Row rows[] = {
        {"no lock file", TreeLockState::kAbsent, 0, 5988, Route::kTcp},
        {"the server has ended", TreeLockState::kFree, 0, 5988, Route::kRefused},
        {"the server runs", TreeLockState::kHeld, 5988, 5988, Route::kTreeSocket},
        {"on another port", TreeLockState::kHeld, 5988, 5989, Route::kRefused},
        {"not yet on any port", TreeLockState::kHeld, 0, 5988, Route::kRefused},
        {"no port is asked for", TreeLockState::kHeld, 0, 0, Route::kRefused},
        {"more than a port", TreeLockState::kHeld, 5988, 65536 + 5988, Route::kRefused},
    };
    for (const Row& row : rows) {
        base::TreeLockStatus lock;
        lock.state = row.state;
        lock.record.port = row.served;
        EXPECT_EQ(routeTo(row.asked, lock), row.route) << row.name;
    }
}

TEST(TreeRouteTest, theLibrarysPathNamesTheTree)
{
    const std::pair<const char*, const char*> rows[] = {
        {"/r/pegasus/lib/libpegclient.so.1", "/r/pegasus"},
        {"/r/pegasus/bin/../lib/libpegclient.so.1", "/r/pegasus"},
        {"/r/./pegasus//lib/libpegclient.so.1", "/r/pegasus"},
        {"/pegasus/lib/libpegclient.so.1", "/pegasus"},
        {"/build/release/pegasus/client/libpegclient.so.1", ""},
        {"/usr/lib/libpegclient.so.1", ""},
        {"/opt/openpegasus/lib/libpegclient.so.1", ""},
        {"libpegclient.so.1", ""},
        {"", ""},
    };
    for (const auto& [library, home] : rows) {
        EXPECT_EQ(homeOfLibrary(library), home) << library;
    }
    EXPECT_EQ(treeHome(), "") << "this test uses the library of the build folder";
}

TEST(TreeRouteTest, loopbackAddresses)
{
    const std::pair<const char*, bool> rows[] = {
        {"127.0.0.1", true},        {"127.255.0.9", true}, {"0.0.0.0", false}, {"10.127.0.1", false}, {"::1", true},
        {"::ffff:127.0.0.1", true}, {"::", false},         {"fe80::1", false}, {"::127.0.0.1", false}};
    for (const auto& [text, expected] : rows) {
        sockaddr_storage address = {};
        address.ss_family = std::string(text).find(':') == std::string::npos ? AF_INET : AF_INET6;
        void* bytes = address.ss_family == AF_INET
                          ? static_cast<void*>(&reinterpret_cast<sockaddr_in&>(address).sin_addr)
                          : &reinterpret_cast<sockaddr_in6&>(address).sin6_addr;
        ASSERT_EQ(::inet_pton(address.ss_family, text, bytes), 1);
        EXPECT_EQ(isLoopback(reinterpret_cast<const sockaddr&>(address)), expected) << text;
    }
}

base::Descriptor listenOnAnyPort(std::uint16_t& port)
{
    base::Descriptor listener(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t size = sizeof address;
    if (::bind(listener.get(), reinterpret_cast<const sockaddr*>(&address), size) != 0 ||
        ::listen(listener.get(), 8) != 0 ||
        ::getsockname(listener.get(), reinterpret_cast<sockaddr*>(&address), &size) != 0)
    {
        throw std::system_error(errno, std::generic_category(), "listen");
    }
    port = ntohs(address.sin_port);
    return listener;
}

// Takes the connections that have come to a listener. Returns: how many.
int takeConnections(const base::Descriptor& listener)
{
    int count = 0;
    for (pollfd entry{listener.get(), POLLIN, 0}; ::poll(&entry, 1, 0) == 1; ++count) {
        ::close(::accept4(listener.get(), nullptr, nullptr, SOCK_CLOEXEC));
    }
    return count;
}

// A process of another user that listens on a port, as one that was faster than the tree's server.
class ForgedServer
{
  public:
    explicit ForgedServer(bool accepts)
    {
        int channel[2];
        if (::pipe2(channel, O_CLOEXEC) != 0 || (fProcess = ::fork()) < 0) {
            throw std::system_error(errno, std::generic_category(), "fork");
        }
        if (fProcess == 0) {
            ::close(channel[0]);
            serve(channel[1], accepts);
        }
        ::close(channel[1]);
        if (::read(channel[0], &fPort, sizeof fPort) != sizeof fPort) {
            fPort = 0;
        }
        ::close(channel[0]);
    }
    ~ForgedServer()
    {
        ::kill(fProcess, SIGKILL);
        ::waitpid(fProcess, nullptr, 0);
    }
    ForgedServer(const ForgedServer&) = delete;
    ForgedServer& operator=(const ForgedServer&) = delete;

    std::uint16_t port() const { return fPort; } // 0: it could not listen

  private:
    [[noreturn]] static void serve(int channel, bool accepts)
    {
        ::alarm(60); // should the test be killed
        if (::setgid(kOtherUser) != 0 || ::setuid(kOtherUser) != 0) {
            ::_exit(1);
        }
        std::uint16_t port = 0;
        const base::Descriptor listener = listenOnAnyPort(port);
        if (::write(channel, &port, sizeof port) != sizeof port) {
            ::_exit(1);
        }
        for (;;) {
            if (!accepts || ::accept4(listener.get(), nullptr, nullptr, SOCK_CLOEXEC) < 0) {
                ::pause();
            }
        }
    }

    pid_t fProcess = -1;
    std::uint16_t fPort = 0;
};

// A staged tree: its library is a link to the build's, as in a tree of links to another one's files. Its name is in
// Latin-1, as any bytes may be.
class StagedTreeTest : public testing::Test
{
  protected:
    void SetUp() override
    {
        std::string pattern = fs::temp_directory_path() / "staged-tr\xE9\xE9-XXXXXX";
        ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
        fRoot = pattern;
        fHome = fRoot + "/pegasus";
        fs::create_directories(fHome + "/lib");
        const fs::path library = CLIENT_LIBRARY;
        fs::create_symlink(library, fHome + "/lib/" + library.filename().string());
    }
    void TearDown() override { fs::remove_all(fRoot); }

    // Returns: what the tree's client says when it has tried to connect.
    std::string connect(std::uint16_t port) const
    {
        return test::runProgram({CONNECT_PROBE, std::to_string(port)}, {"LD_LIBRARY_PATH=" + fHome + "/lib"}).out;
    }

    static std::string refusal(std::uint16_t port, const std::string& reason)
    {
        return base::repairedUtf8("Cannot connect to 127.0.0.1:" + std::to_string(port) + ". " + reason + ".\n");
    }

    std::string fRoot;
    std::string fHome;
};

TEST_F(StagedTreeTest, clientUsesTheSocketOfItsOwnServerAndNoOther)
{
    std::uint16_t port = 0;
    const base::Descriptor tcp = listenOnAnyPort(port);
    EXPECT_EQ(connect(port), "connected\n") << "no server has run in the tree, and this one is the user's own";
    EXPECT_EQ(takeConnections(tcp), 1);

    base::Descriptor file(::open(base::treeLockPath(fHome).c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
    ASSERT_TRUE(base::takeTreeLock(file));
    base::TreeLockRecord record;
    record.pid = ::getpid();
    record.port = port;
    base::writeTreeLock(file, record);
    EXPECT_EQ(connect(port), refusal(port, "Connection failed")) << "there is no socket yet";
    base::Descriptor socket = base::listenLocalSocket(fHome, 8);
    EXPECT_EQ(connect(port), "connected\n");
    EXPECT_EQ(takeConnections(socket), 1);

    record.port = static_cast<std::uint16_t>(port ^ 1);
    base::writeTreeLock(file, record);
    EXPECT_EQ(connect(port), refusal(port, "The server of " + fHome + " serves port " + std::to_string(record.port)));
    file.reset();
    EXPECT_EQ(connect(port), refusal(port, "The server of " + fHome + " does not run"));
    EXPECT_EQ(takeConnections(socket), 0);
    EXPECT_EQ(takeConnections(tcp), 0);
}

TEST_F(StagedTreeTest, anotherUsersServerIsRefused)
{
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root, to become somebody else";
    }
    for (const bool accepts : {false, true}) {
        SCOPED_TRACE(accepts ? "accepts" : "only listens");
        const ForgedServer forged(accepts);
        ASSERT_NE(forged.port(), 0);
        EXPECT_EQ(connect(forged.port()),
                  refusal(forged.port(), "Port " + std::to_string(forged.port()) + " is served by user " +
                                             std::to_string(kOtherUser) +
                                             ", who is neither root nor the user of this process"));
        EXPECT_EQ(test::runProgram({CONNECT_PROBE, std::to_string(forged.port())}, {}).out, "connected\n")
            << "a library outside a staged tree connects to whom it is sent";
    }
}

} // namespace
} // namespace Pegasus::client
