// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlScanner.h"

#include "pegasus/base/ByteBlock.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;
using Type = XmlToken::Type;

constexpr std::string_view kComment = "<!--";
constexpr std::string_view kCData = "<![CDATA[";
constexpr std::string_view kDeclaration = "<?xml";

// What a byte can be in a tag.
constexpr unsigned char kNameStart = 1;
constexpr unsigned char kNamePart = 2;
constexpr unsigned char kBlank = 4;

constexpr std::array<unsigned char, 256> kClasses = [] {
    std::array<unsigned char, 256> classes{};
    for (std::size_t c = 0; c < classes.size(); ++c) {
        const bool isLetter = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
        if (isLetter || c == '_' || c == ':' || c >= 0x80) {
            classes[c] = kNameStart | kNamePart;
        } else if ((c >= '0' && c <= '9') || c == '.' || c == '-') {
            classes[c] = kNamePart;
        } else if (c == ' ' || c == '\t' || c == '\n' || c == '\r') {
            classes[c] = kBlank;
        }
    }
    return classes;
}();

bool isOf(unsigned char classes, char c)
{
    return (kClasses[static_cast<unsigned char>(c)] & classes) != 0;
}

// Returns: the offset of the first byte from `at` that is of another class; the size when all are.
std::size_t skip(unsigned char classes, std::string_view text, std::size_t at)
{
    const char* const bytes = text.data(); // whose index the library would check for each byte
    while (at < text.size() && isOf(classes, bytes[at])) {
        ++at;
    }
    return at;
}

XmlSpan spanOf(std::size_t begin, std::size_t end)
{
    return {static_cast<std::uint32_t>(begin), static_cast<std::uint32_t>(end - begin)};
}

// Could `bytes` go on as `marker`?
bool mayBecome(std::string_view bytes, std::string_view marker)
{
    return bytes.size() < marker.size() && marker.substr(0, bytes.size()) == bytes;
}

bool startsWith(std::string_view bytes, std::string_view marker)
{
    return bytes.substr(0, marker.size()) == marker;
}

std::size_t findByte(std::string_view text, std::size_t from, char byte)
{
    const void* found = std::memchr(text.data() + from, byte, text.size() - from);
    return found ? static_cast<std::size_t>(static_cast<const char*>(found) - text.data()) : text.size();
}

// Reads one attribute at `at`, which moves after it.
// Returns: false when the text ends before the attribute does.
bool readAttribute(const XmlSource& source, std::size_t& at, XmlAttributeSpan& attribute)
{
    const std::string_view text = source.text;
    const std::size_t nameEnd = skip(kNamePart, text, at);
    const std::size_t equals = skip(kBlank, text, nameEnd);
    if (equals == text.size()) {
        return false;
    }
    const std::size_t open = text[equals] == '=' ? skip(kBlank, text, equals + 1) : text.size() + 1;
    if (open == text.size()) {
        return false;
    }
    if (open > text.size() || (text[open] != '"' && text[open] != '\'')) {
        source.fail(Kind::kNotWellFormed, at, "Error parsing element attribute");
    }
    const std::size_t close = base::findEither(text, open + 1, text[open], '<');
    if (close == text.size()) {
        return false;
    }
    attribute = {spanOf(at, nameEnd), spanOf(open + 1, close)};
    if (text[close] == '<') {
        source.fail(Kind::kNotWellFormed, at, "'<' in attribute \"" + std::string(attribute.name.in(text)) + "\"");
    }
    at = close + 1;
    return true;
}

// In blocks of a fixed size, which the compiler counts many bytes at a time.
std::size_t countLineFeeds(std::string_view bytes)
{
    constexpr std::size_t kBlock = 64; // at most 255, for the count of one block
    std::size_t count = 0;
    for (; bytes.size() >= kBlock; bytes.remove_prefix(kBlock)) {
        unsigned char inBlock = 0;
        for (std::size_t i = 0; i < kBlock; ++i) {
            inBlock = static_cast<unsigned char>(inBlock + (bytes[i] == '\n' ? 1 : 0));
        }
        count += inBlock;
    }
    return count + static_cast<std::size_t>(std::count(bytes.begin(), bytes.end(), '\n'));
}

} // namespace

XmlPlace XmlSource::placeAt(std::size_t offset) const
{
    return advance(start, text.substr(0, offset));
}

void XmlSource::fail(Kind kind, std::size_t offset, const std::string& cause) const
{
    throw XmlError(kind, placeAt(offset), cause);
}

void XmlSource::expectNoZero(std::size_t end) const
{
    if (const std::size_t at = findByte(text.substr(0, end), 0, '\0'); at < end) {
        fail(Kind::kNotWellFormed, at, "a zero byte");
    }
}

XmlToken XmlScanner::next(const XmlSource& source, std::size_t from, std::vector<XmlAttributeSpan>& attributes) const
{
    if (source.text[from] == '<') {
        return markup(source, from, attributes);
    }
    const std::size_t size = findByte(source.text, from, '<') - from;
    if (size > fLimits.maxTextBytes) {
        source.fail(Kind::kTooLarge, from, "text of more than " + std::to_string(fLimits.maxTextBytes) + " bytes");
    }
    return {Type::kText, size};
}

