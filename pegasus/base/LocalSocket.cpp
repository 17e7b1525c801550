// SPDX-License-Identifier: MIT
#include "pegasus/base/LocalSocket.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <system_error>

#include <fcntl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/time.h>
#include <sys/un.h>
#include <unistd.h>

namespace Pegasus::base {

const char* const kLocalSocketName = "cimxml.socket";

namespace {

[[noreturn]] void failAtSocket(const char* operation, const std::string& home)
{
    throw std::system_error(errno, std::generic_category(),
                            std::string(operation) + " " + home + "/" + kLocalSocketName);
}

Descriptor openHome(const std::string& home)
{
    Descriptor fd(::open(home.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC));
    if (!fd) {
        failAtSocket("cannot open the folder of", home);
    }
    return fd;
}

Descriptor newSocket(const std::string& home)
{
    Descriptor fd(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
    if (!fd) {
        failAtSocket("cannot create a socket for", home);
    }
    return fd;
}

sockaddr_un addressIn(int homeFd)
{
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::snprintf(address.sun_path, sizeof(address.sun_path), "/proc/self/fd/%d/%s", homeFd, kLocalSocketName);
    return address;
}

int connectRetrying(int fd, const sockaddr_un& address)
{
    int result = -1;
    do {
        result = ::connect(fd, reinterpret_cast<const sockaddr*>(&address), sizeof(address));
    } while (result < 0 && errno == EINTR);
    return result;
}

} // namespace

std::string localSocketHome()
{
    const char* home = std::getenv("PEGASUS_HOME");
    return home ? home : "";
}

Descriptor connectLocalSocket(const std::string& home, const Deadline& deadline)
{
    const Descriptor folder(openHome(home));
    Descriptor socket(newSocket(home));
    const int timeoutMs = std::max(deadline.pollTimeoutMs(), 1); // the kernel reads 0 as for ever
    const timeval limit{timeoutMs / 1000, (timeoutMs % 1000) * 1000L};
    if (!deadline.isNever() && ::setsockopt(socket.get(), SOL_SOCKET, SO_SNDTIMEO, &limit, sizeof(limit)) < 0) {
        failAtSocket("cannot set the time-out of", home);
    }
    if (connectRetrying(socket.get(), addressIn(folder.get())) < 0) {
        failAtSocket("cannot connect to", home);
    }
    return socket;
}

Descriptor listenLocalSocket(const std::string& home, int backlog)
{
    const Descriptor folder(openHome(home));
    Descriptor socket(newSocket(home));
    if (::unlinkat(folder.get(), kLocalSocketName, 0) < 0 && errno != ENOENT) {
        failAtSocket("cannot remove", home);
    }
    // The mode of the socket file is the descriptor's own, so it keeps others out from the first moment.
    if (::fchmod(socket.get(), S_IRUSR | S_IWUSR) < 0) {
        failAtSocket("cannot set the mode of", home);
    }
    const sockaddr_un address = addressIn(folder.get());
    if (::bind(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)) < 0) {
        failAtSocket("cannot bind", home);
    }
    if (::listen(socket.get(), backlog) < 0) {
        failAtSocket("cannot listen on", home);
    }
    return socket;
}

void removeLocalSocket(const std::string& home) noexcept
{
    ::unlink((home + "/" + kLocalSocketName).c_str());
}

} // namespace Pegasus::base
