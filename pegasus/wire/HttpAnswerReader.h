// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>

namespace Pegasus::wire {

// Bounds on an answer. Over one of them: HttpAnswerError, which names it.
struct HttpAnswerLimits
{
    // Bytes of the status line and the header fields.
    std::uint32_t maxHeaderBytes = 64 * 1024;
    // Bytes of the head of one chunk with its extensions; and of the last chunk's head with the trailer fields.
    std::uint32_t maxFramingBytes = 64 * 1024;
    // Bytes of the body, the framing of chunks excluded.
    std::uint64_t maxBodyBytes = 512UL * 1024 * 1024;
};

// The fields of a CIM server's answer that mean something; those of the trailer are entered when they come.
struct HttpAnswerFields
{
    unsigned status = 0;
    std::string reason;
    std::optional<std::string> contentType;
    std::optional<std::string> cimOperation;
    std::string cimError;
    std::string errorDetail; // PGErrorDetail, percent-decoded
    std::optional<std::string> statusCode;
    std::string statusDescription; // CIMStatusCodeDescription, percent-decoded
};

// The bytes are malformed as an HTTP answer, or beyond a limit. what() is empty, or names the limit: "a header of more
// than 65536 bytes".
class HttpAnswerError : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// Reads one HTTP/1.x answer piece by piece: a body with a length, in chunks with trailers, or up to the end of the
// connection.
//
// Throws: HttpAnswerError; and what the handlers throw. After an exception the reader may only be destroyed.
// Thread: one thread at a time.
class HttpAnswerReader
{
  public:
    // Called when the header is complete.
    using HeaderHandler = std::function<void(const HttpAnswerFields&)>;
    // Called with each piece of the body as it lies in the bytes fed; valid during the call.
    using BodyHandler = std::function<void(std::string_view)>;

    HttpAnswerReader(const HttpAnswerLimits& limits, HeaderHandler onHeader, BodyHandler onBody);
    ~HttpAnswerReader();
    HttpAnswerReader(const HttpAnswerReader&) = delete;
    HttpAnswerReader& operator=(const HttpAnswerReader&) = delete;

    // The next bytes from the connection, split anywhere. Bytes after the answer are ignored; a connection that has
    // them must be closed.
    void feed(std::string_view bytes);
    // The connection has ended. Returns: whether the answer is complete.
    bool endOfConnection();

    bool hasHeader() const;
    bool isComplete() const;
    // Returns: whether the connection may be used again. Requires: isComplete().
    bool keepsAlive() const;
    const HttpAnswerFields& fields() const;

  private:
    class Parser;

    void feedHeader(std::string_view& bytes);
    void putHeader(std::string_view header);
    std::size_t put(std::string_view bytes);
    std::size_t putSome(std::string_view bytes);

    HttpAnswerLimits fLimits;
    std::unique_ptr<Parser> fParser;
    std::string fPending; // bytes that the parser could not use yet
    bool fHasSurplus = false;
};

// Whether these bytes of a chunked body, from a chunk's head on, may be the last chunk, cut. Beast asserts five bytes
// ("0", CRLF, CRLF) once it has seen the last chunk's line, so a reader waits for them. They come: a chunked body that
// goes on has at least five bytes more.
// Thread: any.
bool mayBeCutLastChunk(std::string_view bytes) noexcept;

} // namespace Pegasus::wire
