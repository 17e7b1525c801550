// SPDX-License-Identifier: MIT
#include "tests/pegasus/client/WireCases.h"

#include "pegasus/common/StringRep.h"
#include "pegasus/wire/ElementDecoder.h"
#include "tests/pegasus/client/ResultPrinter.h"
#include "tests/support/VectorsFolder.h"

#include <Pegasus/Client/CIMClient.h>

#include <pugixml.hpp>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>

using namespace Pegasus;

namespace test {
namespace {

std::string readFile(const std::filesystem::path& path)
{
    std::ifstream file(path, std::ios::binary);
    return std::string((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
}

// Returns: the text after the words that introduce the client's output.
std::string printedIn(const std::string& note)
{
    const std::string printed = "Client printed: ";
    std::size_t start = note.find(printed);
    if (start != std::string::npos) {
        return note.substr(start + printed.size());
    }
    start = note.find(", exit ");
    return start == std::string::npos ? std::string() : note.substr(start + 10);
}

// The recorded request's parameters, read with the library's own decoders.
class RecordedCall
{
  public:
    explicit RecordedCall(const WireCase& wireCase)
        : fBody(wireCase.request.body), fMethod(wireCase.request.method()),
          fCall(fDocument.parseMessage(fBody).onlyChild().onlyChild().onlyChild())
    {
        fNameSpace = wireCase.request.object();
        fNameSpace.erase(std::min(fNameSpace.find(':'), fNameSpace.size()));
    }

    std::string run(CIMClient& client);

  private:
    wire::XmlElement parameter(const std::string& name);
    bool flag(const std::string& name, bool ifMissing);
    CIMName className(const std::string& name);
    CIMPropertyList propertyList();
    std::string invoke(CIMClient& client);

    wire::XmlDocument fDocument;
    wire::ElementDecoder fDecoder;
    std::string fBody;
    std::string fMethod;
    std::string fNameSpace;
    wire::XmlElement fCall;
};

wire::XmlElement RecordedCall::parameter(const std::string& name)
{
    for (wire::XmlElement child = fCall.firstChild(); child; child = child.nextSibling()) {
        wire::XmlAttribute values[2];
        if (!child.is("IPARAMVALUE")) {
            continue;
        }
        child.attributes({"NAME", "PARAMTYPE"}, values);
        if (values[0] && *values[0] == name) {
            return child.onlyChild();
        }
    }
    return wire::XmlElement();
}

bool RecordedCall::flag(const std::string& name, bool ifMissing)
{
    std::string scratch;
    const wire::XmlElement value = parameter(name);
    return value ? value.text(scratch) == "TRUE" : ifMissing;
}

CIMName RecordedCall::className(const std::string& name)
{
    const wire::XmlElement element = parameter(name);
    return element ? fDecoder.decodeClassName(element) : CIMName();
}

CIMPropertyList RecordedCall::propertyList()
{
    const wire::XmlElement element = parameter("PropertyList");
    if (!element) {
        return CIMPropertyList();
    }
    Array<String> texts;
    fDecoder.decodeValue(element, CIMTYPE_STRING).get(texts);
    Array<CIMName> names;
    for (Uint32 i = 0; i < texts.size(); ++i) {
        names.append(texts[i]);
    }
    return CIMPropertyList(names);
}

std::string RecordedCall::invoke(CIMClient& client)
{
    wire::XmlElement child = fCall.firstChild();
    const CIMObjectPath path = fDecoder.decodeObjectPath(child);
    Array<CIMParamValue> inputs;
    for (child = child.nextSibling(); child; child = child.nextSibling()) {
        inputs.append(fDecoder.decodeParamValue(child));
    }
    Array<CIMParamValue> outputs;
    const CIMValue result = client.invokeMethod(path.getNameSpace(), path, fMethod.c_str(), inputs, outputs);
    return printMethodResult(result, outputs);
}

std::string RecordedCall::run(CIMClient& client)
{
    const CIMNamespaceName ns(fNameSpace.c_str());
    if (fCall.is("METHODCALL")) {
        return invoke(client);
    }
    if (fMethod == "GetClass") {
        return printClass(client.getClass(ns, className("ClassName"), flag("LocalOnly", true),
                                          flag("IncludeQualifiers", true), flag("IncludeClassOrigin", false),
                                          propertyList()));
    }
    if (fMethod == "EnumerateInstances") {
        return printInstances(client.enumerateInstances(ns, className("ClassName"), flag("DeepInheritance", true),
                                                        flag("LocalOnly", true), flag("IncludeQualifiers", false),
                                                        flag("IncludeClassOrigin", false), propertyList()));
    }
    if (fMethod == "EnumerateInstanceNames") {
        return printPaths(client.enumerateInstanceNames(ns, className("ClassName")));
    }
    if (fMethod == "GetInstance") {
        return printInstanceSummary(client.getInstance(ns, fDecoder.decodeInstanceName(parameter("InstanceName")),
                                                       flag("LocalOnly", true), flag("IncludeQualifiers", false),
                                                       flag("IncludeClassOrigin", false), propertyList()));
    }
    if (fMethod == "EnumerateClasses") {
        return std::to_string(client
                                  .enumerateClasses(ns, className("ClassName"), flag("DeepInheritance", false),
                                                    flag("LocalOnly", true), flag("IncludeQualifiers", true),
                                                    flag("IncludeClassOrigin", false))
                                  .size());
    }
    if (fMethod == "EnumerateClassNames") {
        return printNames(client.enumerateClassNames(ns, className("ClassName"), flag("DeepInheritance", false)));
    }
    if (fMethod == "GetQualifier") {
        std::string scratch;
        return printQualifier(client.getQualifier(ns, std::string(parameter("QualifierName").text(scratch)).c_str()));
    }
    if (fMethod == "EnumerateQualifiers") {
        return printQualifiers(client.enumerateQualifiers(ns));
    }
    if (fMethod == "CreateClass") {
        client.createClass(ns, fDecoder.decodeClass(parameter("NewClass")));
    } else if (fMethod == "SetQualifier") {
        client.setQualifier(ns, fDecoder.decodeQualifierDeclaration(parameter("QualifierDeclaration")));
    } else if (fMethod == "DeleteInstance") {
        client.deleteInstance(ns, fDecoder.decodeInstanceName(parameter("InstanceName")));
    } else if (fMethod == "CreateInstance") {
        return std::string(
            client.createInstance(ns, fDecoder.decodeInstance(parameter("NewInstance"))).toString().getCString());
    } else {
        return "unsupported";
    }
    return "ok";
}

void appendCanonical(std::string& out, const pugi::xml_node& node)
{
    if (node.type() == pugi::node_pcdata || node.type() == pugi::node_cdata) {
        out += node.value();
        return;
    }
    std::vector<std::string> attributes;
    for (const pugi::xml_attribute attribute : node.attributes()) {
        attributes.push_back(std::string(" ") + attribute.name() + "='" + attribute.value() + "'");
    }
    std::sort(attributes.begin(), attributes.end());
    out += std::string("<") + node.name();
    for (const std::string& attribute : attributes) {
        out += attribute;
    }
    out += ">";
    for (const pugi::xml_node child : node.children()) {
        appendCanonical(out, child);
    }
    out += std::string("</") + node.name() + ">\n";
}

} // namespace

std::string vectorsFolder()
{
    return vectorsFolder(VRX_VECTORS_DIR);
}

std::vector<WireCase> loadWireCases()
{
    std::vector<WireCase> cases;
    if (vectorsFolder().empty()) {
        return cases;
    }
    for (const auto& entry : std::filesystem::directory_iterator(vectorsFolder() + "/wire")) {
        if (!entry.is_directory()) {
            continue;
        }
        WireCase wireCase;
        wireCase.name = entry.path().filename();
        wireCase.note = readFile(entry.path() / "note.md");
        const std::string request = readFile(entry.path() / "request.http");
        const std::size_t headEnd = request.find("\r\n\r\n");
        if (headEnd == std::string::npos || wireCase.note.find("(no client)") != std::string::npos) {
            continue;
        }
        wireCase.request.head = request.substr(0, headEnd + 2);
        wireCase.request.body = request.substr(headEnd + 4);
        wireCase.response = readFile(entry.path() / "response.http");
        wireCase.printed = printedIn(wireCase.note);
        cases.push_back(std::move(wireCase));
    }
    std::sort(cases.begin(), cases.end(), [](const WireCase& x, const WireCase& y) { return x.name < y.name; });
    return cases;
}

std::string replayCall(const WireCase& wireCase, std::uint16_t port, unsigned timeoutMs)
{
    RecordedCall call(wireCase);
    CIMClient client;
    client.setTimeout(timeoutMs);
    client.connect("127.0.0.1", port, String(), String());
    try {
        return call.run(client);
    } catch (const Exception& exception) {
        return printException(exception);
    }
}

std::string canonicalXml(const std::string& xml)
{
    pugi::xml_document document;
    if (!document.load_buffer(xml.data(), xml.size())) {
        return "not XML: " + xml;
    }
    std::string out;
    appendCanonical(out, document.document_element());
    return out;
}

} // namespace test
