// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/HttpRequest.h"
#include "pegasus/server/net/SocketStream.h"

#include <functional>
#include <memory>
#include <string_view>

namespace Pegasus::server {

// How long a client may take; 0 means any time.
struct ReadTimes
{
    std::chrono::milliseconds idle = std::chrono::milliseconds::zero(); // before the first byte
    std::chrono::milliseconds request = std::chrono::seconds(30);       // from the first byte to the last
};

// Takes one request apart as its bytes arrive, split anywhere.
// Thread: one at a time.
class HttpRequestParser
{
  public:
    explicit HttpRequestParser(const HttpLimits& limits);
    ~HttpRequestParser();

    // Feeds bytes. Returns: how many were taken; the rest has to be offered again, with more bytes after it. After the
    // head, the rest of an unfinished request is shorter than maxHeaderBytes.
    // Throws: HttpError (501 malformed request line, 400 bad header, 413 body, 431 head, chunk extension or trailer).
    std::size_t put(std::string_view bytes);

    bool isHeaderDone() const;
    bool isDone() const;
    // Returns: whether the client waits for "100 Continue" before it sends the body. Requires: isHeaderDone().
    bool expectsContinue() const;

    // Requires: isDone(). The parser is spent afterwards.
    HttpRequest take();

  private:
    std::size_t parse(std::string_view bytes);
    std::size_t putHead(std::string_view bytes);
    std::size_t putBody(std::string_view bytes);

    class Impl;
    std::unique_ptr<Impl> fImpl;
};

// Reads one request after the other from a connection. Bytes after a request are kept for the next.
// Thread: one at a time.
class HttpRequestReader
{
  public:
    // Requires: the stream outlives this.
    explicit HttpRequestReader(SocketStream& stream) : fStream(stream) {}

    // Returns: false when the peer has closed, or stayed silent for the idle time, between two requests.
    // Throws: HttpError, 408 among them; std::system_error when the connection breaks.
    // Blocks: as long as `times` allow.
    bool read(HttpRequest& request, const HttpLimits& limits, const ReadTimes& times);

  private:
    bool waitForRequest(const ReadTimes& times);
    bool fill(const base::Deadline& deadline);

    SocketStream& fStream;
    std::vector<char> fBuffer;
    std::size_t fBegin = 0; // between the two: read, and still to be parsed
    std::size_t fEnd = 0;
};

} // namespace Pegasus::server
