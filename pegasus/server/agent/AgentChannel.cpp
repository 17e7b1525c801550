#include "pegasus/server/agent/AgentChannel.h"

#include <boost/beast/http/empty_body.hpp>
#include <boost/beast/http/parser.hpp>

#include <charconv>
#include <cstring>
#include <limits>
#include <system_error>

namespace Pegasus::server {

namespace http = boost::beast::http;

namespace {

constexpr std::size_t kReadBytes = 128u << 10;
constexpr std::uint32_t kMaxAnswerHeadBytes = 1u << 20; // the trailer carries the provider's error text

using AnswerParser = http::response_parser<http::empty_body>;

CimStatus statusIn(const AnswerParser::value_type& message)
{
    CimStatus status;
    const auto code = message.find("CIMStatusCode");
    if (code == message.end()) {
        return status;
    }
    const auto text = code->value();
    std::from_chars(text.data(), text.data() + text.size(), status.code);
    const auto description = message.find("CIMStatusCodeDescription");
    if (description != message.end()) {
        status.text = percentDecode(std::string(description->value()));
    }
    return status;
}

// The agent could not read our request: its words are all there is.
[[noreturn]] void failFor(const AnswerParser::value_type& message)
{
    std::string text = "HTTP " + std::to_string(message.result_int());
    const auto detail = message.find("PGErrorDetail");
    if (detail != message.end()) {
        text += ": " + percentDecode(std::string(detail->value()));
    }
    throw AgentLost(text);
}

} // namespace

CimStatus AgentChannel::request(const AgentRequest& request, ElementSink& sink, std::chrono::milliseconds patience)
{
    send(request, patience);
    return receive(sink, patience);
}

void AgentChannel::send(const AgentRequest& request, std::chrono::milliseconds patience)
try {
    std::string head = "POST /agent HTTP/1.1\r\nHost: agent\r\nContent-Type: application/xml; charset=utf-8\r\n"
                       "TE: chunked, trailers\r\nCIMOperation: MethodCall\r\nCIMMethod: " +
                       percentEncode(request.method) + "\r\nCIMObject: " + percentEncode(request.object) +
                       "\r\nPG-Provider: " + percentEncode(request.provider) +
                       "\r\nPG-Library: " + percentEncode(request.library) +
                       "\r\nContent-Length: " + std::to_string(request.body.size()) + "\r\n\r\n";
    iovec parts[] = {{head.data(), head.size()}, {const_cast<char*>(request.body.data()), request.body.size()}};
    fStream.writeAll(parts, std::size(parts), patience);
} catch (const std::system_error& error) {
    throw AgentGone(error.what());
} catch (const SocketTimeout&) {
    throw AgentSilent();
}

std::size_t AgentChannel::readMore(std::size_t kept, std::chrono::milliseconds patience)
{
    std::size_t n = 0;
    try {
        n = fStream.readSome(fBuffer.data() + kept, fBuffer.size() - kept, deadlineAfter(patience));
    } catch (const std::system_error& error) {
        throw AgentLost(error.what());
    } catch (const SocketTimeout&) {
        throw AgentSilent();
    }
    if (n == 0) {
        throw AgentLost("the agent closed the connection");
    }
    return n;
}

CimStatus AgentChannel::receive(ElementSink& sink, std::chrono::milliseconds patience)
{
    AnswerParser parser;
    parser.eager(true);
    parser.header_limit(kMaxAnswerHeadBytes);
    parser.body_limit(std::numeric_limits<std::uint64_t>::max());
    // Called with the bytes of each chunk as they lie in the buffer: nothing is copied on the way to the client.
    auto pass = [&](std::uint64_t, boost::beast::string_view bytes, boost::system::error_code&) {
        sink.write({bytes.data(), bytes.size()});
        return bytes.size();
    };
    parser.on_chunk_body(pass);
    std::size_t kept = 0;
    if (fBuffer.empty()) {
        fBuffer.resize(kReadBytes);
    }
    while (!parser.is_done()) {
        if (kept == fBuffer.size()) {
            fBuffer.resize(2 * fBuffer.size()); // a long head or trailer; kMaxAnswerHeadBytes ends it
        }
        kept += readMore(kept, patience);
        boost::system::error_code error;
        const std::size_t taken = parser.put(boost::asio::const_buffer(fBuffer.data(), kept), error);
        kept -= taken;
        if (error == http::error::header_limit || kept > kMaxAnswerHeadBytes) {
            throw AgentLost("a head, chunk extension or trailer of more than " + std::to_string(kMaxAnswerHeadBytes) +
                            " bytes");
        }
        if (error && error != http::error::need_more) {
            throw AgentLost("malformed answer: " + error.message());
        }
        std::memmove(fBuffer.data(), fBuffer.data() + taken, kept);
    }
    if (parser.get().result() != http::status::ok) {
        failFor(parser.get());
    }
    return statusIn(parser.get());
}

} // namespace Pegasus::server
