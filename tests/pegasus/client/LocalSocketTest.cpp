// SPDX-License-Identifier: MIT
// The private socket, in a folder whose path is longer than a socket address.
#include "pegasus/base/LocalSocket.h"

#include <Pegasus/Client/CIMClient.h>

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <system_error>
#include <thread>
#include <vector>

#include <poll.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace Pegasus;

namespace {

// PEGASUS_HOME for the time of a test.
class LocalSocketTest : public testing::Test
{
  protected:
    void SetUp() override
    {
        std::string pattern = std::filesystem::temp_directory_path() / "pegasus-home-XXXXXX";
        ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
        fTree = pattern;
        fHome = fTree + "/" + std::string(150, 'x');
        std::filesystem::create_directory(fHome);
        ::setenv("PEGASUS_HOME", fHome.c_str(), 1);
    }
    void TearDown() override
    {
        ::unsetenv("PEGASUS_HOME");
        std::filesystem::remove_all(fTree);
    }

    std::string fTree;
    std::string fHome;
};

std::string requestOf(int listener)
{
    pollfd entry{listener, POLLIN, 0};
    if (::poll(&entry, 1, 10000) != 1) {
        return "nobody came";
    }
    const int socket = ::accept4(listener, nullptr, nullptr, SOCK_CLOEXEC);
    std::string text(4096, '\0');
    const ssize_t size = ::recv(socket, text.data(), text.size(), 0);
    ::close(socket);
    return text.substr(0, size > 0 ? static_cast<std::size_t>(size) : 0);
}

} // namespace

TEST_F(LocalSocketTest, ClientReachesItAndNamesItsUser)
{
    const base::Descriptor listener = base::listenLocalSocket(fHome, 4);
    struct stat status
    {
    };
    ASSERT_EQ(::stat((fHome + "/" + base::kLocalSocketName).c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, 0600u);
    std::string request;
    std::thread server([&] { request = requestOf(listener.get()); });
    CIMClient client;
    client.connectLocal();
    EXPECT_THROW(client.getQualifier("root", "Key"), CIMClientMalformedHTTPException);
    server.join();
    EXPECT_EQ(request.rfind("POST /cimom HTTP/1.1\r\nHOST: \r\n", 0), 0u) << request;
    EXPECT_NE(request.find("\r\nPegasusAuthorization: Local \""), std::string::npos) << request;

    base::removeLocalSocket(fHome);
    client.disconnect();
    try {
        client.connectLocal();
        FAIL() << "connected to nobody";
    } catch (const CannotConnectException& exception) {
        EXPECT_EQ(exception.getMessage(), "Cannot connect to local CIM server. Connection failed.");
    }
}

TEST_F(LocalSocketTest, ConnectingIsBoundedWithNoTimeLeftToo)
{
    const base::Descriptor listener = base::listenLocalSocket(fHome, 0);
    std::vector<base::Descriptor> waiting;
    for (bool isFull = false; !isFull;) { // the kernel takes a few that nobody accepts
        try {
            waiting.push_back(base::connectLocalSocket(
                fHome, base::Deadline::after(std::chrono::milliseconds(waiting.empty() ? 1000 : 0))));
        } catch (const std::system_error&) {
            isFull = true;
        }
        ASSERT_LT(waiting.size(), 100u);
    }
    EXPECT_FALSE(waiting.empty());
}

TEST_F(LocalSocketTest, SocketFileLeftOverIsReplaced)
{
    base::listenLocalSocket(fHome, 1).reset(); // as after a crash: the file stays
    const base::Descriptor listener = base::listenLocalSocket(fHome, 1);
    const base::Descriptor client = base::connectLocalSocket(fHome, base::Deadline::after(std::chrono::seconds(1)));
    EXPECT_TRUE(client);
}
