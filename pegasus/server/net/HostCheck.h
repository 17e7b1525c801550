#pragma once

#include "pegasus/server/net/HttpRequest.h"

namespace Pegasus::server {

// Refuses requests that a web page has a browser send: a page can have its own host name resolve to 127.0.0.1, and the
// browser's connections pass the check of the peer when root or the server's user sits before it.
//
// A Host header must name this machine: localhost, localhost.localdomain, a name below .localhost, the machine's host
// name, or a loopback address (127.0.0.0/8, [::1], [::ffff:127.0.0.0]/104); a port may follow, and an empty one counts
// as absent. An Origin header, which browsers add, must name such a host too.
// Throws: HttpError 403. Thread: any.
void requireLocalHost(const HttpRequest& http);

} // namespace Pegasus::server
