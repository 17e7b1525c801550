#pragma once

#include <optional>
#include <string>

#include <sys/types.h>

namespace Pegasus::server {

// Says who is at the other end of an accepted connection, by the kernel's word, before a byte is read from it.
//
// A loopback TCP peer is looked up as the socket whose own address pair is ours turned round: by NETLINK_SOCK_DIAG, or
// in /proc/net/tcp where the kernel lacks that. It is believed only with a non-zero inode and in the state ESTABLISHED
// or CLOSE_WAIT; a peer that has closed already is reported without its user, so it counts as unknown. Returns: the
// peer's user id, or nothing when the kernel does not answer for it. Blocks: for one exchange with the kernel.
std::optional<uid_t> tcpPeerUser(int fd);
std::optional<uid_t> tcpPeerUserFromNetlink(int fd);
std::optional<uid_t> tcpPeerUserFromTable(int fd, const std::string& table = "/proc/net/tcp");

// The same for a connection on a Unix socket.
std::optional<uid_t> localPeerUser(int fd);

// The server's own user and root are served, nobody else.
bool mayConnect(std::optional<uid_t> peer);

} // namespace Pegasus::server
