#pragma once

#include "pegasus/wire/XmlLimits.h"

#include <cstddef>
#include <cstdint>

namespace Pegasus::client {

// Bounds on a server's answer. Over one of the first two: CIMClientMalformedHTTPException; over one of the XML's:
// CIMClientXmlException. Both name the limit.
struct ClientLimits
{
    // Bytes of the status line and the header fields, and again of the trailer fields.
    std::uint32_t maxHeaderBytes = 64 * 1024;
    // Bytes of the body, without the framing of chunks.
    std::uint64_t maxBodyBytes = std::uint64_t(4) * 1024 * 1024 * 1024;
    wire::XmlLimits xml;
};

} // namespace Pegasus::client
