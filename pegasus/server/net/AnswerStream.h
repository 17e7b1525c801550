#pragma once

#include "pegasus/server/net/HttpRequest.h"
#include "pegasus/server/net/SocketStream.h"

#include <string>
#include <string_view>

namespace Pegasus::server {

// A CIM status with its text, symbolic name in front ("CIM_ERR_NOT_FOUND: Nope").
struct CimStatus
{
    unsigned code = 0; // 0 is success
    std::string text;
};

// An answer grew past what may be kept in memory for a client that needs its length first.
class AnswerTooLarge : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// The body of one "200 OK" answer, streamed to the peer.
//
// Chunked, it goes out in blocks of about kChunkBytes as it is written; a status can follow in the trailer. With a
// length, it is kept until finish() and a status has to be part of the body.
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
        std::chrono::milliseconds writePatience = std::chrono::seconds(20);
        bool closes = false; // the connection ends behind the answer
        std::string extensionPrefix;
        const char* operation = "MethodResponse";
    };

    AnswerStream(SocketStream& stream, Options options);

    // Throws: SocketTimeout, std::system_error, AnswerTooLarge.
    void write(std::string_view bytes);
    // Ends the answer. Requires: no status other than success with a length.
    void finish(const CimStatus& status = {});

    bool isChunked() const { return fOptions.framing == Framing::kChunkedWithTrailer; }
    // Whether bytes have left already; until then discard() takes back what was written.
    bool hasStarted() const { return fStarted; }
    void discard() { fPending.clear(); }

  private:
    std::string makeHead(std::size_t length) const;
    void sendChunk(std::string_view more, std::string_view ending);
    void sendWhole();

    SocketStream& fStream;
    Options fOptions;
    std::string fPending;
    bool fStarted = false;
};

// Sends an HTTP error with an empty body.
void sendHttpError(SocketStream& stream, const HttpError& error, std::chrono::milliseconds patience);

} // namespace Pegasus::server
