// SPDX-License-Identifier: MIT
#include "tests/support/PeerAnswers.h"

#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/XmlText.h"

#include <algorithm>
#include <cctype>
#include <cstdio>

namespace test {
namespace {

constexpr const char* kXmlType = "Content-Type: application/xml; charset=utf-8\r\n";

std::string lower(std::string text)
{
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return text;
}

std::string utf8(const Pegasus::String& text)
{
    return std::string(text.getCString());
}

std::string key(const std::string& nameSpace, const std::string& name)
{
    return lower(nameSpace + ":" + name);
}

std::string message(const PeerRequest& request, const std::string& response)
{
    return "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n<MESSAGE ID=\"" +
           request.messageId() + "\" PROTOCOLVERSION=\"1.0\">\n<SIMPLERSP>\n" + response +
           "</SIMPLERSP>\n</MESSAGE>\n</CIM>\n";
}

std::string response(const char* element, const PeerRequest& request, const std::string& content)
{
    const std::string name(element);
    return message(request, "<" + name + " NAME=\"" + request.method() + "\">\n" + content + "</" + name + ">\n");
}

// An error's text, with escapes for control characters and everything beyond ASCII.
std::string fieldText(const std::string& text)
{
    std::string out;
    for (const char c : text) {
        char escape[4];
        std::snprintf(escape, sizeof(escape), "%%%02X", static_cast<unsigned>(static_cast<unsigned char>(c)));
        out += std::isalnum(static_cast<unsigned char>(c)) ? std::string(1, c) : escape;
    }
    return out;
}

} // namespace

PeerAnswer httpAnswer(const std::string& body)
{
    PeerAnswer answer;
    answer.bytes = std::string("HTTP/1.1 200 OK\r\n") + kXmlType + "content-length: " + std::to_string(body.size()) +
                   "\r\nCIMOperation: MethodResponse\r\n\r\n" + body;
    return answer;
}

PeerAnswer chunkedAnswer(const std::string& body, std::size_t chunkBytes, const std::string& trailer)
{
    PeerAnswer answer;
    answer.bytes = std::string("HTTP/1.1 200 OK\r\n") + kXmlType +
                   "transfer-encoding: chunked\r\nCIMOperation: MethodResponse\r\n"
                   "Trailer: CIMStatusCode, CIMStatusCodeDescription, Content-Language\r\n\r\n";
    for (std::size_t at = 0; at < body.size(); at += chunkBytes) {
        const std::string chunk = body.substr(at, chunkBytes);
        char size[32];
        std::snprintf(size, sizeof(size), "%zx\r\n", chunk.size());
        answer.bytes += size + chunk + "\r\n";
    }
    answer.bytes += "0\r\n" + trailer + "\r\n";
    return answer;
}

PeerAnswer httpErrorAnswer(unsigned status, const std::string& reason, const std::string& fields)
{
    PeerAnswer answer;
    answer.bytes = "HTTP/1.1 " + std::to_string(status) + " " + reason + "\r\n" + fields + "content-length: 0\r\n\r\n";
    return answer;
}

std::string intrinsicBody(const PeerRequest& request, const std::string& content)
{
    return response("IMETHODRESPONSE", request, "<IRETURNVALUE>\n" + content + "</IRETURNVALUE>\n");
}

std::string intrinsicBodyWithout(const PeerRequest& request)
{
    return response("IMETHODRESPONSE", request, "");
}

std::string errorBody(const PeerRequest& request, unsigned code, const std::string& description)
{
    std::string error = "<ERROR CODE=\"" + std::to_string(code) + "\" DESCRIPTION=\"";
    Pegasus::wire::appendEscaped(error, description);
    error += "\"/>\n";
    const bool isIntrinsic = request.body.find("<IMETHODCALL") != std::string::npos;
    return response(isIntrinsic ? "IMETHODRESPONSE" : "METHODRESPONSE", request, error);
}

std::string extrinsicBody(const PeerRequest& request, const std::string& content)
{
    return response("METHODRESPONSE", request, content);
}

PeerAnswer classAnswer(const PeerRequest& request, const Pegasus::CIMClass& cimClass)
{
    std::string xml;
    Pegasus::wire::appendClass(xml, cimClass);
    return httpAnswer(intrinsicBody(request, xml));
}

PeerAnswer instancesAnswer(const PeerRequest& request, const std::vector<Pegasus::CIMInstance>& instances)
{
    std::string xml;
    for (const Pegasus::CIMInstance& instance : instances) {
        Pegasus::wire::appendNamedInstance(xml, instance);
    }
    return httpAnswer(intrinsicBody(request, xml));
}

PeerAnswer qualifierAnswer(const PeerRequest& request, const Pegasus::CIMQualifierDecl& declaration)
{
    std::string xml;
    Pegasus::wire::appendQualifierDeclaration(xml, declaration);
    return httpAnswer(intrinsicBody(request, xml));
}

PeerAnswer methodAnswer(const PeerRequest& request, const Pegasus::CIMValue& returnValue,
                        const std::vector<Pegasus::CIMParamValue>& outputs)
{
    std::string xml;
    Pegasus::wire::appendReturnValue(xml, returnValue);
    for (const Pegasus::CIMParamValue& output : outputs) {
        Pegasus::wire::appendParamValue(xml, output);
    }
    return httpAnswer(extrinsicBody(request, xml));
}

PeerAnswer errorAnswer(const PeerRequest& request, unsigned code, const std::string& description)
{
    return httpAnswer(errorBody(request, code, description));
}

PeerAnswer trailerErrorAnswer(const PeerRequest& request, unsigned code, const std::string& description)
{
    return chunkedAnswer(intrinsicBodyWithout(request), 4096,
                         "CIMStatusCode: " + std::to_string(code) +
                             "\r\nCIMStatusCodeDescription: " + fieldText(description) + "\r\n");
}

PeerAnswer inPieces(PeerAnswer answer, std::size_t pieceBytes, std::chrono::milliseconds pause)
{
    answer.pieceBytes = pieceBytes;
    answer.pauseBetweenPieces = pause;
    return answer;
}

PeerAnswer cutAt(PeerAnswer answer, std::size_t bytes)
{
    answer.bytes.resize(std::min(bytes, answer.bytes.size()));
    answer.closesAfterwards = true;
    return answer;
}

PeerAnswer withWrongLength(const PeerAnswer& answer, int difference)
{
    const std::size_t bodySize = answer.bytes.size() - (answer.bytes.find("\r\n\r\n") + 4);
    PeerAnswer wrong = withReplaced(answer, "content-length: " + std::to_string(bodySize),
                                    "content-length: " + std::to_string(static_cast<long>(bodySize) + difference));
    wrong.closesAfterwards = true;
    return wrong;
}

PeerAnswer withReplaced(PeerAnswer answer, const std::string& from, const std::string& to)
{
    for (std::size_t at = answer.bytes.find(from); at != std::string::npos;
         at = answer.bytes.find(from, at + to.size()))
    {
        answer.bytes.replace(at, from.size(), to);
    }
    return answer;
}

PeerAnswer noAnswer()
{
    PeerAnswer answer;
    answer.neverAnswers = true;
    return answer;
}

PeerAnswer closedConnection()
{
    PeerAnswer answer;
    answer.closesAfterwards = true;
    return answer;
}

PeerAnswer notHttp()
{
    PeerAnswer answer;
    answer.bytes = "SSH-2.0-OpenSSH_9.2\r\n";
    return answer;
}

// ---- ServedModel

ServedModel& ServedModel::addClass(const std::string& nameSpace, const Pegasus::CIMClass& cimClass)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fClasses[key(nameSpace, utf8(cimClass.getClassName().getString()))] = cimClass;
    return *this;
}

