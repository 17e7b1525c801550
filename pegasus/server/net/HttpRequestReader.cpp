// SPDX-License-Identifier: MIT
#include "pegasus/server/net/HttpRequestReader.h"

#include "pegasus/wire/HttpAnswerReader.h"

#include <boost/asio/buffer.hpp>
#include <boost/beast/http/basic_parser.hpp>

#include <cstring>

namespace Pegasus::server {

namespace http = boost::beast::http;

namespace {

using boost::beast::error_code;
using BeastView = boost::beast::string_view;

constexpr std::size_t kReadBytes = 64u << 10;
constexpr std::size_t kUsualHeaderCount = 16;

std::string toStd(BeastView text)
{
    return std::string(text.data(), text.size());
}

[[noreturn]] void failForParser(const error_code& error)
{
    using After = HttpError::After;
    if (error == http::error::body_limit || error == http::error::buffer_overflow) {
        throw HttpError(413, After::kClose, "", "The request body is larger than maxBodyBytes.");
    }
    if (error == http::error::header_limit) {
        throw HttpError(431, After::kClose, "", "The request head is larger than maxHeaderBytes.");
    }
    if (error == http::error::bad_method || error == http::error::bad_target || error == http::error::bad_version) {
        throw HttpError(501, After::kClose);
    }
    throw HttpError(400, After::kClose, "", "The HTTP request is malformed: " + error.message() + ".");
}

// The `ns=NN` of a Man header: an M-POST's CIM headers are spelled "NN-CIMMethod".
std::string extensionPrefixOf(const HttpRequest& request)
{
    const std::string* man = request.header("Man");
    const std::size_t at = man != nullptr ? man->find("ns=") : std::string::npos;
    if (at == std::string::npos) {
        return {};
    }
    const std::size_t end = man->find_first_not_of("0123456789", at + 3);
    return man->substr(at + 3, std::min(end, man->size()) - at - 3) + "-";
}

void resolveExtension(HttpRequest& request)
{
    request.extensionPrefix = extensionPrefixOf(request);
    request.method = "POST";
    const std::size_t size = request.extensionPrefix.size();
    if (size < 2) {
        return;
    }
    for (auto& header : request.headers) {
        if (header.first.compare(0, size, request.extensionPrefix) == 0) {
            header.first.erase(0, size);
        }
    }
}

} // namespace

// Beast's grammar. What it reads is entered into the request at once, the trailer's fields like those of the head.
class HttpRequestParser::Impl : public http::basic_parser<true>
{
  public:
    explicit Impl(const HttpLimits& limits) : maxHeadBytes(limits.maxHeaderBytes)
    {
        header_limit(static_cast<std::uint32_t>(std::min<std::size_t>(limits.maxHeaderBytes, 1u << 30)));
        body_limit(limits.maxBodyBytes);
        request.headers.reserve(kUsualHeaderCount);
    }

    HttpRequest request;
    const std::size_t maxHeadBytes;
    std::size_t headBytes = 0; // parsed so far

  private:
    void on_request_impl(http::verb, BeastView method, BeastView, int version, error_code&) override
    {
        request.method = toStd(method);
        request.isVersion10 = version < 11;
    }
    void on_response_impl(int, BeastView, int, error_code&) override {}

    void on_field_impl(http::field, BeastView name, BeastView value, error_code&) override
    {
        request.headers.emplace_back(toStd(name), toStd(value));
    }

    void on_header_impl(error_code&) override {}

    // A length that is over the limit was refused before.
    void on_body_init_impl(const boost::optional<std::uint64_t>& length, error_code&) override
    {
        request.body.reserve(length ? static_cast<std::size_t>(*length) : 0);
    }

    std::size_t on_body_impl(BeastView body, error_code&) override
    {
        request.body.append(body.data(), body.size());
        return body.size();
    }

