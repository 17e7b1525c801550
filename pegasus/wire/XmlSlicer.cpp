// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlSlicer.h"

#include "pegasus/wire/XmlText.h"

#include <algorithm>

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;
using Type = XmlToken::Type;

// Elements are delivered when so much of them is there, or when the bytes at hand are used up.
constexpr std::size_t kBatchBytes = 64UL * 1024;

} // namespace

XmlSlicer::XmlSlicer(std::vector<std::string_view> envelope, XmlSliceHandler& handler, const XmlLimits& limits)
    : fEnvelope(std::move(envelope)), fHandler(handler), fLimits(limits), fScanner(fLimits), fDocument(fLimits)
{
}

void XmlSlicer::feed(std::string_view bytes)
{
    fBuffer.insert(fBuffer.end(), bytes.begin(), bytes.end());
    run();
    fBuffer.erase(fBuffer.begin(), fBuffer.begin() + static_cast<std::ptrdiff_t>(fStart));
    fScanned -= fStart;
    fSliceStart -= std::min(fSliceStart, fStart);
    fStart = 0;
}

void XmlSlicer::run()
{
    while (fScanned < fBuffer.size() && step()) {
    }
    flush();
    if (fSliceDepth > 0) {
        checkElementSize(fBuffer.size() - fSliceStart);
    }
}

void XmlSlicer::checkElementSize(std::size_t size) const
{
    if (size > fLimits.maxElementBytes) {
        throw XmlError(Kind::kTooLarge, here(),
                       "an element of more than " + std::to_string(fLimits.maxElementBytes) + " bytes");
    }
}

std::string_view XmlSlicer::rest() const
{
    return std::string_view(fBuffer.data() + fScanned, fBuffer.size() - fScanned);
}

// The place that tokens were found up to.
XmlPlace XmlSlicer::here() const
{
    return advance(fPlace, std::string_view(fBuffer.data() + fStart, fScanned - fStart));
}

XmlToken XmlSlicer::nextToken() const
{
    try {
        return fScanner.next(rest(), fPlace);
    } catch (const XmlError&) {
        return fScanner.next(rest(), here()); // fails again, with the exact place
    }
}

// Takes one token. Returns: false when it is incomplete.
bool XmlSlicer::step()
{
    const XmlToken token = nextToken();
    // Text may go on with the next bytes; a slice may take it in parts.
    const bool isCut = token.type == Type::kText && token.size == rest().size() && fSliceDepth == 0;
    if (token.type == Type::kIncomplete || isCut) {
        return false;
    }
    take(token);
    return true;
}

void XmlSlicer::take(const XmlToken& token)
{
    if (!fHasDeclaration) {
        if (token.type == Type::kText && isBlank(rest().substr(0, token.size))) {
            return consume(token.size);
        }
        if (token.type != Type::kDeclaration) {
            throw XmlError(Kind::kInvalid, fPlace, "Expected <?xml ... ?> style declaration");
        }
        checkXmlDeclaration(rest().substr(0, token.size), fPlace);
        fHasDeclaration = true;
        return consume(token.size);
    }
    if (fSliceDepth > 0) {
        takeInSlice(token);
    } else {
        takeInEnvelope(token);
    }
}

void XmlSlicer::takeInSlice(const XmlToken& token)
{
    fScanned += token.size;
    if (token.type == Type::kStartTag) {
        ++fSliceDepth;
    }
    if (fOpen.size() + fSliceDepth > fLimits.maxDepth) {
        throw XmlError(Kind::kTooLarge, here(),
                       "elements nested more than " + std::to_string(fLimits.maxDepth) + " deep");
    }
    if (token.type == Type::kEndTag && --fSliceDepth == 0) {
        endSlice();
    }
}

void XmlSlicer::takeInEnvelope(const XmlToken& token)
{
    const std::string_view text = rest().substr(0, token.size);
    switch (token.type) {
    case Type::kStartTag:
    case Type::kEmptyTag:
        return isEnvelope(XmlScanner::tagName(text)) ? open(token) : beginSlice(token);
    case Type::kEndTag:
        flush();
        consume(0);
        close(XmlScanner::tagName(text));
        break;
    case Type::kText:
    case Type::kCData:
        if (!(fHasRoot && fOpen.empty() ? isPadding(text) : isBlank(text))) {
            throw XmlError(Kind::kInvalid, here(), "unexpected text between elements");
        }
        break;
    case Type::kDeclaration:
        throw XmlError(Kind::kNotWellFormed, fPlace, "a second XML declaration");
    default:
        break;
    }
    if (fHasSlices) {
        fScanned += token.size; // goes along with the elements around it
    } else {
        consume(token.size);
    }
}

void XmlSlicer::beginSlice(const XmlToken& token)
{
    if (fOpen.empty() && fHasRoot) {
        throw XmlError(Kind::kNotWellFormed, here(), "a second root element");
    }
    fSliceStart = fScanned;
    fScanned += token.size;
    if (token.type == Type::kEmptyTag) {
        endSlice();
    } else {
        fSliceDepth = 1;
    }
}

void XmlSlicer::endSlice()
{
    checkElementSize(fScanned - fSliceStart);
    fHasSlices = true;
    fSlicesEnd = fScanned;
    if (fScanned - fStart >= kBatchBytes) {
        flush();
    }
}

// Delivers the whole elements that have come, which are parsed together: one by one costs the allocator more.
void XmlSlicer::flush()
{
    if (!fHasSlices) {
        return;
    }
    fHasSlices = false;
    char* text = fBuffer.data() + fStart;
    const std::size_t size = fSlicesEnd - fStart;
    // The place is counted first, because parsing changes the text.
    const XmlPlace end = advance(fPlace, std::string_view(text, size));
    for (XmlElement element = fDocument.parseElement(text, size, fPlace); element; element = element.nextSibling()) {
        fHandler.slice(element);
    }
    fPlace = end;
    fStart = fSlicesEnd;
}

void XmlSlicer::open(const XmlToken& token)
{
    flush();
    consume(0);
    if (fOpen.empty() && fHasRoot) {
        throw XmlError(Kind::kNotWellFormed, here(), "a second root element");
    }
    const std::string name(XmlScanner::tagName(rest().substr(0, token.size)));
    // The tag by itself is made an element that the parser can read.
    std::string tag(rest().substr(0, token.size));
    if (token.type == Type::kStartTag) {
        tag.insert(tag.size() - 1, 1, '/');
    }
    fHasRoot = true;
    fOpen.push_back(name);
    fHandler.openEnvelope(fDocument.parseElement(tag.data(), tag.size(), fPlace));
    if (token.type == Type::kEmptyTag) {
        close(name);
    }
    consume(token.size);
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

// Drops everything up to `size` bytes after the last token found.
void XmlSlicer::consume(std::size_t size)
{
    const std::size_t end = fScanned + size;
    fPlace = advance(fPlace, std::string_view(fBuffer.data() + fStart, end - fStart));
    fScanned = end;
    fStart = end;
}

bool XmlSlicer::isEnvelope(std::string_view name) const
{
    return std::find(fEnvelope.begin(), fEnvelope.end(), name) != fEnvelope.end();
}

void XmlSlicer::finish()
{
    if (!fHasDeclaration) {
        throw XmlError(Kind::kInvalid, fPlace, "Expected <?xml ... ?> style declaration");
    }
    if (!fHasRoot || !fOpen.empty() || fSliceDepth > 0 || !isPadding(rest())) {
        throw XmlError(Kind::kNotWellFormed, fPlace, "the answer ends before its XML does");
    }
}

} // namespace Pegasus::wire
