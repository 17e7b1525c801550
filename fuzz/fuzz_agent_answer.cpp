// SPDX-License-Identifier: MIT
// An agent's answer, as the server reads it: an agent that runs a broken vendor's library may send anything. The
// elements reach the sink in the order in which they came, and a failure is one of the named ones.
#include "pegasus/server/agent/AgentChannel.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>

#include <sys/socket.h>

using namespace Pegasus::server;

namespace {

constexpr std::size_t kMaxInputBytes = 64u << 10; // what a socket takes without a reader
constexpr std::uint32_t kMaxHeadBytes = 1024;     // in place of the server's 1 MiB, so that short inputs reach it

class Collector : public ElementSink
{
  public:
    void write(std::string_view elements) override { fText += elements; }
    std::string fText;
};

// Returns: what became of an answer of these bytes, after which the agent ends.
std::string outcome(std::string_view bytes)
{
    int ends[2];
    if (::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0) {
        std::abort();
    }
    AgentChannel channel(Pegasus::base::Descriptor(ends[0]), kMaxHeadBytes);
    const Pegasus::base::Descriptor agent(ends[1]);
    if (::send(agent.get(), bytes.data(), bytes.size(), MSG_NOSIGNAL) != static_cast<ssize_t>(bytes.size())) {
        std::abort();
    }
    ::shutdown(agent.get(), SHUT_WR);
    AgentRequest request;
    request.method = "EnumerateInstances";
    Collector sink;
    try {
        const CimStatus status = channel.request(request, sink, std::chrono::milliseconds::zero());
        return std::to_string(status.code) + status.text + "\n" + sink.fText;
    } catch (const AgentLost& error) {
        return std::string("lost: ") + error.what() + "\n" + sink.fText;
    }
}

// A head that does not end within the limit is refused, and only such a one. An empty line ends it.
bool keepsToLimit(std::string_view bytes, const std::string& outcome)
{
    const std::string_view start = bytes.substr(0, kMaxHeadBytes + 4);
    const bool hasNoEnd = bytes.size() > kMaxHeadBytes && start.find("\n\n") == std::string_view::npos &&
                          start.find("\n\r\n") == std::string_view::npos;
    const std::string failure = outcome.substr(0, outcome.find('\n')); // the body follows
    const bool isTooLarge = failure == "lost: malformed answer: a header of more than 1024 bytes" ||
                            failure == "lost: malformed answer: chunk framing of more than 1024 bytes";
    return hasNoEnd ? outcome.rfind("lost: ", 0) == 0 : !isTooLarge || bytes.size() >= kMaxHeadBytes;
}

// The same answer, its body in chunks of one byte: what the sink gets is the same.
std::string inSmallChunks(std::string_view body)
{
    std::string text = "HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n";
    for (const char c : body) {
        text += std::string("1;x\r\n") + c + "\r\n";
    }
    return text + "0\r\nCIMStatusCode: 0\r\n\r\n";
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const std::string_view bytes(reinterpret_cast<const char*>(data), std::min(size, kMaxInputBytes));
    if (!keepsToLimit(bytes, outcome(bytes))) {
        std::abort();
    }
    const std::string_view body = bytes.substr(0, 4096);
    if (outcome(inSmallChunks(body)) != "0\n" + std::string(body)) {
        std::abort();
    }
    return 0;
}
