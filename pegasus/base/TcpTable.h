// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/TcpSocket.h"

#include <string>

namespace Pegasus::base {

// Looks a socket up in a table such as /proc/net/tcp, and then in the one of IPv6, with a "6" after its name.
// Returns: nullopt when the socket is absent from both, or the tables themselves are absent.
// Thread: any.
std::optional<TcpSocketRecord> findInTcpTable(const std::string& table, const TcpSocketQuery& query);

} // namespace Pegasus::base
