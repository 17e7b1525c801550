// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Deadline.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/XmlSlicer.h"

#include <Pegasus/Common/Exception.h>

#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace Pegasus::client {

// What the answer to a request has to be.
struct ExpectedResponse
{
    std::string messageId;
    std::string method;
    bool isIntrinsic = true;
    std::string_view result{}; // the element that must be in it; empty when there may be none
};

// Reads the CIM-XML answer to one request while it arrives.
// Throws: wire::XmlError, also when the objects of the answer take more memory than the decoder's limit;
// CIMClientResponseException (an answer to something else); TypeMismatchException (an instance under another class's
// name); ConnectionTimeoutException when the deadline has passed and there is another element to decode.
class ResponseReader : private wire::XmlSliceHandler
{
  public:
    // Gets each element of the result: the children of IRETURNVALUE, or of METHODRESPONSE.
    using ContentHandler = std::function<void(const wire::XmlElement&, wire::ElementDecoder&)>;

    // May take an element of the result before it is read, from the text that begins with it.
    using OfferHandler = std::function<wire::XmlOffer(std::string_view, wire::ElementDecoder&)>;

    // Both references must outlive the reader.
    ResponseReader(const ExpectedResponse& expected, wire::ElementDecoder& decoder, ContentHandler onContent,
                   const base::Deadline& deadline = base::Deadline::never());

    void setOfferHandler(OfferHandler onOffer) { fOnOffer = std::move(onOffer); }

    void feed(std::string_view bytes) { fSlicer.feed(bytes); }
    // The body has ended. Throws: XmlError when the answer is incomplete.
    void finish();

    // Returns: the answer's ERROR element, if there was one; its code may be 0, success.
    const std::optional<CIMException>& error() const { return fError; }
    wire::XmlPlace place() const { return fSlicer.place(); }

  private:
    void openEnvelope(const wire::XmlElement& tag) override;
    void openExpected() override;
    void closeEnvelope(std::string_view name) override;
    wire::XmlOffer offer(std::string_view text) override;
    void slice(const wire::XmlElement& element) override;

    void openMessage(const wire::XmlElement& tag);
    void openMethodResponse(const wire::XmlElement& tag);
    void readError(const wire::XmlElement& element);
    void readContent(const wire::XmlElement& element);
    bool isInResult() const;
    void checkDeadline() const;
    void checkDecodedBytes() const;

    const ExpectedResponse& fExpected;
    wire::ElementDecoder& fDecoder;
    ContentHandler fOnContent;
    OfferHandler fOnOffer;
    base::Deadline fDeadline;
    std::size_t fBytesBefore; // that the decoder had decoded before this answer
    std::size_t fDepth = 0;
    bool fHasResponse = false;
    bool fHasReturnValue = false;
    bool fHasContent = false;
    std::optional<CIMException> fError;
    wire::XmlSlicer fSlicer;
};

} // namespace Pegasus::client
