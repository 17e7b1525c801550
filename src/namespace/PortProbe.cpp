// SPDX-License-Identifier: MIT
#include "src/namespace/PortProbe.h"

#include "src/common/CoreLog.h"

#include <host/TVRXException.h>

#include <cerrno>
#include <cstring>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

namespace NKOLVRX20 {

TPortProbe::TPortProbe(const std::string& host) : fHost(host), fDescriptor(::socket(AF_INET, SOCK_STREAM, 0))
{
    if (fDescriptor == -1) {
        LogFailure("TPEGASUSNamespace::getAvailablePort failed: no socket: ", std::strerror(errno));
        throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
    }
    // A program that the host starts meanwhile would inherit the socket and keep the port.
    static_cast<void>(::fcntl(fDescriptor, F_SETFD, FD_CLOEXEC));
}

TPortProbe::~TPortProbe()
{
    static_cast<void>(::close(fDescriptor));
}

// SO_REUSEADDR stays off: a port on which a connection still ages in TIME_WAIT counts as taken.
bool TPortProbe::CanBind(unsigned short port) const
{
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = ::inet_addr(fHost.c_str());
    address.sin_port = htons(port);
    return ::bind(fDescriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0;
}

} // namespace NKOLVRX20
