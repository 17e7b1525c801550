// SPDX-License-Identifier: MIT
// CIM messages in requests: the first two lines are the CIMMethod and CIMObject headers, the rest is the body. A
// decoded request's parameters are read in every form.
#include "pegasus/server/net/RequestDecoder.h"

#include <Pegasus/Common/Exception.h>

#include <cstdint>
#include <string>

using namespace Pegasus;
using namespace Pegasus::server;

namespace {

template <typename Read> void attempt(const Read& read)
{
    try {
        read();
    } catch (const Exception&) { // what an operation answers with an error
    }
}

void readParameters(const IntrinsicParameters& parameters)
{
    attempt([&] { parameters.className("ClassName"); });
    attempt([&] { parameters.optionalClassName("ClassName"); });
    attempt([&] { parameters.name("QualifierName"); });
    attempt([&] { parameters.boolean("LocalOnly", true); });
    attempt([&] { parameters.propertyList(); });
    attempt([&] { parameters.instanceName("InstanceName"); });
    attempt([&] { parameters.instance("NewInstance"); });
    attempt([&] { parameters.cimClass("NewClass"); });
    attempt([&] { parameters.qualifierDeclaration("QualifierDeclaration"); });
}

std::string takeLine(std::string& text)
{
    const std::size_t end = std::min(text.find('\n'), text.size());
    std::string line = text.substr(0, end);
    text.erase(0, end + 1);
    return line;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    std::string text(reinterpret_cast<const char*>(data), size);
    HttpRequest http;
    http.method = "POST";
    http.hasBodyLength = true;
    http.headers = {{"Host", "x"}, {"Content-Type", "application/xml; charset=utf-8"}, {"CIMOperation", "MethodCall"}};
    http.headers.emplace_back("CIMMethod", takeLine(text));
    http.headers.emplace_back("CIMObject", takeLine(text));
    http.body = text;
    RequestDecoder decoder{wire::XmlLimits()};
    try {
        const CimRequest request = decoder.decode(http);
        if (request.isIntrinsic) {
            readParameters(request.parameters);
        }
    } catch (const HttpError&) { // the only way out for bad input
    }
    return 0;
}
