// A whole HTTP answer, cut at a place that the input chooses: it is read the same way however it arrives.
#include "pegasus/client/HttpResponse.h"

#include <Pegasus/Common/Exception.h>

#include <cstdint>
#include <cstdlib>
#include <string>

using namespace Pegasus;

namespace {

std::string read(std::string_view bytes, std::size_t cut)
{
    client::ClientLimits limits;
    limits.maxHeaderBytes = 4096;
    limits.maxBodyBytes = 64UL * 1024;
    std::string body;
    client::HttpResponse response(
        limits, [](const client::ResponseFields&) {}, [&](std::string_view piece) { body.append(piece); });
    try {
        response.feed(bytes.substr(0, cut));
        response.feed(bytes.substr(cut));
        if (!response.endOfConnection()) {
            return "incomplete";
        }
    } catch (const Exception&) {
        return "error";
    }
    const client::ResponseFields& fields = response.fields();
    return std::to_string(fields.status) + fields.reason + fields.cimOperation + fields.statusCode +
           fields.statusDescription + body;
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
