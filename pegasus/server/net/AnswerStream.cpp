// SPDX-License-Identifier: MIT
#include "pegasus/server/net/AnswerStream.h"

#include "pegasus/base/PercentCoding.h"

#include <charconv>
#include <cstdio>
#include <iterator>

namespace Pegasus::server {

namespace {

// Holds most answers that are one object: their text is not moved while it grows.
constexpr std::size_t kUsualBytes = 16u << 10;
constexpr std::size_t kUsualHeadBytes = 256;

iovec part(std::string_view text)
{
    return {const_cast<char*>(text.data()), text.size()};
}

std::string trailerOf(const CimStatus& status)
{
    if (status.code == 0) {
        return {};
    }
    return "CIMStatusCode: " + std::to_string(status.code) +
           "\r\nCIMStatusCodeDescription: " + base::percentEncoded(status.text, base::PercentSet::kUnreserved) + "\r\n";
}

} // namespace

AnswerStream::AnswerStream(SocketStream& stream, Options options) : fStream(stream), fOptions(std::move(options)) {}

std::string AnswerStream::makeHead(std::size_t length) const
{
    std::string head;
    head.reserve(kUsualHeadBytes);
    head += "HTTP/1.1 200 OK\r\n";
    if (!fOptions.isForServer) {
        head += "Content-Type: application/xml; charset=utf-8\r\n";
    }
    if (isChunked()) {
        head += "transfer-encoding: chunked\r\n";
    } else {
        char text[64];
        std::snprintf(text, sizeof text, "content-length: %010zu\r\n", length);
        head += text;
    }
    if (!fOptions.isForServer) {
        appendCimFields(head);
    }
    if (fOptions.closes) {
        head += "Connection: close\r\n";
    }
    return head += "\r\n";
}

void AnswerStream::appendCimFields(std::string& head) const
{
    const std::string& prefix = fOptions.extensionPrefix;
    if (prefix.size() > 1) {
        head += "Ext:\r\nCache-Control: no-cache\r\nMan: http://www.dmtf.org/cim/mapping/http/v1.0; ns=";
        head.append(prefix, 0, prefix.size() - 1).append("\r\n");
    }
    head.append(prefix).append("CIMOperation: MethodResponse\r\n");
    if (isChunked()) {
        head += "Trailer: CIMStatusCode, CIMStatusCodeDescription, Content-Language\r\n";
    }
}

void AnswerStream::write(std::string_view bytes)
{
    if (fPending.empty()) {
        fPending.reserve(kUsualBytes);
    }
    if (!isChunked()) {
        if (fPending.size() + bytes.size() > fOptions.maxBufferedBytes) {
            throw AnswerTooLarge("The answer is larger than maxBufferedAnswerBytes; ask for it with TE: trailers");
        }
        fPending.append(bytes);
    } else if (fPending.size() + bytes.size() < kChunkBytes) {
        fPending.append(bytes);
    } else {
        sendChunk(bytes, {});
    }
}

// Sends what is pending and `more` as one chunk, then `ending`.
void AnswerStream::sendChunk(std::string_view more, std::string_view ending)
{
    const std::string head = fStarted ? std::string() : makeHead(0);
    fStarted = true;
    const std::size_t size = fPending.size() + more.size();
    char sizeLine[32];
    char* sizeEnd = sizeLine;
    if (size > 0) {
        sizeEnd = std::to_chars(sizeLine, std::end(sizeLine) - 2, size, 16).ptr;
        *sizeEnd++ = '\r';
        *sizeEnd++ = '\n';
    }
    iovec parts[] = {part(head),
                     part({sizeLine, static_cast<std::size_t>(sizeEnd - sizeLine)}),
                     part(fPending),
                     part(more),
                     part(size == 0 ? "" : "\r\n"),
                     part(ending)};
    fStream.writeAll(parts, std::size(parts), fOptions.writeTimeout);
    fPending.clear();
}

void AnswerStream::sendWhole()
{
    const std::string head = makeHead(fPending.size());
    fStarted = true;
    iovec parts[] = {part(head), part(fPending)};
    fStream.writeAll(parts, std::size(parts), fOptions.writeTimeout);
    fPending.clear();
}

void AnswerStream::finish(const CimStatus& status)
{
    if (isChunked()) {
        sendChunk({}, "0\r\n" + trailerOf(status) + "\r\n");
    } else {
        sendWhole();
    }
}

void sendHttpError(SocketStream& stream, const HttpError& error, std::chrono::milliseconds timeout)
{
    std::string head = "HTTP/1.1 " + std::to_string(error.status()) + " " + httpReason(error.status()) + "\r\n";
    if (!error.cimError().empty()) {
        head += "CIMError: " + error.cimError() + "\r\n";
    }
    if (!error.detail().empty()) {
        head += "PGErrorDetail: " + base::percentEncoded(error.detail(), base::PercentSet::kUnreserved) + "\r\n";
    }
    head += error.closes() ? "Content-Length: 0\r\nConnection: close\r\n\r\n" : "Content-Length: 0\r\n\r\n";
    iovec whole = part(head);
    stream.writeAll(&whole, 1, timeout);
}

} // namespace Pegasus::server
