// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlElement.h"

#include "pegasus/wire/XmlText.h"

#include <algorithm>
#include <cstring>

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;

// Attributes differ in their first byte or their size more often than not.
bool isSame(std::string_view x, std::string_view y)
{
    return x.size() == y.size() && x[0] == y[0] && std::memcmp(x.data(), y.data(), x.size()) == 0;
}

} // namespace

std::string_view XmlElement::startTag() const
{
    const std::size_t begin = node().name.begin - 1; // of the '<'
    return text().substr(begin, node().content.begin - begin);
}

XmlElement XmlElement::firstChild() const
{
    if (!node().hasChild && !node().hasText) {
        return XmlElement();
    }
    if (node().hasText) {
        fail(Kind::kInvalid, "unexpected text in " + std::string(name()) + " element");
    }
    return XmlElement(*fNodes, fIndex + 1);
}

XmlElement XmlElement::nextSibling() const
{
    if (node().hasTextAfter) {
        fail(Kind::kInvalid, "unexpected text after " + std::string(name()) + " element");
    }
    return node().nextSibling == 0 ? XmlElement() : XmlElement(*fNodes, node().nextSibling);
}

XmlElement XmlElement::onlyChild() const
{
    const XmlElement child = firstChild();
    if (!child) {
        fail(Kind::kInvalid, "missing element in " + std::string(name()) + " element");
    }
    if (const XmlElement second = child.nextSibling()) {
        second.failIn(*this);
    }
    return child;
}

void XmlElement::expectNoChildren() const
{
    if (const XmlElement child = firstChild()) {
        child.failIn(*this);
    }
}

void XmlElement::expectName(std::string_view expectedName) const
{
    if (!is(expectedName)) {
        fail(Kind::kInvalid, "expected " + std::string(expectedName) + " element, got " + std::string(name()));
    }
}

void XmlElement::readAttributes(const std::string_view* names, XmlAttribute* values, std::size_t count) const
{
    std::fill(values, values + count, XmlAttribute());
    const XmlAttributeSpan* const first = fNodes->attributesOf(node());
    for (const XmlAttributeSpan* span = first; span != first + node().attributeCount; ++span) {
        const std::string_view attributeName = span->name.in(text());
        std::size_t index = 0;
        while (index < count && !isSame(attributeName, names[index])) {
            ++index;
        }
        if (index == count) {
            continue;
        }
        if (values[index]) {
            fail(Kind::kNotWellFormed, "attribute \"" + std::string(attributeName) + "\" twice");
        }
        values[index] = XmlAttribute(span->value.in(text()));
    }
}

std::string_view XmlElement::text(std::string& scratch) const
{
    if (node().hasChild) {
        XmlElement(*fNodes, fIndex + 1).failIn(*this);
    }
    return node().hasSections ? textInPieces(scratch) : resolved(trimBlanks(node().content.in(text())), scratch);
}

std::string_view XmlElement::rawText() const
{
    return node().hasChild || node().hasSections ? std::string_view() : trimBlanks(node().content.in(text()));
}

// Only the blanks outside CDATA sections are trimmed.
std::string_view XmlElement::textInPieces(std::string& scratch) const
{
    constexpr std::string_view kCDataStart = "<![CDATA[";
    constexpr std::size_t kCDataEndBytes = 3;
    const XmlScanner scanner(fNodes->limits());
    const std::size_t end = std::size_t(node().content.begin) + node().content.size;
    const XmlSource source{text().substr(0, end), fNodes->source().start};
    std::vector<XmlAttributeSpan> none;
    std::string all;
    std::string piece;
    std::size_t firstKept = std::string::npos; // of the CDATA sections' bytes
    std::size_t keptEnd = 0;
    for (std::size_t at = node().content.begin; at < end;) {
        const XmlToken token = scanner.next(source, at, none);
        if (token.type == XmlToken::Type::kText) {
            all += resolved(source.text.substr(at, token.size), piece);
        } else if (token.type == XmlToken::Type::kCData) {
            firstKept = std::min(firstKept, all.size());
            appendNormalized(
                all, source.text.substr(at + kCDataStart.size(), token.size - kCDataStart.size() - kCDataEndBytes));
            keptEnd = all.size();
        }
        at += token.size;
    }
    const std::size_t begin = std::min({all.find_first_not_of(kBlanks), firstKept, all.size()});
    const std::size_t textEnd = std::max(all.find_last_not_of(kBlanks) + 1, keptEnd);
    scratch.assign(all, begin, std::max(begin, textEnd) - begin);
    return scratch;
}

std::string_view XmlElement::resolved(std::string_view raw, std::string& scratch) const
{
    if (!needsResolving(raw)) {
        return raw;
    }
    scratch.clear();
    const std::string problem = resolveReferences(raw, scratch);
    if (!problem.empty()) {
        fail(Kind::kNotWellFormed, problem + " in " + std::string(name()) + " element");
    }
    return scratch;
}

void XmlElement::fail(Kind kind, const std::string& cause) const
{
    throw XmlError(kind, place(), cause);
}

void XmlElement::failIn(const XmlElement& parent) const
{
    fail(Kind::kInvalid,
         "Expected close of " + std::string(parent.name()) + " element, got " + std::string(name()) + " instead");
}

XmlPlace XmlElement::place() const
{
    return fNodes->source().placeAt(node().name.begin - 1); // of the '<'
}

} // namespace Pegasus::wire
