// SPDX-License-Identifier: MIT
#include "pegasus/server/net/RequestDecoder.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/PercentCoding.h"
#include "pegasus/base/Text.h"
#include "pegasus/wire/ContentType.h"

namespace Pegasus::server {

using wire::XmlAttribute;
using wire::XmlElement;
using wire::XmlError;

namespace {

constexpr std::size_t kKeptTextBytes = 1u << 20;

[[noreturn]] void refuse(const char* cimError, const std::string& detail, unsigned status = 400)
{
    throw HttpError(status, HttpError::After::kKeepOpen, cimError, detail);
}

const std::string& requireHeader(const HttpRequest& http, const char* name)
{
    const std::string* value = http.header(name);
    if (value == nullptr) {
        refuse("header-mismatch", std::string("Missing ") + name + " HTTP header.");
    }
    if (value->empty()) {
        refuse("header-mismatch", std::string("Empty ") + name + " value.");
    }
    return *value;
}

void checkContentType(const HttpRequest& http)
{
    const std::string* value = http.header("Content-Type");
    if (value == nullptr) {
        refuse("header-mismatch", "Missing Content-Type HTTP header.");
    }
    if (!wire::isXmlInUtf8(*value)) {
        refuse("header-mismatch", "Content-Type value \"" + *value + "\" is not supported.");
    }
}

void checkHeaders(const HttpRequest& http)
{
    if (!http.hasBodyLength) {
        throw HttpError(411, HttpError::After::kClose);
    }
    if (http.header("Host") == nullptr && !http.isVersion10) {
        refuse("", "HTTP request message lacks a Host header field.");
    }
    const std::string* operation = http.header("CIMOperation");
    if (operation == nullptr) {
        refuse("", "");
    }
    if (!base::equalNoCase(*operation, "MethodCall")) {
        refuse("unsupported-operation", "CIMOperation value \"" + *operation + "\" is not supported.");
    }
    checkContentType(http);
    const std::string* protocol = http.header("CIMProtocolVersion");
    if (protocol != nullptr && protocol->compare(0, 2, "1.") != 0) {
        refuse("unsupported-protocol-version", "CIM protocol version \"" + *protocol + "\" is not supported.", 501);
    }
    if (http.header("CIMBatch") != nullptr) {
        refuse("multiple-requests-unsupported", "Batch requests are not supported.", 501);
    }
    requireHeader(http, "CIMMethod");
    requireHeader(http, "CIMObject");
}

void checkCimVersions(std::string_view cimVersion, std::string_view dtdVersion)
{
    if (cimVersion.compare(0, 2, "2.") != 0) {
        refuse("unsupported-cim-version", "CIM version \"" + std::string(cimVersion) + "\" is not supported.", 501);
    }
    if (dtdVersion.compare(0, 2, "2.") != 0) {
        refuse("unsupported-dtd-version", "DTD version \"" + std::string(dtdVersion) + "\" is not supported.", 501);
    }
}

void checkProtocolVersion(const HttpRequest& http, std::string_view version)
{
    if (version.compare(0, 2, "1.") == 0) {
        return;
    }
    const std::string* header = http.header("CIMProtocolVersion");
    refuse("header-mismatch", "CIMProtocolVersion value \"" + (header != nullptr ? *header : "1.0") +
                                  "\" does not match CIM request protocol version \"" + std::string(version) + "\".");
}

std::string requestObject(const CimRequest& request)
{
    std::string text = base::utf8(request.nameSpace);
    if (!request.isIntrinsic) {
        text += ":";
        base::appendUtf8(text, request.object.toString());
    }
    return text;
}

// Texts that name the same object: alike but for case, or paths that are equal.
bool namesObject(const std::string& header, const CimRequest& request)
{
    if (base::equalNoCase(header, requestObject(request))) {
        return true;
    }
    try {
        if (request.isIntrinsic) {
            return CIMNamespaceName(String(header.c_str())) == request.nameSpace;
        }
        CIMObjectPath path = request.object;
        path.setNameSpace(request.nameSpace);
        return CIMObjectPath(String(header.c_str())) == path;
    } catch (const Exception&) {
        return false;
    }
}

void checkMatch(const HttpRequest& http, const CimRequest& request)
{
    const std::string method = base::percentDecoded(*http.header("CIMMethod"));
    if (!base::equalNoCase(method, request.method)) {
        refuse("header-mismatch",
               "CIMMethod value \"" + method + "\" does not match CIM request method \"" + request.method + "\".");
    }
    const std::string object = base::percentDecoded(*http.header("CIMObject"));
    if (!namesObject(object, request)) {
        refuse("header-mismatch", "CIMObject value \"" + object + "\" does not match CIM request object \"" +
                                      requestObject(request) + "\".");
    }
}

std::string_view requiredAttribute(XmlElement element, XmlAttribute value, const char* name)
{
    if (!value) {
        element.fail(XmlError::Kind::kInvalid, std::string("missing ") + name + " attribute");
    }
    return *value;
}

} // namespace

void failFor(const XmlError& error)
{
    const std::string detail = base::utf8(error.getMessage());
    switch (error.kind()) {
    case XmlError::Kind::kNotWellFormed:
        refuse("request-not-well-formed", detail);
    case XmlError::Kind::kTooLarge:
        refuse("request-not-valid", detail, 413);
    default:
        refuse("request-not-valid", detail);
    }
}

CimRequest RequestDecoder::decode(const HttpRequest& http)
{
    checkHeaders(http);
    if (fText.capacity() > kKeptTextBytes) {
        fText = std::string();
    }
    if (!base::isUtf8(http.body)) {
        refuse("request-not-valid", "Invalid UTF-8 character detected.");
    }
    fText.assign(http.body); // the request's elements are views of it
    try {
        const XmlElement cim = fDocument.parseMessage(fText);
        static constexpr std::string_view kMessageNames[] = {"ID", "PROTOCOLVERSION"};
        CimRequest request = decodeMessage(cim);
        XmlAttribute message[2];
        cim.onlyChild().attributes(kMessageNames, message);
        checkProtocolVersion(http, std::string(*message[1]));
        checkMatch(http, request);
        return request;
    } catch (const XmlError& error) {
        failFor(error);
    } catch (const Exception& error) { // an invalid name or path
        refuse("request-not-valid", base::utf8(error.getMessage()));
    }
}

std::string RequestDecoder::resolvedAttribute(XmlElement element, std::string_view raw)
{
    return std::string(element.resolved(raw, fScratch));
}

CimRequest RequestDecoder::decodeMessage(XmlElement cim)
{
    static constexpr std::string_view kCimNames[] = {"CIMVERSION", "DTDVERSION"};
    static constexpr std::string_view kMessageNames[] = {"ID", "PROTOCOLVERSION"};
    XmlAttribute cimValues[2];
    XmlAttribute messageValues[2];
    cim.expectName("CIM");
    cim.attributes(kCimNames, cimValues);
    checkCimVersions(requiredAttribute(cim, cimValues[0], "CIM.CIMVERSION"),
                     requiredAttribute(cim, cimValues[1], "CIM.DTDVERSION"));
    const XmlElement message = cim.onlyChild();
    message.expectName("MESSAGE");
    message.attributes(kMessageNames, messageValues);
    CimRequest request;
    request.messageId = resolvedAttribute(message, requiredAttribute(message, messageValues[0], "MESSAGE.ID"));
    requiredAttribute(message, messageValues[1], "MESSAGE.PROTOCOLVERSION");
    const XmlElement simple = message.onlyChild();
    simple.expectName("SIMPLEREQ");
    const XmlElement call = simple.onlyChild();
    request.isIntrinsic = call.is("IMETHODCALL");
    if (request.isIntrinsic) {
        decodeIntrinsic(call, request);
    } else {
        decodeExtrinsic(call, request);
    }
    return request;
}

void RequestDecoder::decodeIntrinsic(XmlElement call, CimRequest& request)
{
    static constexpr std::string_view kNames[] = {"NAME"};
    XmlAttribute values[1];
    call.attributes(kNames, values);
    request.method = resolvedAttribute(call, requiredAttribute(call, values[0], "IMETHODCALL.NAME"));
    XmlElement child = call.firstChild();
    if (!child) {
        call.fail(XmlError::Kind::kInvalid, "expected LOCALNAMESPACEPATH element");
    }
    request.nameSpace = fElements.decodeLocalNamespacePath(child);
    request.parameters = IntrinsicParameters(call, fElements);
    for (child = child.nextSibling(); child; child = child.nextSibling()) {
        child.expectName("IPARAMVALUE");
        child.attributes(kNames, values);
        requiredAttribute(child, values[0], "IPARAMVALUE.NAME");
        request.parameters.add(*values[0], child.firstChild() ? child.onlyChild() : XmlElement());
    }
}

void RequestDecoder::decodeExtrinsic(XmlElement call, CimRequest& request)
{
    static constexpr std::string_view kNames[] = {"NAME"};
    XmlAttribute values[1];
    call.expectName("METHODCALL");
    call.attributes(kNames, values);
    request.method = resolvedAttribute(call, requiredAttribute(call, values[0], "METHODCALL.NAME"));
    XmlElement child = call.firstChild();
    if (!child.is("LOCALCLASSPATH") && !child.is("LOCALINSTANCEPATH")) {
        call.fail(XmlError::Kind::kInvalid, "expected LOCALCLASSPATH or LOCALINSTANCEPATH element");
    }
    request.object = fElements.decodeObjectPath(child);
    request.nameSpace = request.object.getNameSpace();
    request.object.setNameSpace(CIMNamespaceName());
    for (child = child.nextSibling(); child; child = child.nextSibling()) {
        child.expectName("PARAMVALUE");
        if (request.arguments.size() >= fElements.limits().maxMembers) {
            child.fail(XmlError::Kind::kTooLarge,
                       "more than " + std::to_string(fElements.limits().maxMembers) + " arguments");
        }
        request.arguments.append(fElements.decodeParamValue(child));
    }
}

} // namespace Pegasus::server
