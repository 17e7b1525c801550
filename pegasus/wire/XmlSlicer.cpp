// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlSlicer.h"

#include "pegasus/wire/XmlText.h"

#include <algorithm>

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;
using Type = XmlToken::Type;

// So many bytes are read before the delivered ones among them are dropped.
constexpr std::size_t kPieceBytes = 64UL * 1024;

// An element that is cut off is offered again when more of it is there, but so often at most: each offer begins from
// its start.
constexpr std::size_t kMaxOffers = 4;
// The most attributes of a tag in an expected opening.
constexpr std::size_t kOpeningAttributes = 2;
// The most levels of an offered element.
constexpr std::size_t kOfferedDepth = 8;

} // namespace

XmlSlicer::XmlSlicer(std::vector<std::string_view> envelope, XmlSliceHandler& handler, const XmlLimits& limits)
    : fEnvelope(std::move(envelope)), fHandler(handler), fNodes(limits)
{
    fOpen.reserve(fEnvelope.size());
}

void XmlSlicer::expectOpening(std::string opening, std::vector<std::string_view> names)
{
    const XmlLimits& limits = fNodes.limits();
    if (names.size() <= limits.maxDepth && opening.size() <= limits.maxTagBytes &&
        kOpeningAttributes <= limits.maxAttributes)
    {
        fOpening = std::move(opening);
        fOpeningNames = std::move(names);
    }
}

void XmlSlicer::feed(std::string_view bytes)
{
    while (!bytes.empty()) {
        const std::string_view piece = bytes.substr(0, kPieceBytes);
        feedPiece(piece);
        bytes.remove_prefix(piece.size());
    }
}

void XmlSlicer::feedPiece(std::string_view bytes)
{
    fBuffer.append(bytes);
    fNodes.setSource({rest(), fPlace});
    if (!fOpening.empty()) {
        takeOpening();
    }
    while (fRead < rest().size() && step()) {
    }
    if (fNodes.depth() > 0) {
        checkElementSize(rest().size());
    }
    fBuffer.erase(0, fStart);
    fStart = 0;
}

void XmlSlicer::takeOpening()
{
    if (rest().substr(0, fOpening.size()) == fOpening) {
        fHasDeclaration = true;
        fHasRoot = true;
        fOpen = std::move(fOpeningNames);
        fHandler.openExpected();
        consume(fOpening.size());
    }
    fOpening.clear();
}

// Takes one token of the envelope, or what has arrived of an element in it. Returns: false when more is needed.
bool XmlSlicer::step()
{
    if (fNodes.depth() > 0) {
        return stepInSlice();
    }
    switch (mayOffer() ? offer() : XmlOffer::Result::kRefused) {
    case XmlOffer::Result::kTaken:
        return true;
    case XmlOffer::Result::kCut:
        return false;
    default:
        return stepInEnvelope();
    }
}

XmlOffer::Result XmlSlicer::offer()
{
    const XmlOffer offer = fHandler.offer(rest());
    if (offer.result == XmlOffer::Result::kTaken) {
        checkElementSize(offer.size);
        consume(offer.size);
        return offer.result;
    }
    fOffers = offer.result == XmlOffer::Result::kCut ? fOffers + 1 : kMaxOffers;
    return fOffers < kMaxOffers ? XmlOffer::Result::kCut : XmlOffer::Result::kRefused;
}

bool XmlSlicer::mayOffer() const
{
    return fOffers < kMaxOffers && !fOpen.empty() && fOpen.size() + kOfferedDepth <= fNodes.limits().maxDepth &&
           rest().front() == '<';
}

bool XmlSlicer::stepInSlice()
{
    fRead = fNodes.read(fRead);
    if (fNodes.depth() > 0) {
        return false;
    }
    deliver();
    return true;
}

bool XmlSlicer::stepInEnvelope()
{
    fNodes.clear(fOpen.size());
    const XmlToken token = fNodes.next(0);
    const bool isCut = token.type == Type::kText && token.size == rest().size(); // it may go on with the next bytes
    if (token.type == Type::kIncomplete || isCut) {
        return false;
    }
    if (fHasDeclaration) {
        takeInEnvelope(token);
    } else {
        takeDeclaration(token);
    }
    return true;
}

