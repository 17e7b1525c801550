// The CIM-XML of an answer, cut at a place that the input chooses: the objects are the same however it arrives, and
// what was decoded can be encoded and decoded again.
#include "pegasus/client/ResponseReader.h"
#include "pegasus/common/ElementEncoder.h"

#include <Pegasus/Client/CIMClientException.h>

#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

using namespace Pegasus;

namespace {

/// Every kind of content, decoded and encoded; the text stands for the objects.
void readContent(const wire::XmlElement& element, wire::ElementDecoder& decoder, std::string& out)
{
    if (element.is("CLASS"))
        wire::appendClass(out, decoder.decodeClass(element));
    else if (element.is("VALUE.NAMEDINSTANCE"))
        wire::appendNamedInstance(out, decoder.decodeNamedInstance(element));
    else if (element.is("INSTANCE"))
        wire::appendInstance(out, decoder.decodeInstance(element));
    else if (element.is("QUALIFIER.DECLARATION"))
        wire::appendQualifierDeclaration(out, decoder.decodeQualifierDeclaration(element));
    else if (element.is("RETURNVALUE"))
        wire::appendReturnValue(out, decoder.decodeReturnValue(element));
    else if (element.is("PARAMVALUE"))
        wire::appendParamValue(out, decoder.decodeParamValue(element));
    else
        wire::appendInstanceName(out, decoder.decodeInstanceName(element));
}

/// The encoded result, or "error".
std::string read(std::string_view xml, std::size_t cut, bool isIntrinsic)
{
    const client::ExpectedResponse expected{"1000", isIntrinsic ? "EnumerateInstances" : "M", isIntrinsic};
    std::string out;
    wire::ElementDecoder decoder;
    client::ResponseReader reader(expected, decoder, [&](const wire::XmlElement& element, wire::ElementDecoder&) {
        readContent(element, decoder, out);
    });
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
    if (size < 2)
        return 0;
    const bool isIntrinsic = (data[0] & 1) != 0;
    const std::string_view xml(reinterpret_cast<const char*>(data) + 1, size - 1);
    const std::string whole = read(xml, 0, isIntrinsic);
    if (read(xml, data[0] * xml.size() / 256, isIntrinsic) != whole)
        std::abort();
    return 0;
}
