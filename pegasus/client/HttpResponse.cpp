#include "pegasus/client/HttpResponse.h"

#include "pegasus/base/AsciiCase.h"

#include <Pegasus/Client/CIMClientException.h>

#include <boost/asio/buffer.hpp>
#include <boost/beast/http/basic_parser.hpp>

namespace Pegasus::client {
namespace {

namespace http = boost::beast::http;
using boost::beast::error_code;
using BeastView = boost::beast::string_view;

constexpr std::string_view kProtocol = "HTTP/";

std::string toStd(BeastView text)
{
    return std::string(text.data(), text.size());
}

bool isNamed(BeastView name, std::string_view expected)
{
    return base::equalNoCase(std::string_view(name.data(), name.size()), expected);
}

[[noreturn]] void throwMalformed(const std::string& cause = std::string())
{
    const std::string text = "Malformed HTTP response message" + (cause.empty() ? "." : ": " + cause + ".");
    throw CIMClientMalformedHTTPException(String(text.c_str()));
}

// Where the header ends: behind an empty line, whose line ends may be bare line feeds.
std::size_t headerEnd(std::string_view bytes)
{
    for (std::size_t at = bytes.find('\n'); at != std::string_view::npos; at = bytes.find('\n', at + 1)) {
        if (bytes.substr(at + 1, 1) == "\n") {
            return at + 2;
        }
        if (bytes.substr(at + 1, 2) == "\r\n") {
            return at + 3;
        }
    }
    return std::string_view::npos;
}

// The parser insists on CRLF; servers' headers with bare line feeds are understood too.
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

} // namespace

class HttpResponse::Parser : public http::basic_parser<false>
{
  public:
    Parser(const ClientLimits& limits, HeaderHandler onHeader, BodyHandler onBody)
        : fOnHeader(std::move(onHeader)), fOnBody(std::move(onBody))
    {
        eager(true);
        header_limit(limits.maxHeaderBytes);
        body_limit(limits.maxBodyBytes);
    }

    const ResponseFields& fields() const { return fFields; }

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
            fFields.hasCimOperation = true;
            fFields.cimOperation = toStd(value);
        } else if (isNamed(name, "Content-Type")) {
            fFields.hasContentType = true;
            fFields.contentType = toStd(value);
        } else if (isNamed(name, "CIMError")) {
            fFields.cimError = toStd(value);
        } else if (isNamed(name, "PGErrorDetail")) {
            fFields.errorDetail = toStd(value);
        } else if (isNamed(name, "CIMStatusCode")) {
            fFields.hasStatusCode = true;
            fFields.statusCode = toStd(value);
        } else if (isNamed(name, "CIMStatusCodeDescription")) {
            fFields.statusDescription = toStd(value);
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
    ResponseFields fFields;
};

HttpResponse::HttpResponse(const ClientLimits& limits, HeaderHandler onHeader, BodyHandler onBody)
    : fLimits(limits), fParser(std::make_unique<Parser>(limits, std::move(onHeader), std::move(onBody)))
{
}

HttpResponse::~HttpResponse() = default;

void HttpResponse::feed(std::string_view bytes)
{
    if (!hasHeader()) {
        feedHeader(bytes);
    }
    if (bytes.empty()) {
        return;
    }
    if (isComplete()) {
        fHasSurplus = true;
        return;
    }
    if (fPending.empty()) {
        return put(bytes);
    }
    std::string joined;
    joined.swap(fPending);
    joined.append(bytes);
    put(joined);
}

// Takes bytes up to the end of the header.
void HttpResponse::feedHeader(std::string_view& bytes)
{
    const std::size_t before = fPending.size();
    fPending.append(bytes);
    checkStart();
    const std::size_t end = headerEnd(fPending);
    if (std::min(end, fPending.size()) > fLimits.maxHeaderBytes) {
        throwMalformed("a header of more than " + std::to_string(fLimits.maxHeaderBytes) + " bytes");
    }
    bytes.remove_prefix(end == std::string::npos ? bytes.size() : end - before);
    if (end == std::string::npos) {
        return;
    }
    const std::string header = withCrLf(std::string_view(fPending).substr(0, end));
    fPending.clear();
    put(header);
    if (!hasHeader()) {
        throwMalformed();
    }
}

void HttpResponse::checkStart() const
{
    const std::string_view start = std::string_view(fPending).substr(0, kProtocol.size());
    if (start != kProtocol.substr(0, start.size())) {
        throwMalformed();
    }
}

void HttpResponse::put(std::string_view bytes)
{
    while (!bytes.empty() && !isComplete()) {
        const std::size_t used = putSome(bytes);
        if (used == 0) {
            break;
        }
        bytes.remove_prefix(used);
    }
    if (isComplete()) {
        fHasSurplus = fHasSurplus || !bytes.empty();
        return;
    }
    // Only the framing between pieces of a body waits for more.
    if (bytes.size() > fLimits.maxHeaderBytes) {
        throwMalformed("a trailer of more than " + std::to_string(fLimits.maxHeaderBytes) + " bytes");
    }
    fPending.assign(bytes.data(), bytes.size());
}

// Returns: how many bytes were used; 0 when more are needed.
std::size_t HttpResponse::putSome(std::string_view bytes)
{
    error_code error;
    const std::size_t used = fParser->put(boost::asio::buffer(bytes.data(), bytes.size()), error);
    if (error == http::error::need_more) {
        return used;
    }
    if (error == http::error::body_limit) {
        throwMalformed("a body of more than " + std::to_string(fLimits.maxBodyBytes) + " bytes");
    }
    if (error) {
        throwMalformed();
    }
    return used;
}

bool HttpResponse::endOfConnection()
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

bool HttpResponse::hasHeader() const
{
    return fParser->is_header_done();
}

bool HttpResponse::isComplete() const
{
    return fParser->is_done();
}

bool HttpResponse::keepsAlive() const
{
    return fParser->keep_alive() && !fHasSurplus;
}

const ResponseFields& HttpResponse::fields() const
{
    return fParser->fields();
}

} // namespace Pegasus::client
