// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/client/KnownClasses.h"
#include "pegasus/client/Request.h"
#include "pegasus/client/ResponseReader.h"
#include "pegasus/client/ServerConnection.h"
#include "pegasus/wire/HttpAnswerReader.h"
#include "pegasus/wire/XmlLimits.h"
#include "pegasus/wire/instances/KnownInstances.h"

#include <Pegasus/Common/String.h>

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <sys/types.h>

namespace Pegasus::client {

// Bounds on a server's answer. Over one of HTTP's: CIMClientMalformedHTTPException; over one of XML's:
// CIMClientXmlException. Both name the limit.
struct ClientLimits
{
    wire::HttpAnswerLimits http;
    wire::XmlLimits xml;
};

} // namespace Pegasus::client

namespace Pegasus {

// The inside of a CIMClient: an address, a connection that is opened when it is needed, and the exchange of one request
// and its answer within the time-out.
class CIMClientRep
{
  public:
    using ContentHandler = client::ResponseReader::ContentHandler;
    using OfferHandler = client::ResponseReader::OfferHandler;

    CIMClientRep() = default;
    explicit CIMClientRep(const client::ClientLimits& limits) : fLimits(limits) {}

    Uint32 timeoutMs() const { return fTimeoutMs; }
    void setTimeoutMs(Uint32 timeoutMs) { fTimeoutMs = timeoutMs; }
    std::size_t maxDecodedBytes() const { return fLimits.xml.maxDecodedBytes; }
    void setMaxDecodedBytes(std::size_t bytes)
    {
        fLimits.xml.maxDecodedBytes = bytes;
        fDecoder = wire::ElementDecoder(fLimits.xml);
    }

    // Throws: AlreadyConnectedException, and as Connection::open.
    void connect(const client::ServerAddress& address);
    void disconnect();

    // Sends the request, once, and passes each element of the result to `onContent`, after it was offered to `onOffer`.
    // After a failure the connection is closed and the next call opens a new one. An ERROR element with the code 0 is a
    // success with an empty result. Throws: what CIMClient's operations throw.
    void exchange(const client::Request& request, const ContentHandler& onContent, const OfferHandler& onOffer = {});

    // What this client knows of what it has read.
    wire::KnownInstances& knownInstances() { return fKnownInstances; }
    client::KnownClasses& knownClasses() { return fKnownClasses; }

  private:
    void exchangeOnce(const client::Request& request, const ContentHandler& onContent, const OfferHandler& onOffer);
    std::string_view localUser();
    void send(const std::string& message, const base::Deadline& deadline);
    void receive(wire::HttpAnswerReader& response, const base::Deadline& deadline);

    client::ClientLimits fLimits;
    wire::ElementDecoder fDecoder{fLimits.xml}; // kept, so that the names of all answers share their texts
    wire::KnownInstances fKnownInstances{fLimits.xml};
    client::KnownClasses fKnownClasses;
    std::optional<client::ServerAddress> fAddress;
    std::string fHost;                                       // of fAddress, as the Host field has it
    std::optional<std::pair<uid_t, std::string>> fLocalUser; // the last one, and the name
    client::ServerConnection fConnection;
    std::vector<char> fReceiveBuffer;
    Uint32 fTimeoutMs = 20000;
};

} // namespace Pegasus