void XmlSlicer::takeDeclaration(const XmlToken& token)
{
    const std::string_view text = rest().substr(0, token.size);
    if (token.type != Type::kText || !isBlank(text)) {
        if (token.type != Type::kDeclaration) {
            throw XmlError(Kind::kInvalid, fPlace, "Expected <?xml ... ?> style declaration");
        }
        checkXmlDeclaration(text, fPlace);
        fHasDeclaration = true;
    }
    consume(token.size);
}

void XmlSlicer::takeInEnvelope(const XmlToken& token)
{
    const std::string_view text = rest().substr(0, token.size);
    switch (token.type) {
    case Type::kStartTag:
    case Type::kEmptyTag:
        return begin(token);
    case Type::kEndTag:
        close(token.name.in(text));
        break;
    case Type::kText:
    case Type::kCData:
        if (!(fHasRoot && fOpen.empty() ? isPadding(text) : isBlank(text))) {
            throw XmlError(Kind::kInvalid, fPlace, "unexpected text between elements");
        }
        break;
    case Type::kDeclaration:
        throw XmlError(Kind::kNotWellFormed, fPlace, "a second XML declaration");
    default:
        break;
    }
    consume(token.size);
}

// Begins an element: of the envelope, which is its tag alone, or inside it.
void XmlSlicer::begin(const XmlToken& token)
{
    if (fOpen.empty() && fHasRoot) {
        throw XmlError(Kind::kNotWellFormed, fPlace, "a second root element");
    }
    fNodes.take(token, 0);
    fRead = token.size;
    const std::string_view* const name = findEnvelope(token.name.in(rest()));
    if (name == nullptr) {
        if (token.type == Type::kEmptyTag) {
            deliver();
        }
        return;
    }
    fNodes.source().expectNoZero(fRead);
    fHasRoot = true;
    fOpen.push_back(*name);
    fHandler.openEnvelope(XmlElement(fNodes, 0));
    fNodes.clear();
    if (token.type == Type::kEmptyTag) {
        close(*name);
    }
    consume(fRead);
}

void XmlSlicer::close(std::string_view name)
{
    if (fOpen.empty() || fOpen.back() != name) {
        throw XmlError(Kind::kNotWellFormed, fPlace,
                       "Closing element does not match opening element: " + std::string(name));
    }
    fOpen.pop_back();
    fHandler.closeEnvelope(name);
}

void XmlSlicer::deliver()
{
    checkElementSize(fRead);
    fNodes.source().expectNoZero(fRead);
    fHandler.slice(XmlElement(fNodes, 0));
    consume(fRead);
}

// Drops so many bytes, which were read and delivered, and the end of their line.
void XmlSlicer::consume(std::size_t size)
{
    if (size < rest().size() && isLineFeedBetween(rest(), size)) {
        ++size;
    }
    fPlace = advance(fPlace, rest().substr(0, size));
    fStart += size;
    fRead = 0;
    fOffers = 0;
    fNodes.setSource({rest(), fPlace});
}

void XmlSlicer::checkElementSize(std::size_t size) const
{
    const std::size_t limit = fNodes.limits().maxElementBytes;
    if (size > limit) {
        fNodes.source().fail(Kind::kTooLarge, fRead, "an element of more than " + std::to_string(limit) + " bytes");
    }
}

// Returns: null for an element inside the envelope.
const std::string_view* XmlSlicer::findEnvelope(std::string_view name) const
{
    const auto found = std::find(fEnvelope.begin(), fEnvelope.end(), name);
    return found != fEnvelope.end() ? &*found : nullptr;
}

void XmlSlicer::finish()
{
    if (!fHasDeclaration) {
        throw XmlError(Kind::kInvalid, fPlace, "Expected <?xml ... ?> style declaration");
    }
    if (!fHasRoot || !fOpen.empty() || fNodes.depth() > 0 || !isPadding(rest())) {
        throw XmlError(Kind::kNotWellFormed, fPlace, "the answer ends before its XML does");
    }
}

} // namespace Pegasus::wire
