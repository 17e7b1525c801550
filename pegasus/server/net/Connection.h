#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/net/HttpRequestReader.h"
#include "pegasus/server/net/RequestDecoder.h"

#include <functional>

namespace Pegasus::server {

// What bounds a connection; asked for anew before each request, so that changes take effect at once.
struct ConnectionSettings
{
    HttpLimits http;
    ReadTimes times;
    std::chrono::milliseconds writePatience = std::chrono::seconds(20);
    std::size_t maxXmlDepth = 64;
    std::size_t maxBufferedAnswerBytes = 256u << 20;
};

// Carries out one operation.
class RequestHandler
{
  public:
    virtual ~RequestHandler() = default;

    // Writes the answer's elements. Throws: CIMException or OperationFailed for an error of the operation;
    // wire::XmlError when a parameter does not have the form that the operation needs.
    virtual void handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer) = 0;
    // Whether unknown intrinsic methods are answered inside the message, as OpenPegasus does, and not in the trailer.
    virtual bool knowsMethod(const CimRequest& request) const = 0;
};

// Serves the requests of one connection, one after the other, until the peer closes or breaks the protocol. This is the
// boundary of a connection's thread: whatever is thrown below it is logged and ends the connection, never the process.
// Requires: stream and handler outlive the call.
// Blocks: until the connection ends.
void serveConnection(SocketStream& stream, RequestHandler& handler, const std::function<ConnectionSettings()>& settings,
                     CimAnswer::Envelope envelope) noexcept;

} // namespace Pegasus::server
