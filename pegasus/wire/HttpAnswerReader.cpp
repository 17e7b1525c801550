// SPDX-License-Identifier: MIT
#include "pegasus/wire/HttpAnswerReader.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/PercentCoding.h"

#include <boost/asio/buffer.hpp>
#include <boost/beast/http/basic_parser.hpp>

#include <algorithm>

namespace Pegasus::wire {
namespace {

namespace http = boost::beast::http;
using boost::beast::error_code;
using BeastView = boost::beast::string_view;

constexpr std::string_view kProtocol = "HTTP/";

std::string toStd(BeastView text)
{
    return std::string(text.data(), text.size());
}

std::string decoded(BeastView text)
{
    return base::percentDecoded(std::string_view(text.data(), text.size()));
}

// The answer to an M-POST gives CIM's fields a prefix of two digits: "73-CIMOperation".
bool isNamed(BeastView name, std::string_view expected)
{
    const bool hasPrefix =
        name.size() > 3 && base::isAsciiDigit(name[0]) && base::isAsciiDigit(name[1]) && name[2] == '-';
    const std::size_t start = hasPrefix ? 3 : 0;
    return base::equalNoCase(std::string_view(name.data() + start, name.size() - start), expected);
}

[[noreturn]] void throwMalformed()
{
    throw HttpAnswerError("");
}

[[noreturn]] void throwTooLarge(const char* what, std::uint64_t limit)
{
    throw HttpAnswerError(std::string(what) + " of more than " + std::to_string(limit) + " bytes");
}

// Returns: the offset after the empty line that ends the header; its line ends may be bare line feeds. The search
// begins at `from`.
std::size_t headerEnd(std::string_view bytes, std::size_t from)
{
    for (std::size_t at = bytes.find('\n', from); at != std::string_view::npos; at = bytes.find('\n', at + 1)) {
        if (bytes.substr(at + 1, 1) == "\n") {
            return at + 2;
        }
        if (bytes.substr(at + 1, 2) == "\r\n") {
            return at + 3;
        }
    }
    return std::string_view::npos;
}

bool hasBareLineFeed(std::string_view header)
{
    for (std::size_t at = header.find('\n'); at != std::string_view::npos; at = header.find('\n', at + 1)) {
        if (at == 0 || header[at - 1] != '\r') {
            return true;
        }
    }
    return false;
}

// The parser insists on CRLF; headers with bare line feeds, as some servers send them, are understood too.
std::string withCrLf(std::string_view header)
{
    std::string out;
    out.reserve(header.size() + 32);
    for (std::size_t i = 0; i < header.size(); ++i) {
        if (header[i] == '\n' && (i == 0 || header[i - 1] != '\r')) {
            out += '\r';
        }
        out += header[i];
    }
    return out;
}

void checkStart(std::string_view bytes)
{
    const std::string_view start = bytes.substr(0, kProtocol.size());
    if (start != kProtocol.substr(0, start.size())) {
        throwMalformed();
    }
}

} // namespace

class HttpAnswerReader::Parser : public http::basic_parser<false>
{
  public:
    Parser(const HttpAnswerLimits& limits, HeaderHandler onHeader, BodyHandler onBody)
        : fOnHeader(std::move(onHeader)), fOnBody(std::move(onBody))
    {
        eager(true);
        header_limit(limits.maxHeaderBytes);
        body_limit(limits.maxBodyBytes);
    }

    const HttpAnswerFields& fields() const { return fFields; }

  private:
    void on_request_impl(http::verb, BeastView, BeastView, int, error_code&) override {}

    void on_response_impl(int code, BeastView reason, int, error_code&) override
    {
        fFields.status = static_cast<unsigned>(code);
        fFields.reason = toStd(reason);
    }

    void on_field_impl(http::field, BeastView name, BeastView value, error_code&) override
    {
        if (isNamed(name, "CIMOperation")) {
            fFields.cimOperation = toStd(value);
        } else if (isNamed(name, "Content-Type")) {
            fFields.contentType = toStd(value);
        } else if (isNamed(name, "CIMError")) {
            fFields.cimError = toStd(value);
        } else if (isNamed(name, "PGErrorDetail")) {
            fFields.errorDetail = decoded(value);
        } else if (isNamed(name, "CIMStatusCode")) {
            fFields.statusCode = toStd(value);
        } else if (isNamed(name, "CIMStatusCodeDescription")) {
            fFields.statusDescription = decoded(value);
        }
    }

    void on_header_impl(error_code&) override { fOnHeader(fFields); }
    void on_body_init_impl(const boost::optional<std::uint64_t>&, error_code&) override {}

    std::size_t on_body_impl(BeastView body, error_code&) override
    {
        fOnBody(std::string_view(body.data(), body.size()));
        return body.size();
    }

