// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlText.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/ByteBlock.h"
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/base/Utf8.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <optional>

namespace Pegasus::wire {
namespace {

// &#x10FFFF; and a few leading zeros.
constexpr std::size_t kMaxReferenceBytes = 16;

constexpr std::string_view kUsualDeclaration = "<?xml version=\"1.0\" encoding=\"utf-8\" ?>";
constexpr std::string_view kEncodings[] = {"utf-8", "us-ascii", "iso-8859-1"};

struct Entity
{
    std::string_view name;
    char character;
};
constexpr Entity kEntities[] = {{"lt", '<'}, {"gt", '>'}, {"amp", '&'}, {"quot", '"'}, {"apos", '\''}};

// `digits` of "#65" or "#x41".
bool appendCharacter(std::string_view digits, std::string& out)
{
    const bool hex = !digits.empty() && digits.front() == 'x';
    if (hex) {
        digits.remove_prefix(1);
    }
    if (digits.empty()) {
        return false;
    }
    std::uint32_t code = 0;
    for (const char c : digits) {
        const int value = base::hexDigitValue(c);
        if (value < 0 || (!hex && value > 9)) {
            return false;
        }
        code = code * (hex ? 16 : 10) + static_cast<std::uint32_t>(value);
        if (code > 0x10FFFF) {
            return false;
        }
    }
    if (code == 0) {
        return false;
    }
    base::appendUtf8(out, code);
    return true;
}

bool appendReference(std::string_view reference, std::string& out)
{
    if (!reference.empty() && reference.front() == '#') {
        return appendCharacter(reference.substr(1), out);
    }
    const auto* found = std::find_if(std::begin(kEntities), std::end(kEntities),
                                     [&](const Entity& entity) { return entity.name == reference; });
    if (found == std::end(kEntities)) {
        return false;
    }
    out += found->character;
    return true;
}

// Returns: the value of `name` in a declaration; nullopt when absent.
std::optional<std::string_view> pseudoAttribute(std::string_view declaration, std::string_view name)
{
    std::size_t at = declaration.find(name);
    if (at == std::string_view::npos) {
        return std::nullopt;
    }
    at = declaration.find_first_of("\"'", at + name.size());
    if (at == std::string_view::npos) {
        return std::nullopt;
    }
    const std::size_t end = declaration.find(declaration[at], at + 1);
    if (end == std::string_view::npos) {
        return std::nullopt;
    }
    return declaration.substr(at + 1, end - at - 1);
}

// What a character becomes in XML text; null when it stays as it is.
constexpr const char* entityOf(char c)
{
    switch (c) {
    case '&':
        return "&amp;";
    case '<':
        return "&lt;";
    case '>':
        return "&gt;";
    case '"':
        return "&quot;";
    case '\'':
        return "&apos;";
    default:
        return nullptr;
    }
}

constexpr bool isControl(char c)
{
    return static_cast<unsigned char>(c) < 0x20 || c == 0x7F;
}

// Whether the character stays as it is wherever it stands. A blank does so in most places.
constexpr bool isPlain(char c)
{
    return entityOf(c) == nullptr && !isControl(c) && c != ' ';
}

using Block = base::ByteBlock;

// Marks the characters that are written in another form wherever they stand.
auto changesIn(const Block& c)
{
    return (c < 0x20) | (c == 0x7F) | (c == '"') | (c == '&') | (c == '\'') | (c == '<') | (c == '>');
}

// Returns: a bit for each character of a block that changes, blanks after a blank included. `before` is the block that
// begins one character earlier.
unsigned changedBits(const char* before)
{
    const Block c = base::loadBlock(before + 1);
    return base::markedBits(changesIn(c) | ((c == ' ') & (base::loadBlock(before) == ' ')));
}

// As findMarked(), for characters whose meaning depends on the one before.
// Requires: at > 0.
std::size_t findChanged(std::string_view text, std::size_t at)
{
    constexpr std::size_t kSize = sizeof(Block);
    const auto place = [&text](std::size_t start, unsigned bits) {
        return bits != 0 ? start + static_cast<std::size_t>(__builtin_ctz(bits)) : text.size();
    };
    for (; text.size() - at >= kSize; at += kSize) {
        const unsigned bits = changedBits(text.data() + at - 1);
        if (bits != 0) {
            return place(at, bits);
        }
    }
    const std::size_t rest = text.size() - at;
    if (text.size() > kSize) { // the last characters as a block that overlaps the one before
        return place(at, changedBits(text.data() + text.size() - kSize - 1) >> (kSize - rest));
    }
    char few[kSize + 1] = {};
    std::memcpy(few, text.data() + at - 1, rest + 1);
    return place(at, changedBits(few) & ((1U << rest) - 1));
}

// Returns: the next character from `at` on that changes; the text's size when the rest stays as it is.
std::size_t findEscaped(std::string_view text, std::size_t at, Blanks blanks)
{
    if (blanks == Blanks::kRaw) {
        return base::findMarked(text, at, changesIn);
    }
    if (at == text.size() || (at == 0 && !isPlain(text.front()))) {
        return at;
    }
    const std::size_t found = findChanged(text, std::max<std::size_t>(at, 1));
    return found == text.size() && text.back() == ' ' ? text.size() - 1 : found;
}

void appendCharacterReference(std::string& out, char c)
{
    out += "&#";
    out += std::to_string(static_cast<unsigned char>(c));
    out += ';';
}

} // namespace

std::string_view trimBlanks(std::string_view text)
{
    const char* first = text.data();
    const char* last = first + text.size();
    while (first < last && isBlank(*first)) {
        ++first;
    }
    while (first < last && isBlank(last[-1])) {
        --last;
    }
    return {first, static_cast<std::size_t>(last - first)};
}

bool isBlank(std::string_view text)
{
    return std::all_of(text.begin(), text.end(), [](char c) { return isBlank(c); });
}

bool isPadding(std::string_view text)
{
    return std::all_of(text.begin(), text.end(), [](char c) { return c == '\0' || isBlank(c); });
}

bool needsResolving(std::string_view text)
{
    return base::findEither(text, 0, '&', '\r') < text.size();
}

std::string resolveReferences(std::string_view text, std::string& out)
{
    for (std::size_t at = 0;;) {
        const std::size_t next = base::findEither(text, at, '&', '\r');
        out.append(text.substr(at, next - at));
        if (next == text.size()) {
            return std::string();
        }
        if (text[next] == '\r') {
            out += '\n';
            at = next + (text.substr(next, 2) == "\r\n" ? 2 : 1);
            continue;
        }
        const std::size_t end = text.find(';', next);
        const std::string_view reference = text.substr(next + 1, end == std::string_view::npos ? end : end - next - 1);
        if (end == std::string_view::npos || reference.size() > kMaxReferenceBytes || !appendReference(reference, out))
        {
            return "a bad reference \"&" + std::string(reference.substr(0, kMaxReferenceBytes)) + "\"";
        }
        at = end + 1;
    }
}

bool isZeroReference(std::string_view text)
{
    const std::string_view zeros =
        text.substr(0, 3) == "&#x" ? text.substr(3) : text.substr(std::min<std::size_t>(2, text.size()));
    return text.substr(0, 2) == "&#" && zeros.size() > 1 && zeros.find_first_not_of('0') == zeros.size() - 1 &&
           zeros.back() == ';';
}

void appendNormalized(std::string& out, std::string_view text)
{
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '\r') {
            out += text[i];
        } else if (i + 1 == text.size() || text[i + 1] != '\n') {
            out += '\n';
        }
    }
}

