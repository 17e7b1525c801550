// SPDX-License-Identifier: MIT
#include "pegasus/client/TreeRoute.h"

#include "pegasus/base/TcpOwner.h"
#include "pegasus/base/Text.h"
#include "pegasus/base/Users.h"

#include <Pegasus/Common/Exception.h>

#include <filesystem>
#include <system_error>

#include <dlfcn.h>
#include <netinet/in.h>
#include <sys/socket.h>

namespace Pegasus::client {

namespace {

namespace fs = std::filesystem;

// The reason may name a folder, whose name may be any bytes.
[[noreturn]] void refuse(const std::string& address, const std::string& reason)
{
    throw CannotConnectException(base::fromUtf8Repaired("Cannot connect to " + address + ". " + reason + "."));
}

base::TreeLockStatus lockOf(const std::string& home, const std::string& address)
{
    try {
        return base::readTreeLock(home);
    } catch (const std::system_error& error) {
        refuse(address, std::string("The tree's server cannot be found: ") + error.what());
    }
}

std::string loadedPath()
{
    Dl_info info = {};
    if (::dladdr(reinterpret_cast<const void*>(&homeOfLibrary), &info) == 0 || !info.dli_fname) {
        return {};
    }
    std::error_code error; // of the working directory
    const fs::path path = fs::absolute(info.dli_fname, error);
    return error ? std::string() : path.string();
}

// Taken while the library is loaded: a relative path means the working directory of that moment.
const std::string kTreeHome = homeOfLibrary(loadedPath());

} // namespace

Route routeTo(Uint32 port, const base::TreeLockStatus& lock)
{
    if (lock.state == base::TreeLockState::kAbsent) {
        return Route::kTcp;
    }
    const bool serves = lock.state == base::TreeLockState::kHeld && port != 0 && lock.record.port == port;
    return serves ? Route::kTreeSocket : Route::kRefused;
}

std::string homeOfLibrary(const std::string& libraryPath)
{
    const fs::path folder = fs::path(libraryPath).lexically_normal().parent_path();
    const fs::path home = folder.parent_path();
    return folder.filename() == "lib" && home.filename() == "pegasus" ? home.string() : std::string();
}

const std::string& treeHome()
{
    return kTreeHome;
}

bool isLoopback(const sockaddr& address)
{
    if (address.sa_family == AF_INET) {
        const auto& ip = reinterpret_cast<const sockaddr_in&>(address).sin_addr;
        return ntohl(ip.s_addr) >> 24 == IN_LOOPBACKNET;
    }
    if (address.sa_family == AF_INET6) {
        const auto& ip = reinterpret_cast<const sockaddr_in6&>(address).sin6_addr;
        return IN6_IS_ADDR_LOOPBACK(&ip) || (IN6_IS_ADDR_V4MAPPED(&ip) && ip.s6_addr[12] == IN_LOOPBACKNET);
    }
    return false;
}

bool isReachedBySocket(const std::string& home, Uint32 port, const std::string& address)
{
    if (home.empty()) {
        return false;
    }
    const base::TreeLockStatus lock = lockOf(home, address);
    const Route route = routeTo(port, lock);
    if (route == Route::kRefused) {
        refuse(address, lock.state == base::TreeLockState::kHeld
                            ? "The server of " + home + " serves port " + std::to_string(lock.record.port)
                            : "The server of " + home + " does not run");
    }
    return route == Route::kTreeSocket;
}

std::string serverFault(int fd, Uint32 port)
{
    const std::optional<uid_t> user = base::TcpOwnerLookup().serverOf(fd);
    if (base::isTrustedUser(user)) {
        return {};
    }
    if (!user) {
        return "The kernel does not report who serves port " + std::to_string(port);
    }
    return "Port " + std::to_string(port) + " is served by user " + std::to_string(*user) +
           ", who is neither root nor the user of this process";
}

} // namespace Pegasus::client
