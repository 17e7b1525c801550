// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlScanner.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace Pegasus::wire {
namespace {

constexpr std::string_view kComment = "<!--";
constexpr std::string_view kCData = "<![CDATA[";
constexpr std::string_view kDeclaration = "<?xml";

bool isBlank(char c)
{
    return c == ' ' || c == '\t' || c == '\n' || c == '\r';
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

std::size_t findQuote(std::string_view bytes, std::size_t from, char quote)
{
    const void* found = std::memchr(bytes.data() + from, quote, bytes.size() - from);
    return found ? static_cast<std::size_t>(static_cast<const char*>(found) - bytes.data()) : bytes.size();
}

constexpr std::array<bool, 256> kIsTagMark = [] {
    std::array<bool, 256> marks{};
    for (const char c : {'>', '"', '\''}) {
        marks[static_cast<unsigned char>(c)] = true;
    }
    return marks;
}();

// Returns: the offset of the next '>', '"' or '\'' from `from`; the size when absent.
std::size_t findTagMark(std::string_view bytes, std::size_t from)
{
    while (from < bytes.size() && !kIsTagMark[static_cast<unsigned char>(bytes[from])]) {
        ++from;
    }
    return from;
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

XmlToken XmlScanner::next(std::string_view bytes, XmlPlace place) const
{
    if (bytes[0] == '<') {
        return markup(bytes, place);
    }
    const std::size_t size = std::min(bytes.find('<'), bytes.size());
    if (size > fLimits.maxTextBytes) {
        throw XmlError(XmlError::Kind::kTooLarge, place,
                       "text of more than " + std::to_string(fLimits.maxTextBytes) + " bytes");
    }
    return {XmlToken::Type::kText, size};
}

XmlToken XmlScanner::markup(std::string_view bytes, XmlPlace place) const
{
    using Type = XmlToken::Type;
    if (bytes.size() < 2) {
        return {};
    }
    if (bytes[1] == '?') {
        if (mayBecome(bytes, kDeclaration) || bytes.size() == kDeclaration.size()) {
            return {};
        }
        const bool isDeclaration = startsWith(bytes, kDeclaration) && isBlank(bytes[kDeclaration.size()]);
        return upTo(isDeclaration ? Type::kDeclaration : Type::kInstruction, bytes, 2, "?>", fLimits.maxTagBytes,
                    place);
    }
    if (bytes[1] != '!') {
        return tag(bytes, place);
    }
    if (startsWith(bytes, kComment)) {
        return upTo(Type::kComment, bytes, kComment.size(), "-->", fLimits.maxTagBytes, place);
    }
    if (startsWith(bytes, kCData)) {
        return upTo(Type::kCData, bytes, kCData.size(), "]]>", fLimits.maxTextBytes, place);
    }
    if (mayBecome(bytes, kComment) || mayBecome(bytes, kCData)) {
        return {};
    }
    throw XmlError(XmlError::Kind::kInvalid, place, "a document type or other declaration is not accepted");
}

XmlToken XmlScanner::tag(std::string_view bytes, XmlPlace place) const
{
    std::size_t at = findTagMark(bytes, 1);
    while (at < bytes.size() && bytes[at] != '>') {
        at = findTagMark(bytes, std::min(findQuote(bytes, at + 1, bytes[at]) + 1, bytes.size()));
    }
    if (at > fLimits.maxTagBytes) {
        throw XmlError(XmlError::Kind::kTooLarge, place,
                       "a tag of more than " + std::to_string(fLimits.maxTagBytes) + " bytes");
    }
    if (at >= bytes.size()) {
        return {};
    }
    if (bytes[1] == '/') {
        return {XmlToken::Type::kEndTag, at + 1};
    }
    return {bytes[at - 1] == '/' ? XmlToken::Type::kEmptyTag : XmlToken::Type::kStartTag, at + 1};
}

XmlToken XmlScanner::upTo(XmlToken::Type type, std::string_view bytes, std::size_t from, std::string_view end,
                          std::size_t limit, XmlPlace place) const
{
    const std::size_t found = bytes.find(end, from);
    const std::size_t size = found == std::string_view::npos ? bytes.size() : found + end.size();
    if (size > limit) {
        throw XmlError(XmlError::Kind::kTooLarge, place, "a section of more than " + std::to_string(limit) + " bytes");
    }
    return found == std::string_view::npos ? XmlToken{} : XmlToken{type, size};
}

std::string_view XmlScanner::tagName(std::string_view tag)
{
    tag.remove_prefix(tag.substr(0, 2) == "</" ? 2 : 1);
    return tag.substr(0, tag.find_first_of(" \t\r\n/>"));
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
