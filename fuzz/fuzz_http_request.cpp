// SPDX-License-Identifier: MIT
// Requests as a client might send them, in two pieces: the parser takes the same from both, or refuses both alike, and
// the bytes that it leaves unparsed stay within a limit.
#include "pegasus/server/net/HttpRequestReader.h"

#include <cstdint>
#include <cstdlib>
#include <string>

using namespace Pegasus::server;

namespace {

// What became of the bytes, as text: the status of the refusal, or the request.
std::string outcome(std::string_view first, std::string_view second)
{
    const HttpLimits limits = {256, 512}; // small, so that inputs reach them
    HttpRequestParser parser(limits);
    std::string pending(first);
    try {
        pending.erase(0, parser.put(pending));
        if (!parser.isDone()) {
            pending += second;
            while (!parser.isDone()) {
                const std::size_t taken = parser.put(pending);
                pending.erase(0, taken);
                if (!parser.isDone() && pending.size() >= limits.maxHeaderBytes) {
                    std::abort(); // bytes that are kept without a bound
                }
                if (taken == 0) {
                    return "unfinished";
                }
            }
        }
    } catch (const HttpError& error) {
        return "refused";
    }
    const HttpRequest request = parser.take();
    std::string text = request.method + "\n" + request.body + "\n";
    for (const auto& [name, value] : request.headers) {
        text += name + ": " + value + "\n";
    }
    if (request.headerHas("TE", "trailers")) {
        text += "trailers";
    }
    return text;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    if (size == 0) {
        return 0;
    }
    const std::string_view bytes(reinterpret_cast<const char*>(data) + 1, size - 1);
    const std::size_t split = bytes.size() * data[0] / 255;
    const std::string whole = outcome(bytes, "");
    const std::string halves = outcome(bytes.substr(0, split), bytes.substr(split));
    // Bytes after a complete request are the next one's, so a cut may leave either of them unfinished.
    if (whole != halves && whole != "unfinished" && halves != "unfinished") {
        std::abort();
    }
    return 0;
}
