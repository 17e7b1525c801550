// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlDocument.h"
#include "pegasus/wire/XmlScanner.h"

#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// What a sliced message is delivered to. A view is valid until the call returns.
class XmlSliceHandler
{
  public:
    virtual ~XmlSliceHandler() = default;
    // A start tag of the envelope, as an empty element.
    virtual void openEnvelope(const XmlElement& tag) = 0;
    virtual void closeEnvelope(std::string_view name) = 0;
    // An element inside the envelope, with everything in it.
    virtual void slice(const XmlElement& element) = 0;
};

// Cuts a message that arrives in pieces. It delivers the outer elements (the envelope) tag by tag, and each element
// inside them when all of it has come; then it forgets them.
// Throws: XmlError, and what the handler throws. After an exception it may only be destroyed.
class XmlSlicer
{
  public:
    // `envelope` names the elements that are opened rather than taken whole. Both references must outlive the slicer.
    XmlSlicer(std::vector<std::string_view> envelope, XmlSliceHandler& handler, const XmlLimits& limits);

    void feed(std::string_view bytes);
    // The message has ended. Throws: XmlError when its XML is incomplete.
    void finish();

    // Returns: the place up to which the message was read.
    XmlPlace place() const { return fPlace; }

  private:
    void run();
    bool step();
    void take(const XmlToken& token);
    void takeInSlice(const XmlToken& token);
    void takeInEnvelope(const XmlToken& token);
    void open(const XmlToken& token);
    void close(std::string_view name);
    void beginSlice(const XmlToken& token);
    void endSlice();
    void flush();
    void consume(std::size_t size);
    XmlPlace here() const;
    XmlToken nextToken() const;
    void checkElementSize(std::size_t size) const;
    bool isEnvelope(std::string_view name) const;
    std::string_view rest() const;

    const std::vector<std::string_view> fEnvelope;
    XmlSliceHandler& fHandler;
    const XmlLimits fLimits;
    const XmlScanner fScanner;
    XmlDocument fDocument;

    std::vector<char> fBuffer;
    std::size_t fStart = 0;   // in the buffer: where what was not delivered yet begins
    std::size_t fScanned = 0; // in the buffer: how far tokens were found
    XmlPlace fPlace{1, 1};    // of fStart
    std::vector<std::string> fOpen;
    std::size_t fSliceDepth = 0; // elements open in the element that begins at fSliceStart; 0 outside
    std::size_t fSliceStart = 0;
    std::size_t fSlicesEnd = 0; // end of the whole elements that begin at fStart and were not delivered yet
    bool fHasSlices = false;    // are there any?
    bool fHasDeclaration = false;
    bool fHasRoot = false;
};

} // namespace Pegasus::wire
