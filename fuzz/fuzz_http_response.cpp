// SPDX-License-Identifier: MIT
// A whole HTTP answer, cut at a place that the input chooses: it is read the same way however it arrives.
#include "pegasus/wire/HttpAnswerReader.h"

#include <cstdint>
#include <cstdlib>
#include <string>

using namespace Pegasus;

namespace {

std::string read(std::string_view bytes, std::size_t cut)
{
    wire::HttpAnswerLimits limits;
    limits.maxHeaderBytes = 4096;
    limits.maxFramingBytes = 200;
    limits.maxBodyBytes = 64UL * 1024;
    std::string body;
    wire::HttpAnswerReader response(
        limits, [](const wire::HttpAnswerFields&) {}, [&](std::string_view piece) { body.append(piece); });
    try {
        response.feed(bytes.substr(0, cut));
        response.feed(bytes.substr(cut));
        if (!response.endOfConnection()) {
            return "incomplete";
        }
    } catch (const wire::HttpAnswerError&) {
        return "error";
    }
    const wire::HttpAnswerFields& fields = response.fields();
    return std::to_string(fields.status) + fields.reason + fields.cimOperation.value_or("") +
           fields.statusCode.value_or("") + fields.statusDescription + body;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    if (size < 2) {
        return 0;
    }
    const std::string_view bytes(reinterpret_cast<const char*>(data) + 1, size - 1);
    if (read(bytes, 0) != read(bytes, data[0] * bytes.size() / 256)) {
        std::abort();
    }
    return 0;
}
