// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlDocument.h"

#include "pegasus/wire/XmlText.h"

#include <algorithm>
#include <limits>

namespace Pegasus::wire {

using Kind = XmlError::Kind;
using Type = XmlToken::Type;

XmlElement XmlDocument::parseMessage(std::string_view text)
{
    begin(text);
    return parseFrom(readDeclaration());
}

XmlElement XmlDocument::parseFragment(std::string_view text)
{
    begin(text);
    return parseFrom(0);
}

void XmlDocument::begin(std::string_view text)
{
    fNodes.clear();
    fNodes.setSource({text});
    if (text.size() > std::numeric_limits<std::uint32_t>::max()) {
        fNodes.source().fail(Kind::kTooLarge, 0, "a text of more than 4 GB");
    }
}

// Returns: the offset after the declaration.
std::size_t XmlDocument::readDeclaration()
{
    const XmlSource& source = fNodes.source();
    const std::size_t at = std::min(source.text.find_first_not_of(kBlanks), source.text.size());
    const XmlToken token = at == source.text.size() ? XmlToken() : fNodes.next(at);
    if (token.type != Type::kDeclaration) {
        source.fail(Kind::kInvalid, at, "Expected <?xml ... ?> style declaration");
    }
    checkXmlDeclaration(source.text.substr(at, token.size), source.placeAt(at));
    return at + token.size;
}

XmlElement XmlDocument::parseFrom(std::size_t at)
{
    const XmlSource& source = fNodes.source();
    while (at < source.text.size()) {
        const XmlToken token = fNodes.next(at);
        if (token.type == Type::kIncomplete) {
            source.fail(Kind::kNotWellFormed, at, "the document ends inside a tag or section");
        }
        takeOutside(token, at);
        at = fNodes.read(at + token.size);
        if (fNodes.depth() > 0 && at < source.text.size()) {
            source.fail(Kind::kNotWellFormed, at, "the document ends inside a tag or section");
        }
    }
    if (fNodes.isEmpty() || fNodes.depth() > 0) {
        source.fail(Kind::kNotWellFormed, at, "the document ends before its root element does");
    }
    const XmlSpan content = fNodes.node(0).content;
    source.expectNoZero(std::size_t(content.begin) + content.size);
    return XmlElement(fNodes, 0);
}

// Takes a token before, of or after the root element.
void XmlDocument::takeOutside(const XmlToken& token, std::size_t at)
{
    const XmlSource& source = fNodes.source();
    const std::string_view text = source.text.substr(at, token.size);
    switch (token.type) {
    case Type::kStartTag:
    case Type::kEmptyTag:
        if (!fNodes.isEmpty()) {
            source.fail(Kind::kNotWellFormed, at, "a second root element");
        }
        return fNodes.take(token, at);
    case Type::kEndTag:
        source.fail(Kind::kNotWellFormed, at, "an end tag without a start tag");
    case Type::kText:
    case Type::kCData:
        if (!(fNodes.isEmpty() ? isBlank(text) : isPadding(text))) {
            source.fail(Kind::kNotWellFormed, at, "text outside the root element");
        }
        break;
    default:
        break;
    }
}

} // namespace Pegasus::wire
