#include "pegasus/wire/XmlScanner.h"

#include <algorithm>
#include <cstring>

#include <emmintrin.h>

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

// The next '>', '"' or ''' from `from`; the size when there is none.
std::size_t findTagMark(std::string_view bytes, std::size_t from)
{
    const __m128i greater = _mm_set1_epi8('>');
    const __m128i quote = _mm_set1_epi8('"');
    const __m128i apostrophe = _mm_set1_epi8('\'');
    for (; from + sizeof(__m128i) <= bytes.size(); from += sizeof(__m128i)) {
        const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes.data() + from));
        const __m128i hits =
            _mm_or_si128(_mm_cmpeq_epi8(block, greater),
                         _mm_or_si128(_mm_cmpeq_epi8(block, quote), _mm_cmpeq_epi8(block, apostrophe)));
        const int mask = _mm_movemask_epi8(hits);
        if (mask != 0) {
            return from + static_cast<std::size_t>(__builtin_ctz(static_cast<unsigned>(mask)));
        }
    }
    while (from < bytes.size() && bytes[from] != '>' && bytes[from] != '"' && bytes[from] != '\'') {
        ++from;
    }
    return from;
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

namespace {

std::size_t countLineFeeds(std::string_view bytes)
{
    const __m128i lineFeed = _mm_set1_epi8('\n');
    const __m128i zero = _mm_setzero_si128();
    __m128i sums = zero;
    std::size_t at = 0;
    for (; at + sizeof(__m128i) <= bytes.size(); at += sizeof(__m128i)) {
        const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes.data() + at));
        const __m128i ones = _mm_sub_epi8(zero, _mm_cmpeq_epi8(block, lineFeed));
        sums = _mm_add_epi64(sums, _mm_sad_epu8(ones, zero));
    }
    std::size_t count =
        static_cast<std::size_t>(_mm_cvtsi128_si64(sums) + _mm_cvtsi128_si64(_mm_unpackhi_epi64(sums, sums)));
    for (; at < bytes.size(); ++at) {
        count += bytes[at] == '\n' ? 1 : 0;
    }
    return count;
}

} // namespace

XmlPlace advance(XmlPlace place, std::string_view bytes)
{
    const std::size_t lines = countLineFeeds(bytes);
    if (lines == 0) {
        return {place.line, place.column + bytes.size()};
    }
    return {place.line + lines, bytes.size() - bytes.rfind('\n')};
}

} // namespace Pegasus::wire
