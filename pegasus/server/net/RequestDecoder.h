// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/CimRequest.h"
#include "pegasus/server/net/HttpRequest.h"

namespace Pegasus::server {

// Decodes HTTP requests to CIM operations: checks the CIM headers (DSP0200, 6) and the message around the call
// (DSP0201), and that both name the same method and object. One decoder serves a connection.
//
// Thread: one at a time.
class RequestDecoder
{
  public:
    explicit RequestDecoder(const wire::XmlLimits& limits) : fDocument(limits), fElements(limits) {}

    // The request is valid until the next call.
    // Throws: HttpError, with the CIMError and the detail that OpenPegasus gives.
    CimRequest decode(const HttpRequest& http);

  private:
    CimRequest decodeMessage(wire::XmlElement cim);
    void decodeIntrinsic(wire::XmlElement call, CimRequest& request);
    void decodeExtrinsic(wire::XmlElement call, CimRequest& request);
    std::string resolvedAttribute(wire::XmlElement element, std::string_view raw);

    wire::XmlDocument fDocument;
    wire::ElementDecoder fElements;
    std::string fText; // what the request's elements point into
    std::string fScratch;
};

// Throws the HttpError that answers a request with this fault in its content.
[[noreturn]] void failFor(const wire::XmlError& error);

} // namespace Pegasus::server
