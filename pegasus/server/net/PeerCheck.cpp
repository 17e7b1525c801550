#include "pegasus/server/net/PeerCheck.h"

#include <sys/socket.h>

namespace Pegasus::server {

std::optional<uid_t> localPeerUser(int fd)
{
    ucred peer = {};
    socklen_t size = sizeof peer;
    if (::getsockopt(fd, SOL_SOCKET, SO_PEERCRED, &peer, &size) != 0) {
        return std::nullopt;
    }
    return peer.uid;
}

} // namespace Pegasus::server
