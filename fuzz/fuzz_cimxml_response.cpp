// SPDX-License-Identifier: MIT
// The CIM-XML of an answer, cut at a place that the input chooses: the objects are the same however it arrives and
// whether or not instances are known by their tags, and what was decoded can be encoded and decoded again.
#include "pegasus/client/ResponseReader.h"
#include "tests/support/ContentReader.h"

#include <Pegasus/Client/CIMClientException.h>

#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

using namespace Pegasus;

namespace {

// The encoded result, or "error".
std::string read(std::string_view xml, std::size_t cut, bool isIntrinsic, bool isOffered)
{
    const client::ExpectedResponse expected{"1000", isIntrinsic ? "EnumerateInstances" : "M", isIntrinsic};
    std::string out;
    wire::ElementDecoder decoder;
    test::ContentReader content(decoder, out);
    client::ResponseReader reader(
        expected, decoder, [&](const wire::XmlElement& element, wire::ElementDecoder&) { content.read(element); });
    if (isOffered) {
        reader.setOfferHandler([&](std::string_view text, wire::ElementDecoder&) { return content.offer(text); });
    }
    try {
        reader.feed(xml.substr(0, cut));
        reader.feed(xml.substr(cut));
        reader.finish();
    } catch (const Exception&) {
        return "error";
    }
    return out;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    if (size < 2) {
        return 0;
    }
    const bool isIntrinsic = (data[0] & 1) != 0;
    const std::string_view xml(reinterpret_cast<const char*>(data) + 1, size - 1);
    const std::string whole = read(xml, 0, isIntrinsic, false);
    if (read(xml, data[0] * xml.size() / 256, isIntrinsic, true) != whole || read(xml, 0, isIntrinsic, true) != whole) {
        std::abort();
    }
    return 0;
}