XmlToken XmlScanner::markup(const XmlSource& source, std::size_t from, std::vector<XmlAttributeSpan>& attributes) const
{
    const std::string_view bytes = source.text.substr(from);
    if (bytes.size() < 2) {
        return {};
    }
    if (bytes[1] == '/') {
        return endTag(source, from);
    }
    if (bytes[1] == '?') {
        if (mayBecome(bytes, kDeclaration) || bytes.size() == kDeclaration.size()) {
            return {};
        }
        const bool isDeclaration = startsWith(bytes, kDeclaration) && isOf(kBlank, bytes[kDeclaration.size()]);
        return upTo(isDeclaration ? Type::kDeclaration : Type::kInstruction, source, from, 2, "?>",
                    fLimits.maxTagBytes);
    }
    if (bytes[1] != '!') {
        return startTag(source, from, attributes);
    }
    if (startsWith(bytes, kComment)) {
        return upTo(Type::kComment, source, from, kComment.size(), "-->", fLimits.maxTagBytes);
    }
    if (startsWith(bytes, kCData)) {
        return upTo(Type::kCData, source, from, kCData.size(), "]]>", fLimits.maxTextBytes);
    }
    if (mayBecome(bytes, kComment) || mayBecome(bytes, kCData)) {
        return {};
    }
    source.fail(Kind::kInvalid, from, "a document type or other declaration is not accepted");
}

XmlToken XmlScanner::startTag(const XmlSource& source, std::size_t from,
                              std::vector<XmlAttributeSpan>& attributes) const
{
    const std::string_view text = source.text;
    const std::size_t firstAttribute = attributes.size();
    if (!isOf(kNameStart, text[from + 1])) {
        source.fail(Kind::kNotWellFormed, from, "Error parsing start element tag");
    }
    std::size_t at = skip(kNamePart, text, from + 1);
    const XmlSpan name = spanOf(from + 1, at);
    for (;;) {
        const std::size_t end = at;
        at = skip(kBlank, text, at);
        const bool isEmptyTag = at + 1 < text.size() && text[at] == '/' && text[at + 1] == '>';
        if (isEmptyTag || (at < text.size() && text[at] == '>')) {
            const Type type = isEmptyTag ? Type::kEmptyTag : Type::kStartTag;
            return checkedTag({type, at + (isEmptyTag ? 2 : 1) - from, name}, source, from);
        }
        const bool isCut = at == text.size() || (text[at] == '/' && at + 1 == text.size());
        if (!isCut && (at == end || !isOf(kNameStart, text[at]))) {
            source.fail(Kind::kNotWellFormed, at, "Error parsing start element tag");
        }
        XmlAttributeSpan attribute;
        if (isCut || !readAttribute(source, at, attribute)) {
            attributes.resize(firstAttribute); // the tag is read again when more of it is there
            return checkedTag({Type::kIncomplete, text.size() - from}, source, from);
        }
        if (attributes.size() - firstAttribute == fLimits.maxAttributes) {
            source.fail(Kind::kTooLarge, from,
                        "more than " + std::to_string(fLimits.maxAttributes) + " attributes in " +
                            std::string(name.in(text)) + " element");
        }
        attributes.push_back(attribute);
    }
}

// Whether the name is well formed shows when it is compared with the start tag's.
XmlToken XmlScanner::endTag(const XmlSource& source, std::size_t from) const
{
    const std::string_view text = source.text;
    const std::size_t end = findByte(text, from, '>');
    if (end == text.size()) {
        return checkedTag({Type::kIncomplete, end - from}, source, from);
    }
    std::size_t nameEnd = end;
    while (isOf(kBlank, text[nameEnd - 1])) { // ends at the slash
        --nameEnd;
    }
    return checkedTag({Type::kEndTag, end + 1 - from, spanOf(from + 2, nameEnd)}, source, from);
}

XmlToken XmlScanner::checkedTag(const XmlToken& token, const XmlSource& source, std::size_t from) const
{
    if (token.size > fLimits.maxTagBytes) {
        source.fail(Kind::kTooLarge, from, "a tag of more than " + std::to_string(fLimits.maxTagBytes) + " bytes");
    }
    return token;
}

XmlToken XmlScanner::upTo(Type type, const XmlSource& source, std::size_t from, std::size_t contentAt,
                          std::string_view end, std::size_t limit) const
{
    const std::string_view bytes = source.text.substr(from);
    const std::size_t found = bytes.find(end, contentAt);
    const std::size_t size = found == std::string_view::npos ? bytes.size() : found + end.size();
    if (size > limit) {
        source.fail(Kind::kTooLarge, from, "a section of more than " + std::to_string(limit) + " bytes");
    }
    return found == std::string_view::npos ? XmlToken{} : XmlToken{type, size};
}

XmlPlace advance(XmlPlace place, std::string_view bytes)
{
    const std::size_t lines = countLineFeeds(bytes);
    if (lines == 0) {
        return {place.line, place.column + bytes.size()};
    }
    return {place.line + lines, bytes.size() - bytes.rfind('\n')};
}

} // namespace Pegasus::wire
