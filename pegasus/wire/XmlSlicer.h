// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlElement.h"
#include "pegasus/wire/XmlNodes.h"

#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// What became of an element that was offered as text, before it is read.
struct XmlOffer
{
    enum class Result
    {
        kRefused, // it is to be read
        kCut,     // it goes on after the text, and may be offered again when more of it is there
        kTaken
    };

    Result result = Result::kRefused;
    std::size_t size = 0; // of the element that was taken
};

// What a sliced message is delivered to. A view is valid until the call returns.
class XmlSliceHandler
{
  public:
    virtual ~XmlSliceHandler() = default;
    // A start tag of the envelope, as an empty element.
    virtual void openEnvelope(const XmlElement& tag) = 0;
    // All start tags of XmlSlicer::expectOpening() at once.
    virtual void openExpected() {}
    virtual void closeEnvelope(std::string_view name) = 0;
    // The text from an element inside the envelope on, before it is read. A handler that knows such elements may take
    // one that is well formed and within the limits of what is in it; the rest of the text may be anything.
    virtual XmlOffer offer(std::string_view) { return {}; }
    // An element inside the envelope, with everything in it.
    virtual void slice(const XmlElement& element) = 0;
};

// Reads a message that arrives in pieces. It delivers the outer elements (the envelope) tag by tag, and each element
// inside them as soon as its end has come; then it forgets them.
// Throws: XmlError, and what the handler throws. After an exception it may only be destroyed.
class XmlSlicer
{
  public:
    // `envelope` names the elements that are opened rather than taken whole. The handler must outlive the slicer, and
    // the names, here and in expectOpening(), too.
    XmlSlicer(std::vector<std::string_view> envelope, XmlSliceHandler& handler, const XmlLimits& limits);

    // A message that begins with `opening`, and has all of it in its first piece, is not read tag by tag up to there.
    // Requires: it is a well-formed declaration and start tags of the envelope, each within the limits, with line feeds
    // between; `names` are the tags' names.
    void expectOpening(std::string opening, std::vector<std::string_view> names);

    void feed(std::string_view bytes);
    // The message has ended. Throws: XmlError when its XML is incomplete.
    void finish();

    // Returns: the place up to which the message was delivered.
    XmlPlace place() const { return fPlace; }

  private:
    void feedPiece(std::string_view bytes);
    void takeOpening();
    bool step();
    bool stepInSlice();
    bool mayOffer() const;
    XmlOffer::Result offer();
    bool stepInEnvelope();
    void takeDeclaration(const XmlToken& token);
    void takeInEnvelope(const XmlToken& token);
    void begin(const XmlToken& token);
    void close(std::string_view name);
    void deliver();
    void consume(std::size_t size);
    void checkElementSize(std::size_t size) const;
    const std::string_view* findEnvelope(std::string_view name) const;
    std::string_view rest() const { return std::string_view(fBuffer).substr(fStart); }

    const std::vector<std::string_view> fEnvelope;
    XmlSliceHandler& fHandler;
    XmlNodes fNodes;

    std::string fOpening; // what is expected; empty when the message has begun
    std::vector<std::string_view> fOpeningNames;
    std::string fBuffer;
    std::size_t fStart = 0;              // in the buffer: where what was not delivered yet begins
    std::size_t fRead = 0;               // from fStart: how far the element that begins there was read
    std::size_t fOffers = 0;             // of the element that begins there, and refused or cut
    XmlPlace fPlace{1, 1};               // of fStart
    std::vector<std::string_view> fOpen; // names of the envelope's open elements
    bool fHasDeclaration = false;
    bool fHasRoot = false;
};

} // namespace Pegasus::wire
