// SPDX-License-Identifier: MIT
#include "tests/pegasus/client/AnswerReplay.h"

#include "pegasus/client/ResponseReader.h"
#include "tests/support/ContentReader.h"
#include "tests/support/PeerAnswers.h"

#include <Pegasus/Common/CIMDateTime.h>

#include <memory>

#include <cxxabi.h>

using namespace Pegasus;

namespace test {
namespace {

std::string nameOf(const std::type_info& type)
{
    const std::unique_ptr<char, decltype(&std::free)> name(abi::__cxa_demangle(type.name(), nullptr, nullptr, nullptr),
                                                           &std::free);
    return name.get();
}

PeerRequest requestFor(const std::string& method)
{
    PeerRequest request;
    request.head = "POST /cimom HTTP/1.1\r\nCIMMethod: " + method + "\r\n";
    request.body = "<MESSAGE ID=\"1000\"";
    return request;
}

CIMClass sampleClass()
{
    CIMClass cimClass("T_Fan", "CIM_Fan");
    cimClass.addQualifier(CIMQualifier("Description", String("a <fan> & more é"), CIMFlavor::DEFAULTS));
    CIMProperty id("DeviceID", CIMValue(CIMTYPE_STRING, false), 0, CIMName(), "CIM_Fan", true);
    id.addQualifier(CIMQualifier("Key", CIMValue(true), CIMFlavor::TOSUBCLASS));
    cimClass.addProperty(id);
    cimClass.addProperty(CIMProperty("Owner", CIMValue(CIMTYPE_REFERENCE, false), 0, "CIM_System"));
    cimClass.addProperty(CIMProperty("Speeds", CIMValue(CIMTYPE_UINT32, true, 3), 3));
    CIMMethod method("Spin", CIMTYPE_UINT32);
    method.addParameter(CIMParameter("To", CIMTYPE_REFERENCE, true, 0, "CIM_Fan"));
    method.addParameter(CIMParameter("Speed", CIMTYPE_REAL32));
    cimClass.addMethod(method);
    return cimClass;
}

CIMInstance sampleInstance(const char* id)
{
    CIMInstance instance("T_Fan");
    instance.addProperty(CIMProperty("DeviceID", String(id)));
    instance.addProperty(CIMProperty("Text", String("  \"a\" <b> & 'c'\n\xF0\x9F\x98\x80 ")));
    instance.addProperty(
        CIMProperty("Owner", CIMValue(CIMObjectPath("//h:1/root:CIM_System.Name=\"x\",N=-5")), 0, "CIM_System"));
    instance.addProperty(CIMProperty("Speed", CIMValue(Uint64(18446744073709551615ull))));
    instance.addProperty(CIMProperty("Load", CIMValue(Real64(0.1))));
    instance.addProperty(CIMProperty("On", CIMValue(true)));
    instance.addProperty(CIMProperty("Since", CIMDateTime("20200102030405.678901+060")));
    Array<String> names;
    names.append("a");
    names.append("");
    instance.addProperty(CIMProperty("Names", names));
    instance.addProperty(CIMProperty("Inner", CIMValue(CIMInstance("T_Part"))));
    instance.addProperty(CIMProperty("None", CIMValue(CIMTYPE_SINT16, false)));
    Array<CIMKeyBinding> keys;
    keys.append(CIMKeyBinding("DeviceID", String(id), CIMKeyBinding::STRING));
    keys.append(CIMKeyBinding("System", "CIM_System.Name=\"x\"", CIMKeyBinding::REFERENCE));
    instance.setPath(CIMObjectPath(String(), CIMNamespaceName(), "T_Fan", keys));
    return instance;
}

// Instances that differ in their values alone: the second and the later ones are known by their tags.
std::string plainInstances()
{
    std::string out;
    for (const char* text : {"one", " two  é ", "<3> & \"q\"", "\xF0\x9F\x98\x80\r\n", ""}) {
        const auto number = static_cast<Uint8>(out.size());
        CIMInstance instance("T_Fan");
        const CIMValue values[] = {CIMValue(String(text)),
                                   CIMValue(number % 2 == 0),
                                   CIMValue(number),
                                   CIMValue(Sint8(-5)),
                                   CIMValue(Sint64(1) << number % 63),
                                   CIMValue(Real32(number) / 3),
                                   CIMValue(Real64(1e-300)),
                                   CIMDateTime("20200102030405.678901+060"),
                                   CIMValue(CIMTYPE_UINT16, false),
                                   CIMValue(Array<Boolean>(2, true)),
                                   CIMValue(Array<String>(number % 3, String(text)))};
        for (const CIMValue& value : values) {
            const bool isNull = instance.getPropertyCount() == number % 5;
            const std::string name = "P" + std::to_string(instance.getPropertyCount());
            instance.addProperty(CIMProperty(name.c_str(), isNull ? CIMValue(value.getType(), value.isArray()) : value,
                                             0, CIMName(), "T_Origin"));
        }
        Array<CIMKeyBinding> keys;
        keys.append(CIMKeyBinding("Name", String(text), CIMKeyBinding::STRING));
        keys.append(CIMKeyBinding("Number", String("7"), CIMKeyBinding::NUMERIC));
        instance.setPath(CIMObjectPath(String(), CIMNamespaceName(), "T_Fan", keys));
        wire::appendNamedInstance(out, instance);
    }
    return out;
}

AnswerCase sample(const char* name, const char* method, const PeerAnswer& answer, bool isIntrinsic = true)
{
    return {name, "1000", method, isIntrinsic, answer.bytes};
}

} // namespace

std::string readAnswer(const AnswerCase& answer, const std::vector<std::size_t>& cuts,
                       const client::ClientLimits& limits, Decoding decoding)
{
    const client::ExpectedResponse expected{answer.messageId, answer.method, answer.isIntrinsic};
    std::string out;
    wire::ElementDecoder decoder(limits.xml);
    ContentReader content(decoder, out, limits.xml);
    client::ResponseReader reader(
        expected, decoder, [&](const wire::XmlElement& element, wire::ElementDecoder&) { content.read(element); });
    if (decoding == Decoding::kKnownTags) {
        reader.setOfferHandler([&](std::string_view text, wire::ElementDecoder&) { return content.offer(text); });
    }
    wire::HttpAnswerReader response(
        limits.http, [](const wire::HttpAnswerFields&) {}, [&](std::string_view body) { reader.feed(body); });
    try {
        std::size_t at = 0;
        for (const std::size_t cut : cuts) {
            response.feed(std::string_view(answer.bytes).substr(at, cut - at));
            at = cut;
        }
        response.feed(std::string_view(answer.bytes).substr(at));
        if (!response.endOfConnection()) {
            return "incomplete";
        }
        reader.finish();
    } catch (const wire::HttpAnswerError& error) {
        return "EXC " + nameOf(typeid(error)) + ": " + error.what();
    } catch (const Exception& exception) {
        return "EXC " + nameOf(typeid(exception)) + ": " + std::string(exception.getMessage().getCString());
    }
    if (response.fields().statusCode) {
        out += "status " + *response.fields().statusCode + " " + response.fields().statusDescription;
    }
    if (reader.error()) {
        out += "error " + std::to_string(reader.error()->getCode()) + " " +
               std::string(reader.error()->getMessage().getCString());
        if (reader.error()->getErrorCount() > 0) {
            out += " with " + std::to_string(reader.error()->getErrorCount());
        }
    }
    return out;
}

std::vector<AnswerCase> sampleAnswers()
{
    const PeerRequest enumerate = requestFor("EnumerateInstances");
    const PeerRequest getClass = requestFor("GetClass");
    const PeerRequest getQualifier = requestFor("GetQualifier");
    const PeerRequest spin = requestFor("Spin");
    std::string instances;
    wire::appendNamedInstance(instances, sampleInstance("one"));
    wire::appendNamedInstance(instances, sampleInstance("two \"q\""));
    std::string classes;
    wire::appendClass(classes, sampleClass());
    classes += classes; // the second one is known
    return {
        sample("class", "GetClass", classAnswer(getClass, sampleClass())),
        sample("classes", "EnumerateClasses", httpAnswer(intrinsicBody(requestFor("EnumerateClasses"), classes))),
        sample("instances", "EnumerateInstances", httpAnswer(intrinsicBody(enumerate, instances))),
        sample("instances in chunks", "EnumerateInstances", chunkedAnswer(intrinsicBody(enumerate, instances), 700)),
        sample("plain instances", "EnumerateInstances", httpAnswer(intrinsicBody(enumerate, plainInstances()))),
        sample("no instances", "EnumerateInstances", httpAnswer(intrinsicBody(enumerate, ""))),
        sample("qualifier", "GetQualifier",
               qualifierAnswer(getQualifier, CIMQualifierDecl("Key", CIMValue(false), CIMScope::PROPERTY))),
        sample("method", "Spin",
               methodAnswer(spin, CIMValue(Sint16(-3)), {CIMParamValue("Out", CIMValue(Array<Real32>(2, 1.5f)))}),
               false),
        sample("error element", "GetClass",
               httpAnswer("<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">"
                          "<MESSAGE ID=\"1000\" PROTOCOLVERSION=\"1.0\"><SIMPLERSP><IMETHODRESPONSE NAME=\"GetClass\">"
                          "<ERROR CODE=\"6\" DESCRIPTION=\"CIM_ERR_NOT_FOUND: &lt;x&gt;\">"
                          "<INSTANCE CLASSNAME=\"CIM_Error\"></INSTANCE><INSTANCE CLASSNAME=\"CIM_Error\"/></ERROR>"
                          "</IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>")),
        sample("error in the trailer", "GetClass", trailerErrorAnswer(getClass, 6, "CIM_ERR_NOT_FOUND: é")),
    };
}

namespace {

// Returns: where the bytes of the body are: all after the header, or what the chunks hold. Requires: sound framing.
std::vector<std::size_t> bodyBytes(std::string_view answer)
{
    std::vector<std::size_t> places;
    std::size_t at = answer.find("\r\n\r\n") + 4;
    const bool isChunked = answer.substr(0, at).find("chunked\r\n") != std::string_view::npos;
    std::size_t size = answer.size() - at;
    do {
        if (isChunked) {
            size = std::stoul(std::string(answer.substr(at, 16)), nullptr, 16);
            at = answer.find("\r\n", at) + 2;
        }
        for (const std::size_t end = at + size; at < end; ++at) {
            places.push_back(at);
        }
        at += 2;
    } while (isChunked && size > 0);
    return places;
}

} // namespace

std::vector<bool> markupBytes(std::string_view answer)
{
    std::vector<bool> marks(answer.size(), false);
    const std::vector<std::size_t> body = bodyBytes(answer);
    if (body.empty()) {
        return marks;
    }
    // Between the pieces of a body there is only framing, which is marked too.
    std::fill(marks.begin() + static_cast<std::ptrdiff_t>(body.front()),
              marks.begin() + static_cast<std::ptrdiff_t>(body.back()), true);
    char quote = 0;
    bool inTag = false;
    bool inAttributes = false;
    for (const std::size_t i : body) {
        const char c = answer[i];
        if (!inTag) {
            inTag = c == '<';
            marks[i] = inTag;
        } else if (quote) {
            marks[i] = c == quote;
            quote = c == quote ? 0 : quote;
        } else {
            inAttributes = (inAttributes || c == ' ') && c != '>';
            // Attributes of other names are ignored, so a changed name or blank may be.
            marks[i] = !inAttributes || std::string_view("=/<>\"'").find(c) != std::string_view::npos;
            quote = c == '"' || c == '\'' ? c : 0;
            inTag = c != '>';
        }
    }
    return marks;
}

} // namespace test
