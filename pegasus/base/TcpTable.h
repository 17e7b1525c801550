#pragma once

#include "pegasus/base/TcpSocket.h"

#include <string>

namespace Pegasus::base {

// Looks a socket up in a table such as /proc/net/tcp, and then in the one of IPv6, with a "6" after its name.
// Returns: nothing when the socket is in neither, or there are no tables.
// Thread: any.
std::optional<TcpSocketRecord> findInTcpTable(const std::string& table, const TcpSocketQuery& query);

} // namespace Pegasus::base
