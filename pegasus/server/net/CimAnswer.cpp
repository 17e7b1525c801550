// SPDX-License-Identifier: MIT
#include "pegasus/server/net/CimAnswer.h"

#include "pegasus/base/Text.h"
#include "pegasus/wire/AnswerEnvelope.h"
#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/XmlText.h"

namespace Pegasus::server {

namespace {

constexpr std::size_t kTailBytes = 96;
constexpr std::string_view kTail = "</SIMPLERSP>\n</MESSAGE>\n</CIM>\n";

std::string symbolicName(unsigned code)
{
    const bool known = (code >= 1 && code <= 28) && code != 18 && code != 19;
    return known ? cimStatusCodeToString(static_cast<CIMStatusCode>(code))
                 : "Unrecognized CIM status code \"" + std::to_string(code) + "\"";
}

// A text that a vendor made too long would exceed the trailer that its readers accept.
void cutText(std::string& text)
{
    if (text.size() <= CimAnswer::kMaxStatusTextBytes) {
        return;
    }
    std::size_t end = CimAnswer::kMaxStatusTextBytes;
    while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80) { // not within a character
        --end;
    }
    text.resize(end);
}

} // namespace

CimStatus makeStatus(CIMStatusCode code, const std::string& text)
{
    const auto number = static_cast<unsigned>(code);
    return {number, symbolicName(number) + (text.empty() ? "" : ": " + text)};
}

CimStatus statusOf(const CIMException& error)
{
    const CIMStatusCode code = error.getCode() == CIM_ERR_SUCCESS ? CIM_ERR_FAILED : error.getCode();
    return makeStatus(code, base::utf8(error.getMessage()));
}

CimAnswer::CimAnswer(AnswerStream& stream, const CimRequest& request, Envelope envelope)
    : fStream(stream), fRequest(request), fEnvelope(envelope)
{
}

void CimAnswer::open()
{
    if (fOpen) {
        return;
    }
    fOpen = true;
    if (fEnvelope == Envelope::kBare) {
        return;
    }
    std::string head;
    wire::appendAnswerOpening(head, fRequest.messageId, fRequest.method, fRequest.isIntrinsic);
    fStream.write(head);
}

void CimAnswer::openReturnValue()
{
    if (fReturnValueOpen || !fRequest.isIntrinsic || fEnvelope == Envelope::kBare) {
        return;
    }
    fReturnValueOpen = true;
    fStream.write("<IRETURNVALUE>\n");
}

void CimAnswer::write(std::string_view elements)
{
    open();
    openReturnValue();
    fStream.write(elements);
}

void CimAnswer::close()
{
    open();
    if (fEnvelope == Envelope::kBare) {
        return;
    }
    std::string tail;
    tail.reserve(kTailBytes);
    if (fReturnValueOpen) {
        tail += "</IRETURNVALUE>\n";
    }
    fStream.write(tail.append("</").append(wire::responseElement(fRequest.isIntrinsic)).append(">\n").append(kTail));
}

void CimAnswer::finish()
{
    close();
    fStream.finish();
}

void CimAnswer::fail(CimStatus status, ErrorPlace place)
{
    cutText(status.text);
    const bool inTrailer = fStream.isChunked() && place != ErrorPlace::kBody;
    const bool keeps = inTrailer && place == ErrorPlace::kAfterElements;
    if (!fStream.hasStarted() && !keeps) {
        fStream.discard();
        fOpen = fReturnValueOpen = false;
    }
    if (inTrailer) {
        close();
        fStream.finish(status);
        return;
    }
    open();
    std::string error = "<ERROR CODE=\"" + std::to_string(status.code) + "\" DESCRIPTION=\"";
    wire::appendEscaped(error, std::string_view(status.text));
    error += "\"/>";
    fStream.write(error);
    close();
    fStream.finish();
}

} // namespace Pegasus::server