ServedModel& ServedModel::addInstance(const std::string& nameSpace, const Pegasus::CIMInstance& instance)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fInstances[key(nameSpace, utf8(instance.getClassName().getString()))].push_back(instance);
    return *this;
}

ServedModel& ServedModel::addQualifier(const std::string& nameSpace, const Pegasus::CIMQualifierDecl& declaration)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fQualifiers[key(nameSpace, utf8(declaration.getName().getString()))] = declaration;
    return *this;
}

ServedModel& ServedModel::addMethod(const std::string& name, Method method)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fMethods[lower(name)] = std::move(method);
    return *this;
}

ServedModel& ServedModel::addFault(const std::string& method, Method fault)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fFaults[lower(method)].push_back(std::move(fault));
    return *this;
}

PeerAnswer ServedModel::answer(const PeerRequest& request)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::vector<Method>& faults = fFaults[lower(request.method())];
    if (!faults.empty()) {
        const Method fault = faults.front();
        faults.erase(faults.begin());
        return fault(request);
    }
    if (request.body.find("<IMETHODCALL") != std::string::npos) {
        return answerIntrinsic(request);
    }
    const auto method = fMethods.find(lower(request.method()));
    return method == fMethods.end() ? errorAnswer(request, Pegasus::CIM_ERR_METHOD_NOT_FOUND,
                                                  "CIM_ERR_METHOD_NOT_FOUND: " + request.method())
                                    : method->second(request);
}

PeerAnswer ServedModel::answerIntrinsic(const PeerRequest& request)
{
    const std::string method = request.method();
    const std::string name = request.nameIn("CLASSNAME");
    const auto cimClass = fClasses.find(key(request.object(), name));
    if (method == "GetClass") {
        return cimClass == fClasses.end()
                   ? errorAnswer(request, Pegasus::CIM_ERR_NOT_FOUND, "CIM_ERR_NOT_FOUND: " + name)
                   : classAnswer(request, cimClass->second);
    }
    if (method == "EnumerateInstances") {
        return cimClass == fClasses.end()
                   ? errorAnswer(request, Pegasus::CIM_ERR_INVALID_CLASS, "CIM_ERR_INVALID_CLASS: " + name)
                   : instancesAnswer(request, fInstances[cimClass->first]);
    }
    if (method == "GetQualifier") {
        const std::size_t value = request.body.find("<VALUE>") + 7;
        const std::string wanted = request.body.substr(value, request.body.find("</VALUE>", value) - value);
        const auto found = fQualifiers.find(key(request.object(), wanted));
        return found == fQualifiers.end()
                   ? errorAnswer(request, Pegasus::CIM_ERR_NOT_FOUND, "CIM_ERR_NOT_FOUND: " + wanted)
                   : qualifierAnswer(request, found->second);
    }
    return errorAnswer(request, Pegasus::CIM_ERR_NOT_SUPPORTED, "CIM_ERR_NOT_SUPPORTED: " + method);
}

} // namespace test
