#pragma once

#include "pegasus/client/ClientLimits.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace Pegasus::client {

// The fields of a CIM server's answer that mean something to a client; those of the trailer are entered when they
// come.
struct ResponseFields
{
    unsigned status = 0;
    std::string reason;
    bool hasCimOperation = false;
    std::string cimOperation;
    bool hasContentType = false;
    std::string contentType;
    std::string cimError;
    std::string errorDetail; // as sent, percent-encoded
    bool hasStatusCode = false;
    std::string statusCode;
    std::string statusDescription; // as sent, percent-encoded
};

// One HTTP/1.x response, read piece by piece: lengths, chunks and trailers, or up to the end of the connection.
// Throws: CIMClientMalformedHTTPException.
class HttpResponse
{
  public:
    // Called when the header is complete; and with each piece of the body.
    using HeaderHandler = std::function<void(const ResponseFields&)>;
    using BodyHandler = std::function<void(std::string_view)>;

    HttpResponse(const ClientLimits& limits, HeaderHandler onHeader, BodyHandler onBody);
    ~HttpResponse();
    HttpResponse(const HttpResponse&) = delete;
    HttpResponse& operator=(const HttpResponse&) = delete;

    // The next bytes from the connection, split anywhere. Bytes behind the response are ignored; a connection that has
    // them is not used again.
    void feed(std::string_view bytes);
    // The connection has ended. Returns: whether the response had, too.
    bool endOfConnection();

    bool hasHeader() const;
    bool isComplete() const;
    // May the connection be used again? Requires: complete.
    bool keepsAlive() const;
    const ResponseFields& fields() const;

  private:
    class Parser;

    void feedHeader(std::string_view& bytes);
    void checkStart() const;
    void put(std::string_view bytes);
    std::size_t putSome(std::string_view bytes);

    ClientLimits fLimits;
    std::unique_ptr<Parser> fParser;
    std::string fPending; // bytes that the parser could not use yet
    bool fHasSurplus = false;
};

} // namespace Pegasus::client
