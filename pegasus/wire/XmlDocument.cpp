// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlDocument.h"

#include "pegasus/wire/XmlScanner.h"
#include "pegasus/wire/XmlText.h"

#include <pugixml.hpp>

#include <algorithm>
#include <cstring>

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;

// References and line ends are resolved by XmlText, which is strict about them and leaves the message alone.
constexpr unsigned kParseOptions = pugi::parse_cdata | pugi::parse_embed_pcdata;

std::string quoted(std::string_view text)
{
    return "\"" + std::string(text) + "\"";
}

// Checks what the parser leaves open: one root, tokens and nesting within the limits, DOCTYPE absent.
class MessageCheck
{
  public:
    MessageCheck(std::string_view message, const XmlLimits& limits) : fRest(message), fLimits(limits), fScanner(limits)
    {
    }

    void run(bool expectDeclaration);
    // The root element's text and place; valid after run().
    std::string_view root() const { return fRoot; }
    XmlPlace rootPlace() const { return fRootPlace; }

  private:
    XmlToken take();
    void open(XmlToken token, const char* start, XmlPlace place);
    void close(const char* end);
    void expectOnlyBlanks(std::string_view text, XmlPlace place) const;
    void takeDeclaration();

    std::string_view fRest;
    const XmlLimits& fLimits;
    XmlScanner fScanner;
    XmlPlace fPlace{1, 1};
    std::size_t fDepth = 0;
    std::string_view fRoot;
    XmlPlace fRootPlace;
    const char* fRootStart = nullptr;
};

XmlToken MessageCheck::take()
{
    const XmlToken token = fScanner.next(fRest, fPlace);
    if (token.type == XmlToken::Type::kIncomplete) {
        throw XmlError(Kind::kNotWellFormed, fPlace, "the document ends inside a tag or section");
    }
    return token;
}

void MessageCheck::open(XmlToken token, const char* start, XmlPlace place)
{
    if (fDepth == 0) {
        if (fRootStart) {
            throw XmlError(Kind::kNotWellFormed, place, "a second root element");
        }
        fRootStart = start;
        fRootPlace = place;
    }
    if (++fDepth > fLimits.maxDepth) {
        throw XmlError(Kind::kTooLarge, place,
                       "elements nested more than " + std::to_string(fLimits.maxDepth) + " deep");
    }
    if (token.type == XmlToken::Type::kEmptyTag) {
        close(start + token.size);
    }
}

void MessageCheck::close(const char* end)
{
    if (fDepth == 0) {
        throw XmlError(Kind::kNotWellFormed, fPlace, "an end tag without a start tag");
    }
    if (--fDepth == 0) {
        fRoot = std::string_view(fRootStart, static_cast<std::size_t>(end - fRootStart));
    }
}

void MessageCheck::expectOnlyBlanks(std::string_view text, XmlPlace place) const
{
    if (fDepth == 0 && !(fRoot.empty() ? isBlank(text) : isPadding(text))) {
        throw XmlError(Kind::kNotWellFormed, place, "text outside the root element");
    }
}

void MessageCheck::takeDeclaration()
{
    const std::string_view blanks = fRest.substr(0, std::min(fRest.find_first_not_of(kBlanks), fRest.size()));
    fPlace = advance(fPlace, blanks);
    fRest.remove_prefix(blanks.size());
    const XmlToken token = fRest.empty() ? XmlToken() : fScanner.next(fRest, fPlace);
    if (token.type != XmlToken::Type::kDeclaration) {
        throw XmlError(Kind::kInvalid, fPlace, "Expected <?xml ... ?> style declaration");
    }
    checkXmlDeclaration(fRest.substr(0, token.size), fPlace);
}

void MessageCheck::run(bool expectDeclaration)
{
    using Type = XmlToken::Type;
    if (expectDeclaration) {
        takeDeclaration();
    }
    while (!fRest.empty()) {
        const XmlToken token = take();
        const std::string_view text = fRest.substr(0, token.size);
        if (token.type == Type::kStartTag || token.type == Type::kEmptyTag) {
            open(token, text.data(), fPlace);
        } else if (token.type == Type::kEndTag) {
            close(text.data() + text.size());
        } else if (token.type == Type::kText || token.type == Type::kCData) {
            expectOnlyBlanks(text, fPlace);
        }
        fPlace = advance(fPlace, text);
        fRest.remove_prefix(token.size);
    }
    if (fRoot.empty()) {
        throw XmlError(Kind::kNotWellFormed, fPlace, "the document ends before its root element does");
    }
}

} // namespace

struct XmlDocument::Tree
{
    pugi::xml_document document;
};

XmlDocument::XmlDocument(const XmlLimits& limits) : fLimits(limits), fTree(std::make_unique<Tree>()) {}
XmlDocument::~XmlDocument() = default;

XmlElement XmlDocument::parseMessage(char* text, std::size_t size)
{
    return parseChecked(text, size, true);
}

XmlElement XmlDocument::parseFragment(char* text, std::size_t size)
{
    return parseChecked(text, size, false);
}

XmlElement XmlDocument::parseChecked(char* text, std::size_t size, bool isMessage)
{
    MessageCheck check(std::string_view(text, size), fLimits);
    check.run(isMessage);
    return parseElement(text + (check.root().data() - text), check.root().size(), check.rootPlace());
}

