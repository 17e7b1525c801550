// SPDX-License-Identifier: MIT
#include "pegasus/client/CIMClientRep.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/base/Users.h"
#include "pegasus/wire/ContentType.h"

#include <Pegasus/Client/CIMClientException.h>

#include <atomic>

#include <unistd.h>

namespace Pegasus {
namespace {

using base::Deadline;
using client::ResponseReader;
using wire::HttpAnswerFields;
using wire::HttpAnswerReader;
using Result = client::ServerConnection::Result;

constexpr std::size_t kReceiveBytes = 64UL * 1024;
constexpr const char* kClosed = "Connection closed by CIM Server.";

std::string nextMessageId()
{
    static std::atomic<Uint32> fgNext{1000};
    return std::to_string(fgNext.fetch_add(1, std::memory_order_relaxed));
}

// Text of a peer: UTF-8 if it is, else each byte a character.
String toString(std::string_view text)
{
    try {
        return base::fromUtf8(text);
    } catch (const Exception&) {
        String result;
        for (const char c : text) {
            result.append(Char16(static_cast<unsigned char>(c)));
        }
        return result;
    }
}

void checkHeader(const HttpAnswerFields& fields)
{
    if (fields.status != 200) {
        throw CIMClientHTTPErrorException(fields.status, toString(fields.reason), toString(fields.cimError),
                                          toString(fields.errorDetail));
    }
    if (!fields.cimOperation) {
        throw CIMClientMalformedHTTPException("Missing CIMOperation HTTP header");
    }
    if (!base::equalNoCase(*fields.cimOperation, "MethodResponse")) {
        throw CIMClientMalformedHTTPException("Received CIMOperation HTTP header value \"" +
                                              toString(*fields.cimOperation) + "\", expected \"MethodResponse\"");
    }
    if (fields.contentType && !wire::isXmlInUtf8(*fields.contentType)) {
        throw CIMClientMalformedHTTPException("Bad Content-Type HTTP header; " + toString(*fields.contentType));
    }
}

// The status that a header or trailer field carries.
void checkStatusField(const HttpAnswerFields& fields)
{
    if (!fields.statusCode) {
        return;
    }
    const auto code = base::parseUnsigned(*fields.statusCode);
    if (!code || *code > 0xFFFF) {
        throw CIMClientMalformedHTTPException("Bad CIMStatusCode HTTP header; " + toString(*fields.statusCode));
    }
    if (*code == CIM_ERR_SUCCESS) {
        return;
    }
    const auto status = static_cast<CIMStatusCode>(*code);
    const String description = toString(fields.statusDescription);
    throw CIMException(status, description.size() > 0 ? description : String(cimStatusCodeToString(status)));
}

[[noreturn]] void throwMalformed(const wire::HttpAnswerError& error)
{
    const std::string cause = error.what();
    throw CIMClientMalformedHTTPException(
        toString("Malformed HTTP response message" + (cause.empty() ? "." : ": " + cause + ".")));
}

// `on line 2: cause (GetClass answer, column 14)`
[[noreturn]] void throwXml(const std::string& method, const wire::XmlError& error)
{
    const std::string place = " (" + method + " answer, column " + std::to_string(error.place().column) + ")";
    throw CIMClientXmlException(error.getMessage() + toString(place));
}

} // namespace

void CIMClientRep::connect(const client::ServerAddress& address)
{
    if (fAddress) {
        throw AlreadyConnectedException();
    }
    const Deadline deadline = Deadline::after(std::chrono::milliseconds(fTimeoutMs));
    fConnection.setAddress(address);
    fConnection.open(deadline);
    fAddress = address;
    fHost = address.text();
    fLocalUser.reset();
    if (address.isLocal) {
        localUser(); // here, where no timeout is promised for the user database
    }
}

void CIMClientRep::disconnect()
{
    fConnection.close();
    fAddress.reset();
}

void CIMClientRep::exchange(const client::Request& request, const ContentHandler& onContent,
                            const OfferHandler& onOffer)
{
    if (!fAddress) {
        throw NotConnectedException();
    }
    try {
        exchangeOnce(request, onContent, onOffer);
    } catch (const CIMException&) {
        throw; // an answer like any other; the connection is still good
    } catch (const wire::XmlError& error) {
        fConnection.close();
        throwXml(request.method, error);
    } catch (const wire::HttpAnswerError& error) {
        fConnection.close();
        throwMalformed(error);
    } catch (const TypeMismatchException&) {
        fConnection.close();
        throw CIMClientResponseException("type mismatch");
    } catch (...) {
        fConnection.close();
        throw;
    }
}

void CIMClientRep::exchangeOnce(const client::Request& request, const ContentHandler& onContent,
                                const OfferHandler& onOffer)
{
    const Deadline deadline = Deadline::after(std::chrono::milliseconds(fTimeoutMs));
    if (fTimeoutMs == 0) {
        throw ConnectionTimeoutException();
    }
    const client::ExpectedResponse expected{nextMessageId(), request.method, request.isIntrinsic, request.result};
    const std::string message = client::encodeHttpRequest(request, expected.messageId, fHost,
                                                          fAddress->isLocal ? localUser() : std::string_view());
    ResponseReader reader(expected, fDecoder, onContent, deadline);
    reader.setOfferHandler(onOffer);
    HttpAnswerReader response(fLimits.http, checkHeader, [&](std::string_view body) { reader.feed(body); });
    send(message, deadline);
    receive(response, deadline);
    if (!response.isComplete()) {
        throw wire::XmlError(wire::XmlError::Kind::kInvalid, reader.place(),
                             "the connection was closed inside the answer");
    }
    if (!response.keepsAlive()) {
        fConnection.close();
    }
    checkStatusField(response.fields());
    reader.finish();
    if (reader.error() && reader.error()->getCode() != CIM_ERR_SUCCESS) {
        throw *reader.error();
    }
}

// The user database is asked once for each user that the process runs as while it is connected.
std::string_view CIMClientRep::localUser()
{
    const uid_t user = ::geteuid();
    if (!fLocalUser || fLocalUser->first != user) {
        fLocalUser.emplace(user, base::userName(user));
    }
    return fLocalUser->second;
}

// A server may act on a request whose first bytes it has, so a request is sent once. An idle connection that the server
// has given up is noticed before.
void CIMClientRep::send(const std::string& message, const Deadline& deadline)
{
    if (fConnection.isOpen() && fConnection.isStale()) {
        fConnection.close();
    }
    if (!fConnection.isOpen()) {
        fConnection.open(deadline);
    }
    // A server that closes while it is sent to may have answered all the same.
    if (fConnection.send(message, deadline) == Result::kTimedOut) {
        throw ConnectionTimeoutException();
    }
}

void CIMClientRep::receive(HttpAnswerReader& response, const Deadline& deadline)
{
    fReceiveBuffer.resize(kReceiveBytes);
    bool isFirst = true;
    while (!response.isComplete()) {
        std::size_t received = 0;
        const Result result = fConnection.receive(fReceiveBuffer.data(), fReceiveBuffer.size(), deadline, received);
        if (result == Result::kTimedOut) {
            throw ConnectionTimeoutException();
        }
        if (result == Result::kClosed) {
            fConnection.close();
            if (!response.hasHeader()) {
                throw CIMClientMalformedHTTPException(isFirst ? kClosed : "Missing CIMOperation HTTP header");
            }
            response.endOfConnection();
            break;
        }
        isFirst = false;
        response.feed(std::string_view(fReceiveBuffer.data(), received));
    }
}

} // namespace Pegasus