    void on_chunk_header_impl(std::uint64_t, BeastView, error_code&) override {}
    std::size_t on_chunk_body_impl(std::uint64_t, BeastView body, error_code& error) override
    {
        return on_body_impl(body, error);
    }
    void on_finish_impl(error_code&) override {}
};

HttpRequestParser::HttpRequestParser(const HttpLimits& limits) : fImpl(std::make_unique<Impl>(limits)) {}

HttpRequestParser::~HttpRequestParser() = default;

std::size_t HttpRequestParser::parse(std::string_view bytes)
{
    error_code error;
    const std::size_t taken = fImpl->put(boost::asio::const_buffer(bytes.data(), bytes.size()), error);
    if (error && error != http::error::need_more) {
        failForParser(error);
    }
    return taken;
}

// The head is parsed by itself and counted: Beast's own limit starts again with every piece in which a head arrives.
std::size_t HttpRequestParser::putHead(std::string_view bytes)
{
    const std::size_t taken = parse(bytes);
    fImpl->headBytes += taken;
    if (fImpl->headBytes + (isHeaderDone() ? 0 : bytes.size() - taken) > fImpl->maxHeadBytes) {
        failForParser(http::error::header_limit);
    }
    fImpl->eager(isHeaderDone());
    return taken;
}

// The parser takes a chunk's size line, and the last one with the trailer, only as a whole. It is offered at most as
// many bytes as the limit at once; a longer line is refused, the same however its bytes arrive.
std::size_t HttpRequestParser::putBody(std::string_view bytes)
{
    std::size_t taken = 0;
    while (taken < bytes.size() && !isDone()) {
        const std::string_view window = bytes.substr(taken, fImpl->maxHeadBytes);
        if (fImpl->chunked() && wire::mayBeCutLastChunk(window)) {
            break;
        }
        const std::size_t n = parse(window);
        if (n == 0 && window.size() == fImpl->maxHeadBytes) {
            throw HttpError(431, HttpError::After::kClose, "",
                            "A chunk extension or the trailer is larger than maxHeaderBytes.");
        }
        if (n == 0) {
            break;
        }
        taken += n;
    }
    return taken;
}

std::size_t HttpRequestParser::put(std::string_view bytes)
{
    const std::size_t head = isHeaderDone() ? 0 : putHead(bytes);
    if (!isHeaderDone() || isDone()) {
        return head;
    }
    return head + putBody(bytes.substr(head));
}

bool HttpRequestParser::isHeaderDone() const
{
    return fImpl->is_header_done();
}

bool HttpRequestParser::isDone() const
{
    return fImpl->is_done();
}

bool HttpRequestParser::expectsContinue() const
{
    const std::string* expect = fImpl->request.header("Expect");
    return expect != nullptr && *expect == "100-continue";
}

HttpRequest HttpRequestParser::take()
{
    HttpRequest request = std::move(fImpl->request);
    request.hasBodyLength = fImpl->content_length().has_value() || fImpl->chunked();
    if (request.method == "M-POST") {
        resolveExtension(request);
    }
    return request;
}

bool HttpRequestReader::fill(const base::Deadline& deadline)
{
    if (fBegin > 0) {
        std::memmove(fBuffer.data(), fBuffer.data() + fBegin, fEnd - fBegin);
        fEnd -= fBegin;
        fBegin = 0;
    }
    if (fEnd == fBuffer.size()) {
        fBuffer.resize(fBuffer.size() + kReadBytes); // a head larger than the buffer; the parser's limit ends it
    }
    const std::size_t n = fStream.readSome(fBuffer.data() + fEnd, fBuffer.size() - fEnd, deadline);
    fEnd += n;
    return n > 0;
}

// Returns: false when the connection or the idle time ends first.
bool HttpRequestReader::waitForRequest(const ReadTimes& times)
try {
    return fBegin < fEnd || fill(base::Deadline::afterOrNever(times.idle));
} catch (const SocketTimeout&) {
    return false;
}

bool HttpRequestReader::read(HttpRequest& request, const HttpLimits& limits, const ReadTimes& times)
try {
    if (!waitForRequest(times)) {
        return false;
    }
    const base::Deadline deadline = base::Deadline::afterOrNever(times.request);
    HttpRequestParser parser(limits);
    bool continued = false;
    for (;;) {
        fBegin += parser.put(std::string_view(fBuffer.data() + fBegin, fEnd - fBegin));
        if (parser.isDone()) {
            break;
        }
        if (parser.isHeaderDone() && !continued && parser.expectsContinue()) {
            static const char kContinue[] = "HTTP/1.1 100 Continue\r\n\r\n";
            iovec part = {const_cast<char*>(kContinue), sizeof kContinue - 1};
            fStream.writeAll(&part, 1, times.request);
            continued = true;
        }
        if (!fill(deadline)) {
            throw HttpError(400, HttpError::After::kClose, "request-not-well-formed",
                            "The connection ended within the request.");
        }
    }
    request = parser.take();
    return true;
} catch (const SocketTimeout&) {
    throw HttpError(408, HttpError::After::kClose, "", "The request did not arrive within requestReadTimeout.");
}

} // namespace Pegasus::server
