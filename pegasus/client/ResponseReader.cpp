// SPDX-License-Identifier: MIT
#include "pegasus/client/ResponseReader.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/wire/AnswerEnvelope.h"

#include <Pegasus/Client/CIMClientException.h>

#include <algorithm>

namespace Pegasus::client {
namespace {

using wire::XmlAttribute;
using wire::XmlElement;
using Kind = wire::XmlError::Kind;

// The outer elements from the outside in; on the fourth level one of two.
constexpr std::string_view kLevels[] = {"CIM", "MESSAGE", "SIMPLERSP", "IMETHODRESPONSE", "IRETURNVALUE"};
constexpr std::string_view kExtrinsicResponse = "METHODRESPONSE";
constexpr std::size_t kResponseLevel = 3;
constexpr std::size_t kReturnLevel = 4;

constexpr std::string_view kIntrinsicMethods[] = {
    "Associators",         "AssociatorNames",
    "CreateClass",         "CreateInstance",
    "DeleteClass",         "DeleteInstance",
    "DeleteQualifier",     "EnumerateClasses",
    "EnumerateClassNames", "EnumerateInstanceNames",
    "EnumerateInstances",  "EnumerateQualifiers",
    "ExecQuery",           "GetClass",
    "GetInstance",         "GetProperty",
    "GetQualifier",        "ModifyClass",
    "ModifyInstance",      "ReferenceNames",
    "References",          "SetProperty",
    "SetQualifier",
};

[[noreturn]] void throwResponse(const std::string& text)
{
    throw CIMClientResponseException(base::fromUtf8(text));
}

void expectVersion(const XmlElement& tag, std::string_view attribute, XmlAttribute value)
{
    if (!value) {
        tag.fail(Kind::kInvalid, "missing CIM." + std::string(attribute) + " attribute");
    }
    if (value->substr(0, 2) != "2.") {
        tag.fail(Kind::kInvalid, "CIM." + std::string(attribute) + " is not 2.x");
    }
}

bool isProtocolOne(std::string_view version)
{
    return version.substr(0, 2) == "1." && version.size() > 2 &&
           version.find_first_not_of("0123456789", 2) == std::string_view::npos;
}

std::string_view required(const XmlElement& tag, std::string_view attribute, XmlAttribute value)
{
    if (!value) {
        tag.fail(Kind::kInvalid, "missing " + std::string(tag.name()) + "." + std::string(attribute) + " attribute");
    }
    return *value;
}

} // namespace

ResponseReader::ResponseReader(const ExpectedResponse& expected, wire::ElementDecoder& decoder,
                               ContentHandler onContent, const base::Deadline& deadline)
    : fExpected(expected), fDecoder(decoder), fOnContent(std::move(onContent)), fDeadline(deadline),
      fBytesBefore(decoder.decodedBytes()),
      fSlicer({"CIM", "MESSAGE", "SIMPLERSP", "IMETHODRESPONSE", "METHODRESPONSE", "IRETURNVALUE"}, *this,
              decoder.limits())
{
    std::string opening;
    wire::appendAnswerOpening(opening, expected.messageId, expected.method, expected.isIntrinsic);
    fSlicer.expectOpening(std::move(opening),
                          {kLevels[0], kLevels[1], kLevels[2], wire::responseElement(expected.isIntrinsic)});
}

void ResponseReader::openEnvelope(const XmlElement& tag)
{
    const bool isAtLevel = fDepth < std::size(kLevels) &&
                           (tag.is(kLevels[fDepth]) || (fDepth == kResponseLevel && tag.is(kExtrinsicResponse)));
    if (!isAtLevel) {
        tag.fail(Kind::kInvalid, "Expected open of " +
                                     std::string(fDepth < std::size(kLevels) ? kLevels[fDepth] : "content") +
                                     " element, got " + std::string(tag.name()));
    }
    if (tag.is("CIM")) {
        XmlAttribute values[2];
        tag.attributes({"CIMVERSION", "DTDVERSION"}, values);
        expectVersion(tag, "CIMVERSION", values[0]);
        expectVersion(tag, "DTDVERSION", values[1]);
    } else if (tag.is("MESSAGE")) {
        openMessage(tag);
    } else if (fDepth == kResponseLevel) {
        openMethodResponse(tag);
    } else if (tag.is("IRETURNVALUE")) {
        if (!fExpected.isIntrinsic || fHasReturnValue || fError) {
            tag.fail(Kind::kInvalid, "unexpected IRETURNVALUE element");
        }
        fHasReturnValue = true;
    }
    ++fDepth;
}

// What the checks of these tags would have found is in the text that was expected.
void ResponseReader::openExpected()
{
    fDepth = kResponseLevel + 1;
    fHasResponse = true;
}

void ResponseReader::openMessage(const XmlElement& tag)
{
    XmlAttribute values[2];
    tag.attributes({"ID", "PROTOCOLVERSION"}, values);
    const std::string id(required(tag, "ID", values[0]));
    const std::string version(required(tag, "PROTOCOLVERSION", values[1]));
    if (!isProtocolOne(version)) {
        throwResponse("Received unsupported protocol version \"" + version + "\", expected \"1.[0-9]+\"");
    }
    if (id != fExpected.messageId) {
        throwResponse("Mismatched response message ID:  Got \"" + id + "\", expected \"" + fExpected.messageId + "\".");
    }
}

void ResponseReader::openMethodResponse(const XmlElement& tag)
{
    if (fHasResponse) {
        tag.fail(Kind::kInvalid, "a second response in the message");
    }
    fHasResponse = true;
    XmlAttribute values[1];
    tag.attributes({"NAME"}, values);
    const std::string name(required(tag, "NAME", values[0]));
    const bool isIntrinsic = !tag.is(kExtrinsicResponse);
    const bool isKnown = std::any_of(std::begin(kIntrinsicMethods), std::end(kIntrinsicMethods),
                                     [&](std::string_view known) { return base::equalNoCase(name, known); });
    if (isIntrinsic && !isKnown) {
        tag.fail(Kind::kInvalid, "Unrecognized IMethodResponse name \"" + name + "\"");
    }
    if (isIntrinsic != fExpected.isIntrinsic || !base::equalNoCase(name, fExpected.method)) {
        throwResponse("Mismatched response:  Got an answer to \"" + name + "\", expected one to \"" + fExpected.method +
                      "\".");
    }
}

void ResponseReader::closeEnvelope(std::string_view)
{
    --fDepth;
}

void ResponseReader::slice(const XmlElement& element)
{
    if (element.is("ERROR") && fDepth == kResponseLevel + 1 && !fHasReturnValue && !fError) {
        return readError(element);
    }
    if (!isInResult()) {
        if (fDepth < std::size(kLevels) && fDepth != kResponseLevel + 1) {
            element.fail(Kind::kInvalid, "Expected open of " + std::string(kLevels[fDepth]) + " element");
        }
        element.fail(Kind::kInvalid, "unexpected " + std::string(element.name()) + " element");
    }
    readContent(element);
}

// Whether an element that begins here belongs to the result.
bool ResponseReader::isInResult() const
{
    return fDepth == (fExpected.isIntrinsic ? kReturnLevel + 1 : kResponseLevel + 1) && !fError;
}

wire::XmlOffer ResponseReader::offer(std::string_view text)
{
    if (!fOnOffer || !isInResult()) {
        return {};
    }
    checkDeadline();
    const wire::XmlOffer offer = fOnOffer(text, fDecoder);
    if (offer.result == wire::XmlOffer::Result::kTaken) {
        fHasContent = true;
        checkDecodedBytes();
    }
    return offer;
}

void ResponseReader::readContent(const XmlElement& element)
{
    checkDeadline();
    fHasContent = true;
    fOnContent(element, fDecoder);
    checkDecodedBytes();
}

void ResponseReader::checkDeadline() const
{
    if (fDeadline.hasPassed()) {
        throw ConnectionTimeoutException();
    }
}

// After an object was decoded, and before the next one is.
void ResponseReader::checkDecodedBytes() const
{
    const std::size_t limit = fDecoder.limits().maxDecodedBytes;
    if (fDecoder.decodedBytes() - fBytesBefore > limit) {
        throw wire::XmlError(Kind::kTooLarge, fSlicer.place(),
                             "objects of more than " + std::to_string(limit) +
                                 " bytes in one answer (maxDecodedBytes)");
    }
}

void ResponseReader::readError(const XmlElement& element)
{
    XmlAttribute values[2];
    element.attributes({"CODE", "DESCRIPTION"}, values);
    const std::string_view digits = required(element, "CODE", values[0]);
    // Some servers write "06".
    const auto code = base::parseUnsigned(digits.substr(std::min(digits.find_first_not_of('0'), digits.size() - 1)));
    if (!code || *code > 0xFFFF) {
        element.fail(Kind::kInvalid, "missing ERROR.CODE attribute");
    }
    std::string scratch;
    const String description = values[1] ? fDecoder.toString(element, element.resolved(*values[1], scratch)) : String();
    Array<CIMInstance> instances;
    for (XmlElement child = element.firstChild(); child; child = child.nextSibling()) {
        instances.append(fDecoder.decodeInstance(child));
        checkDecodedBytes();
    }
    fError = CIMException(static_cast<CIMStatusCode>(*code), description, instances);
}

void ResponseReader::finish()
{
    fSlicer.finish();
    if (!fHasResponse) {
        throw wire::XmlError(Kind::kInvalid, fSlicer.place(), "expected IMETHODRESPONSE or METHODRESPONSE element");
    }
    if (!fExpected.result.empty() && !fHasContent && !fError) {
        throw wire::XmlError(Kind::kInvalid, fSlicer.place(),
                             "expected ERROR or IRETURNVALUE element with " + std::string(fExpected.result));
    }
}

} // namespace Pegasus::client