XmlElement XmlDocument::parseElement(char* text, std::size_t size, XmlPlace start)
{
    fText = text;
    fSize = size;
    fStart = start;
    if (const void* zero = std::memchr(text, 0, size)) {
        throw XmlError(Kind::kNotWellFormed, placeOf(static_cast<const char*>(zero)), "a zero byte");
    }
    return parse(text, size);
}

XmlElement XmlDocument::parse(char* text, std::size_t size)
{
    const pugi::xml_parse_result result =
        fTree->document.load_buffer_inplace(text, size, kParseOptions, pugi::encoding_utf8);
    if (!result) {
        throw XmlError(Kind::kNotWellFormed, placeAtOffset(static_cast<std::size_t>(result.offset)),
                       result.description());
    }
    return XmlElement(fTree->document.first_child().internal_object(), this);
}

XmlPlace XmlDocument::placeOf(const char* position) const
{
    return placeAtOffset(static_cast<std::size_t>(position - fText));
}

// The parser has put zeros over some delimiters by now, such as a line feed directly after a name; all other line feeds
// are still there.
XmlPlace XmlDocument::placeAtOffset(std::size_t offset) const
{
    return advance(fStart, std::string_view(fText, std::min(offset, fSize)));
}

// ---- XmlElement

namespace {

pugi::xml_node nodeOf(pugi::xml_node_struct* node)
{
    return pugi::xml_node(node);
}

} // namespace

std::string_view XmlElement::name() const
{
    return nodeOf(fNode).name();
}

bool XmlElement::is(std::string_view expectedName) const
{
    if (!fNode) {
        return false;
    }
    const char* actual = nodeOf(fNode).name();
    return std::strncmp(actual, expectedName.data(), expectedName.size()) == 0 && actual[expectedName.size()] == '\0';
}

XmlElement XmlElement::firstChild() const
{
    const pugi::xml_node node = nodeOf(fNode);
    const pugi::xml_node child = node.first_child();
    if (node.value()[0] != '\0' || (child && child.type() != pugi::node_element)) {
        fail(Kind::kInvalid, "unexpected text in " + std::string(name()) + " element");
    }
    return XmlElement(child.internal_object(), fDocument);
}

XmlElement XmlElement::nextSibling() const
{
    const pugi::xml_node sibling = nodeOf(fNode).next_sibling();
    if (sibling && sibling.type() != pugi::node_element) {
        fail(Kind::kInvalid, "unexpected text after " + std::string(name()) + " element");
    }
    return XmlElement(sibling.internal_object(), fDocument);
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
    for (std::size_t i = 0; i < count; ++i) {
        values[i] = XmlAttribute();
    }
    std::size_t seen = 0;
    for (pugi::xml_attribute attribute = nodeOf(fNode).first_attribute(); attribute;
         attribute = attribute.next_attribute())
    {
        const std::string_view attributeName = attribute.name();
        const auto index = static_cast<std::size_t>(std::find(names, names + count, attributeName) - names);
        if (++seen > fDocument->limits().maxAttributes) {
            fail(Kind::kTooLarge, "more than " + std::to_string(fDocument->limits().maxAttributes) + " attributes in " +
                                      std::string(name()) + " element");
        }
        if (index == count) {
            continue;
        }
        if (values[index]) {
            fail(Kind::kNotWellFormed, "attribute " + quoted(attributeName) + " twice");
        }
        const std::string_view value = attribute.value();
        values[index] = XmlAttribute(value);
        if (value.find('<') != std::string_view::npos) {
            fail(Kind::kNotWellFormed, "'<' in attribute " + quoted(attributeName));
        }
    }
}

std::string_view XmlElement::text(std::string& scratch) const
{
    const pugi::xml_node node = nodeOf(fNode);
    if (node.first_child()) {
        return mixedText(scratch);
    }
    return resolved(trimBlanks(node.value()), scratch);
}

std::string_view XmlElement::rawText() const
{
    const pugi::xml_node node = nodeOf(fNode);
    return node.first_child() ? std::string_view() : trimBlanks(node.value());
}

// Character data in pieces: text beside CDATA sections or comments. Only the blanks outside CDATA are trimmed.
std::string_view XmlElement::mixedText(std::string& scratch) const
{
    const pugi::xml_node node = nodeOf(fNode);
    std::string all;
    std::string piece;
    all = resolved(node.value(), piece);
    bool endsInCData = false;
    const bool startsInCData =
        all.find_first_not_of(" \t\r\n") == std::string::npos && node.first_child().type() == pugi::node_cdata;
    if (startsInCData) {
        all.clear();
    }
    for (const pugi::xml_node child : node.children()) {
        if (child.type() == pugi::node_element) {
            XmlElement(child.internal_object(), fDocument).failIn(*this);
        }
        endsInCData = child.type() == pugi::node_cdata;
        if (endsInCData) {
            appendNormalized(all, child.value());
        } else {
            all += resolved(child.value(), piece);
        }
    }
    std::string_view view = all;
    const std::size_t first = startsInCData ? 0 : std::min(view.find_first_not_of(" \t\r\n"), view.size());
    view.remove_prefix(first);
    if (!endsInCData) {
        view = view.substr(0, view.find_last_not_of(" \t\r\n") + 1);
    }
    scratch.assign(view);
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

void XmlElement::fail(XmlError::Kind kind, const std::string& cause) const
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
    // The name begins one byte after the '<'.
    const XmlPlace name = fDocument->placeOf(nodeOf(fNode).name());
    return {name.line, name.column - 1};
}

} // namespace Pegasus::wire
