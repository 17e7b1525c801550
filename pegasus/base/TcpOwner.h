// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/SocketDiag.h"

#include <optional>
#include <string>

#include <sys/types.h>

namespace Pegasus::base {

// Finds out whose process is at the other end of a TCP connection within this machine, by the kernel's word, before a
// byte is read from it or sent to it.
//
// A socket is looked up by its addresses, through NETLINK_SOCK_DIAG, or in /proc/net/tcp where the kernel lacks that.
// The kernel is believed only about a socket with a non-zero inode, and only when the connection is still open after
// the look-up: a peer that resets the connection frees its port, and the addresses may then belong to another user's
// new connection.
//
// Thread: one at a time.
class TcpOwnerLookup
{
  public:
    // `table`, and the one of IPv6 with a "6" after its name, are read where the kernel lacks NETLINK_SOCK_DIAG.
    explicit TcpOwnerLookup(std::string table = "/proc/net/tcp") : fTable(std::move(table)) {}

    // Returns: the user of the socket at the other end; nullopt when the kernel leaves it out, as for a
    // connection that its server is still to accept.
    // Blocks: for one exchange with the kernel, at most 1 s.
    std::optional<uid_t> userOf(int fd);
    // Returns: the user who serves a connection: of the accepted socket or, before it is accepted, of the listener.
    // Requires: fd is the connecting side. Blocks: as userOf(), twice.
    std::optional<uid_t> serverOf(int fd);

    // The same from one source alone.
    std::optional<uid_t> userFromNetlink(int fd);
    std::optional<uid_t> userFromTable(int fd) const;
    std::optional<uid_t> listenerFromNetlink(int fd);
    std::optional<uid_t> listenerFromTable(int fd) const;

  private:
    struct Answer
    {
        bool known = false; // whether the kernel answered at all
        std::optional<uid_t> user;
    };
    Answer askForPeer(int fd);
    Answer askForListener(int fd);

    std::string fTable;
    SocketDiag fKernel;
};

} // namespace Pegasus::base
