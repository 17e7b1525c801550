#include "pegasus/server/net/RefusedConnections.h"

#include <sys/socket.h>

namespace Pegasus::server {

void RefusedConnections::refuse(Descriptor connection)
{
    static const char kAnswer[] = "HTTP/1.1 503 Service Unavailable\r\nPGErrorDetail: "
                                  "maxConnections%20are%20being%20served%20already.\r\n"
                                  "Content-Length: 0\r\nConnection: close\r\n\r\n";
    if (::send(connection.get(), kAnswer, sizeof kAnswer - 1, MSG_DONTWAIT | MSG_NOSIGNAL) < 0) {
        return;
    }
    ::shutdown(connection.get(), SHUT_WR);
    if (fWaiting.size() == kMost) {
        fWaiting.pop_front();
    }
    fWaiting.push_back({std::move(connection), deadlineAfter(kMoment)});
}

void RefusedConnections::expire()
{
    while (!fWaiting.empty() && Clock::now() >= fWaiting.front().deadline) {
        fWaiting.pop_front();
    }
}

} // namespace Pegasus::server