    void on_chunk_header_impl(std::uint64_t, BeastView, error_code&) override {}

    std::size_t on_chunk_body_impl(std::uint64_t, BeastView body, error_code&) override
    {
        fOnBody(std::string_view(body.data(), body.size()));
        return body.size();
    }

    void on_finish_impl(error_code&) override {}

    HeaderHandler fOnHeader;
    BodyHandler fOnBody;
    HttpAnswerFields fFields;
};

HttpAnswerReader::HttpAnswerReader(const HttpAnswerLimits& limits, HeaderHandler onHeader, BodyHandler onBody)
    : fLimits(limits), fParser(std::make_unique<Parser>(limits, std::move(onHeader), std::move(onBody)))
{
}

HttpAnswerReader::~HttpAnswerReader() = default;

void HttpAnswerReader::feed(std::string_view bytes)
{
    if (!hasHeader()) {
        feedHeader(bytes);
    }
    if (bytes.empty()) {
        return;
    }
    if (fPending.empty()) {
        bytes.remove_prefix(put(bytes));
        fPending = bytes;
    } else {
        fPending.append(bytes);
        fPending.erase(0, put(fPending));
    }
    if (isComplete()) {
        fHasSurplus = fHasSurplus || !fPending.empty();
        fPending.clear();
    }
}

// Takes bytes up to the end of the header. One that comes in a piece, as nearly all do, is read where it lies.
void HttpAnswerReader::feedHeader(std::string_view& bytes)
{
    constexpr std::size_t kMaxEndBytes = 3; // of a line feed and the empty line after it
    const std::size_t before = fPending.size();
    if (before > 0) {
        fPending.append(bytes);
    }
    const std::string_view seen = before > 0 ? std::string_view(fPending) : bytes;
    checkStart(seen);
    const std::size_t end = headerEnd(seen, before - std::min(before, kMaxEndBytes));
    if (std::min(end, seen.size()) > fLimits.maxHeaderBytes) {
        throwTooLarge("a header", fLimits.maxHeaderBytes);
    }
    if (end == std::string_view::npos) {
        if (before == 0) {
            fPending = bytes;
        }
        bytes = {};
        return;
    }
    putHeader(seen.substr(0, end));
    bytes.remove_prefix(end - before);
    fPending.clear();
}

void HttpAnswerReader::putHeader(std::string_view header)
{
    if (hasBareLineFeed(header)) {
        return putHeader(withCrLf(header));
    }
    if (putSome(header) != header.size() || !hasHeader()) {
        throwMalformed();
    }
}

// Returns: how many bytes were used; the rest must come again, with more after it. Only framing waits for more: the
// head of a chunk, or a trailer. The parser takes it as a whole, so what exceeds the window is too large,
// however the bytes were split.
std::size_t HttpAnswerReader::put(std::string_view bytes)
{
    std::size_t done = 0;
    while (done < bytes.size() && !isComplete()) {
        const std::string_view window = bytes.substr(done, fLimits.maxFramingBytes);
        if (fParser->chunked() && mayBeCutLastChunk(window)) {
            break;
        }
        const std::size_t used = putSome(window);
        if (used == 0 && window.size() == fLimits.maxFramingBytes) {
            throwTooLarge("chunk framing", fLimits.maxFramingBytes);
        }
        if (used == 0) {
            break;
        }
        done += used;
    }
    return done;
}

// Returns: how many bytes were used; 0 when more are needed.
std::size_t HttpAnswerReader::putSome(std::string_view bytes)
{
    error_code error;
    const std::size_t used = fParser->put(boost::asio::buffer(bytes.data(), bytes.size()), error);
    if (error == http::error::body_limit) {
        throwTooLarge("a body", fLimits.maxBodyBytes);
    }
    if (error && error != http::error::need_more) {
        throwMalformed();
    }
    return used;
}

bool HttpAnswerReader::endOfConnection()
{
    if (!hasHeader()) {
        return false;
    }
    if (!isComplete() && fPending.empty()) {
        error_code error;
        fParser->put_eof(error);
    }
    return isComplete();
}

bool HttpAnswerReader::hasHeader() const
{
    return fParser->is_header_done();
}

bool HttpAnswerReader::isComplete() const
{
    return fParser->is_done();
}

bool HttpAnswerReader::keepsAlive() const
{
    return fParser->keep_alive() && !fHasSurplus;
}

const HttpAnswerFields& HttpAnswerReader::fields() const
{
    return fParser->fields();
}

bool mayBeCutLastChunk(std::string_view bytes) noexcept
{
    constexpr std::size_t kShortestEndBytes = 5;
    return bytes.size() < kShortestEndBytes && bytes.substr(0, 1) == "0";
}

} // namespace Pegasus::wire
