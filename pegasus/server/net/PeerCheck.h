#pragma once

#include "pegasus/base/Descriptor.h"

#include <cstdint>
#include <optional>
#include <string>

#include <sys/types.h>

namespace Pegasus::server {

// Finds out whose process is at the other end of an accepted TCP connection, by the kernel's word, before a byte is
// read from it.
//
// The peer's socket is looked up by its address pair, through NETLINK_SOCK_DIAG, or in /proc/net/tcp where the kernel
// lacks that. The kernel is believed only about a socket with a non-zero inode in the state ESTABLISHED or CLOSE_WAIT,
// and only when the accepted connection is still open after the look-up: a peer that resets the connection frees its
// port, and the pair may then belong to another user's new connection.
//
// Thread: one at a time.
class TcpPeerLookup
{
  public:
    // `table` is read where the kernel has no NETLINK_SOCK_DIAG.
    explicit TcpPeerLookup(std::string table = "/proc/net/tcp") : fTable(std::move(table)) {}

    // Returns: the peer's user id; nothing when the kernel does not report an owner.
    // Blocks: for one exchange with the kernel, at most 1 s.
    std::optional<uid_t> userOf(int fd);
    // The same from one source alone.
    std::optional<uid_t> userFromNetlink(int fd);
    std::optional<uid_t> userFromTable(int fd) const;

  private:
    struct Answer
    {
        bool known = false; // whether the kernel answered at all
        std::optional<uid_t> user;
    };
    Answer askKernel(int fd);

    std::string fTable;
    base::Descriptor fNetlink; // kept open between look-ups
    std::uint32_t fSequence = 0;
};

// Returns: the user at the other end of a Unix socket, as of its connect().
std::optional<uid_t> localPeerUser(int fd);

// Returns: whether a peer is served: only the server's own user and root are.
bool mayConnect(std::optional<uid_t> peer);

} // namespace Pegasus::server
