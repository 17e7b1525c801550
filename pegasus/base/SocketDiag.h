// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Descriptor.h"
#include "pegasus/base/TcpSocket.h"

namespace Pegasus::base {

// Asks the kernel for TCP sockets, through NETLINK_SOCK_DIAG.
// Thread: one at a time.
class SocketDiag
{
  public:
    struct Answer
    {
        bool known = false; // false: the kernel lacks the facility, or did not answer
        std::optional<TcpSocketRecord> socket;
    };

    // Blocks: for one exchange with the kernel, at most 1 s.
    Answer find(const TcpSocketQuery& query);

  private:
    Descriptor fNetlink; // kept open between look-ups
    std::uint32_t fSequence = 0;
};

} // namespace Pegasus::base
