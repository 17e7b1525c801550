// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/HttpRequest.h"
#include "pegasus/server/net/SocketStream.h"

#include <string>
#include <string_view>

namespace Pegasus::server {

// The outcome of an operation. The text begins with the code's symbolic name: "CIM_ERR_NOT_FOUND: Nope".
struct CimStatus
{
    unsigned code = 0; // 0 is success
    std::string text;
};

// An answer is larger than what is kept in memory for a client that needs its length first.
class AnswerTooLarge : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// The body of one "200 OK" answer, streamed to the peer.
//
// Chunked, it is sent in blocks of about kChunkBytes as it is written; a status can follow in the trailer. With a
// length, it is kept until finish(), and a status has to be part of the body.
//
// Throws: SocketTimeout; std::system_error when the connection breaks.
// Thread: one at a time.
class AnswerStream
{
  public:
    static constexpr std::size_t kChunkBytes = 64u << 10;

    enum class Framing
    {
        kChunkedWithTrailer,
        kContentLength
    };

    struct Options
    {
        Framing framing = Framing::kChunkedWithTrailer;
        std::size_t maxBufferedBytes = 256u << 20; // of an answer with a length
        std::chrono::milliseconds writeTimeout = std::chrono::seconds(20);
        bool closes = false;         // whether the connection ends after the answer
        std::string extensionPrefix; // of an M-POST: HttpRequest::extensionPrefix
        bool isForServer = false;    // an agent's: its reader needs the status and the framing alone
    };

    AnswerStream(SocketStream& stream, Options options);

    // Throws: AnswerTooLarge.
    void write(std::string_view bytes);
    // Ends the answer. Requires: with a length, the status is success.
    void finish(const CimStatus& status = {});

    bool isChunked() const { return fOptions.framing == Framing::kChunkedWithTrailer; }
    // Whether bytes have been sent already.
    bool hasStarted() const { return fStarted; }
    // Takes back what has been written since the last bytes were sent.
    void discard() { fPending.clear(); }

  private:
    std::string makeHead(std::size_t length) const;
    void appendCimFields(std::string& head) const;
    void sendChunk(std::string_view more, std::string_view ending);
    void sendWhole();

    SocketStream& fStream;
    Options fOptions;
    std::string fPending;
    bool fStarted = false;
};

// Sends an HTTP error with an empty body. Throws: SocketTimeout; std::system_error when the connection breaks.
void sendHttpError(SocketStream& stream, const HttpError& error, std::chrono::milliseconds timeout);

} // namespace Pegasus::server
