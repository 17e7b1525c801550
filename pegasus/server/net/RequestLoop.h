// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/net/HttpRequestReader.h"
#include "pegasus/server/net/RequestDecoder.h"

#include <functional>

namespace Pegasus::server {

// What bounds a connection. The settings are asked for before each request, so that a change takes effect at once.
struct ConnectionSettings
{
    HttpLimits http;
    ReadTimes times;
    std::chrono::milliseconds writeTimeout = std::chrono::seconds(20);
    std::size_t maxXmlDepth = 64;
    std::size_t maxBufferedAnswerBytes = 256u << 20;
    bool strictHosts = false; // whether Host and Origin must name the loopback interface
};

// Carries out operations.
// Thread: any; connections call it at the same time.
class RequestHandler
{
  public:
    virtual ~RequestHandler() = default;

    // Writes the answer's elements.
    // Throws: CIMException or OperationFailed for an error of the operation; wire::XmlError for a parameter of another
    // form than the operation needs, while the answer is still empty.
    virtual void handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer) = 0;
    // Returns: false for an unknown intrinsic method. It is answered with an ERROR element, as OpenPegasus does, also
    // when the client reads trailers.
    virtual bool knowsMethod(const CimRequest& request) const = 0;
};

// Serves the requests of one connection, one after the other, until the peer closes or breaks the protocol. This is the
// boundary of a connection's thread: whatever is thrown below it is logged and ends this connection alone.
// Requires: stream and handler outlive the call.
// Blocks: until the connection ends.
void serveConnection(SocketStream& stream, RequestHandler& handler, const std::function<ConnectionSettings()>& settings,
                     CimAnswer::Envelope envelope) noexcept;

} // namespace Pegasus::server
