// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentChannel.h"

#include "pegasus/base/PercentCoding.h"
#include "pegasus/wire/HttpAnswerReader.h"

#include <charconv>
#include <limits>
#include <system_error>

namespace Pegasus::server {

namespace {

constexpr std::size_t kFrameReadBytes = 128u << 10;
constexpr std::size_t kUsualHeadBytes = 1024;
constexpr unsigned kOk = 200;

void appendField(std::string& head, const char* name, const std::string& value)
{
    head.append(name).append(": ");
    base::appendPercentEncoded(head, value, base::PercentSet::kUnreserved);
    head += "\r\n";
}

CimStatus statusIn(const wire::HttpAnswerFields& fields)
{
    if (fields.status != kOk) { // the agent could not read our request
        throw AgentLost("HTTP " + std::to_string(fields.status) +
                        (fields.errorDetail.empty() ? "" : ": " + fields.errorDetail));
    }
    CimStatus status;
    if (fields.statusCode) {
        const std::string& code = *fields.statusCode;
        std::from_chars(code.data(), code.data() + code.size(), status.code);
        status.text = fields.statusDescription;
    }
    return status;
}

} // namespace

CimStatus AgentChannel::request(const AgentRequest& request, ElementSink& sink, std::chrono::milliseconds timeout)
{
    send(request, timeout);
    return receive(sink, timeout);
}

void AgentChannel::send(const AgentRequest& request, std::chrono::milliseconds timeout)
try {
    std::string head;
    head.reserve(kUsualHeadBytes);
    head += "POST /agent HTTP/1.1\r\nHost: agent\r\nContent-Type: application/xml; charset=utf-8\r\n"
            "TE: chunked, trailers\r\nCIMOperation: MethodCall\r\n";
    appendField(head, "CIMMethod", request.method);
    appendField(head, "CIMObject", request.object);
    appendField(head, "PG-Provider", request.provider);
    appendField(head, "PG-Library", request.library);
    head.append("Content-Length: ").append(std::to_string(request.body.size())).append("\r\n\r\n");
    iovec parts[] = {{head.data(), head.size()}, {const_cast<char*>(request.body.data()), request.body.size()}};
    fStream.writeAll(parts, std::size(parts), timeout);
} catch (const std::system_error& error) {
    throw AgentGone(error.what());
} catch (const SocketTimeout&) {
    throw AgentSilent();
}

// Returns: the next bytes of the answer.
std::string_view AgentChannel::readMore(std::chrono::milliseconds timeout)
{
    std::size_t n = 0;
    try {
        n = fStream.readSome(fBuffer.data(), fBuffer.size(), base::Deadline::afterOrNever(timeout));
    } catch (const std::system_error& error) {
        throw AgentLost(error.what());
    } catch (const SocketTimeout&) {
        throw AgentSilent();
    }
    if (n == 0) {
        throw AgentLost("the agent closed the connection");
    }
    return {fBuffer.data(), n};
}

CimStatus AgentChannel::receive(ElementSink& sink, std::chrono::milliseconds timeout)
{
    fBuffer.resize(kFrameReadBytes);
    // Instances may be of any number: only what surrounds them is bounded.
    const wire::HttpAnswerLimits limits = {fMaxHeadBytes, fMaxHeadBytes, std::numeric_limits<std::uint64_t>::max()};
    // The sink gets the bytes of each chunk as they lie in the buffer: nothing is copied on the way to the client.
    wire::HttpAnswerReader reader(
        limits, [](const wire::HttpAnswerFields&) {}, [&](std::string_view bytes) { sink.write(bytes); });
    while (!reader.isComplete()) {
        const std::string_view bytes = readMore(timeout);
        try {
            reader.feed(bytes);
        } catch (const wire::HttpAnswerError& error) {
            throw AgentLost(std::string("malformed answer: ") + error.what());
        }
    }
    return statusIn(reader.fields());
}

} // namespace Pegasus::server