void checkXmlDeclaration(std::string_view declaration, XmlPlace place)
{
    if (declaration == kUsualDeclaration) {
        return;
    }
    const std::string_view version = pseudoAttribute(declaration, "version").value_or("");
    if (version.substr(0, 2) != "1." || version.size() < 3) {
        throw XmlError(XmlError::Kind::kInvalid, place, "Expected <?xml ... ?> style declaration with version 1.x");
    }
    const auto encoding = pseudoAttribute(declaration, "encoding");
    const auto isTaken = [&](std::string_view name) { return base::equalNoCase(*encoding, name); };
    if (encoding && std::none_of(std::begin(kEncodings), std::end(kEncodings), isTaken)) {
        throw XmlError(XmlError::Kind::kInvalid, place, "unsupported encoding \"" + std::string(*encoding) + "\"");
    }
}

bool isPlainText(std::string_view text)
{
    return base::findMarked(text, 0, [](const Block& c) { return changesIn(c) | (c >= 0x80); }) == text.size();
}

void appendEscaped(std::string& out, std::string_view text, Blanks blanks)
{
    std::size_t done = 0;
    for (std::size_t at = 0; (at = findEscaped(text, at, blanks)) < text.size(); done = ++at) {
        out.append(text, done, at - done);
        if (const char* entity = entityOf(text[at])) {
            out += entity;
        } else {
            appendCharacterReference(out, text[at]);
        }
    }
    out.append(text, done);
}

// Most texts need no escape: they are written in place.
void appendEscaped(std::string& out, const String& text, Blanks blanks)
{
    const std::size_t start = out.size();
    base::appendUtf8(out, text);
    const std::string_view written = std::string_view(out).substr(start);
    if (findEscaped(written, 0, blanks) < written.size()) {
        const std::string raw(written);
        out.resize(start);
        appendEscaped(out, std::string_view(raw), blanks);
    }
}

} // namespace Pegasus::wire
