#include "pegasus/common/XmlSlicer.h"

#include "pegasus/common/XmlText.h"

#include <algorithm>

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;
using Type = XmlToken::Type;

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
    fStart = 0;
}

void XmlSlicer::run()
{
    while (fScanned < fBuffer.size() && step()) {
    }
    checkElementSize(fBuffer.size() - fStart);
}

void XmlSlicer::checkElementSize(std::size_t size) const
{
    if (size > fLimits.maxElementBytes)
        throw XmlError(Kind::TooLarge, fPlace,
                       "an element of more than " + std::to_string(fLimits.maxElementBytes) + " bytes");
}

std::string_view XmlSlicer::rest() const
{
    return std::string_view(fBuffer.data() + fScanned, fBuffer.size() - fScanned);
}

/// Takes one token. Returns: false when it is not complete.
bool XmlSlicer::step()
{
    const XmlToken token = fScanner.next(rest(), fPlace);
    // Text may go on with the next bytes; in a slice that does not matter.
    const bool isCut = token.type == Type::Text && token.size == rest().size() && fSliceDepth == 0;
    if (token.type == Type::Incomplete || isCut)
        return false;
    take(token);
    return true;
}

void XmlSlicer::take(const XmlToken& token)
{
    if (!fHasDeclaration) {
        if (token.type != Type::Declaration)
            throw XmlError(Kind::Invalid, fPlace, "Expected <?xml ... ?> style declaration");
        checkXmlDeclaration(rest().substr(0, token.size), fPlace);
        fHasDeclaration = true;
        return consume(token.size);
    }
    if (fSliceDepth > 0)
        takeInSlice(token);
    else
        takeInEnvelope(token);
}

void XmlSlicer::takeInSlice(const XmlToken& token)
{
    fScanned += token.size;
    if (token.type == Type::StartTag)
        ++fSliceDepth;
    if (fOpen.size() + fSliceDepth > fLimits.maxDepth)
        throw XmlError(Kind::TooLarge, fPlace,
                       "elements nested more than " + std::to_string(fLimits.maxDepth) + " deep");
    if (token.type == Type::EndTag && --fSliceDepth == 0)
        deliver(fScanned - fStart);
}

void XmlSlicer::takeInEnvelope(const XmlToken& token)
{
    const std::string_view text = rest().substr(0, token.size);
    switch (token.type) {
    case Type::StartTag:
    case Type::EmptyTag:
        return open(token);
    case Type::EndTag:
        close(XmlScanner::tagName(text));
        break;
    case Type::Text:
    case Type::CData:
        if (text.find_first_not_of(" \t\r\n") != std::string_view::npos)
            throw XmlError(Kind::Invalid, fPlace, "unexpected text between elements");
        break;
    case Type::Declaration:
        throw XmlError(Kind::NotWellFormed, fPlace, "a second XML declaration");
    default:
        break;
    }
    consume(token.size);
}

void XmlSlicer::open(const XmlToken& token)
{
    const std::string name(XmlScanner::tagName(rest().substr(0, token.size)));
    if (fOpen.empty() && fHasRoot)
        throw XmlError(Kind::NotWellFormed, fPlace, "a second root element");
    if (!isEnvelope(name)) {
        if (token.type == Type::EmptyTag) {
            fScanned += token.size;
            return deliver(token.size);
        }
        fSliceDepth = 1;
        fScanned += token.size;
        return;
    }
    // The tag by itself is made an element that the parser can read.
    std::string tag(rest().substr(0, token.size));
    if (token.type == Type::StartTag)
        tag.insert(tag.size() - 1, 1, '/');
    fHasRoot = true;
    fOpen.push_back(name);
    fHandler.openEnvelope(fDocument.parseElement(tag.data(), tag.size(), fPlace));
    if (token.type == Type::EmptyTag)
        close(name);
    consume(token.size);
}

void XmlSlicer::close(std::string_view name)
{
    if (fOpen.empty() || fOpen.back() != name)
        throw XmlError(Kind::NotWellFormed, fPlace,
                       "Closing element does not match opening element: " + std::string(name));
    fOpen.pop_back();
    fHandler.closeEnvelope(name);
}

void XmlSlicer::deliver(std::size_t size)
{
    checkElementSize(size);
    char* text = fBuffer.data() + fStart;
    // Counted first: parsing changes the text.
    const XmlPlace end = advance(fPlace, std::string_view(text, size));
    fHandler.slice(fDocument.parseElement(text, size, fPlace));
    fPlace = end;
    fStart += size;
}

void XmlSlicer::consume(std::size_t size)
{
    fPlace = advance(fPlace, rest().substr(0, size));
    fScanned += size;
    fStart = fScanned;
}

bool XmlSlicer::isEnvelope(std::string_view name) const
{
    return std::find(fEnvelope.begin(), fEnvelope.end(), name) != fEnvelope.end();
}

void XmlSlicer::finish()
{
    if (!fHasDeclaration)
        throw XmlError(Kind::Invalid, fPlace, "Expected <?xml ... ?> style declaration");
    const bool onlyBlanks = rest().find_first_not_of(" \t\r\n") == std::string_view::npos;
    if (!fHasRoot || !fOpen.empty() || fSliceDepth > 0 || !onlyBlanks)
        throw XmlError(Kind::NotWellFormed, fPlace, "the answer ends before its XML does");
}

} // namespace Pegasus::wire
