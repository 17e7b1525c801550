// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlText.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/base/Utf8.h"

#include <algorithm>
#include <cstdint>
#include <optional>

namespace Pegasus::wire {
namespace {

// &#x10FFFF; and a few leading zeros.
constexpr std::size_t kMaxReferenceBytes = 16;

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
const char* entityOf(char c)
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

bool isControl(char c)
{
    return static_cast<unsigned char>(c) < 0x20 || c == 0x7F;
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
    const std::size_t first = text.find_first_not_of(kBlanks);
    if (first == std::string_view::npos) {
        return std::string_view();
    }
    return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

bool isBlank(std::string_view text)
{
    return text.find_first_not_of(kBlanks) == std::string_view::npos;
}

bool isPadding(std::string_view text)
{
    return std::all_of(text.begin(), text.end(),
                       [](char c) { return c == '\0' || kBlanks.find(c) != std::string_view::npos; });
}

bool needsResolving(std::string_view text)
{
    return text.find('&') != std::string_view::npos || text.find('\r') != std::string_view::npos;
}

std::string resolveReferences(std::string_view text, std::string& out)
{
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char c = text[i];
        if (c == '\r') {
            out += '\n';
            i += i + 1 < text.size() && text[i + 1] == '\n' ? 1 : 0;
        } else if (c != '&') {
            out += c;
        } else {
            const std::size_t end = text.find(';', i);
            const std::string_view reference = text.substr(i + 1, end == std::string_view::npos ? end : end - i - 1);
            if (end == std::string_view::npos || reference.size() > kMaxReferenceBytes ||
                !appendReference(reference, out))
            {
                return "a bad reference \"&" + std::string(reference.substr(0, kMaxReferenceBytes)) + "\"";
            }
            i = end;
        }
    }
    return std::string();
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

void appendEscaped(std::string& out, std::string_view text, Blanks blanks)
{
    const bool isRaw = blanks == Blanks::kRaw;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char c = text[i];
        const bool isEdge = i == 0 || i + 1 == text.size();
        if (const char* entity = entityOf(c)) {
            out += entity;
        } else if (isControl(c) || (c == ' ' && !isRaw && (isEdge || text[i - 1] == ' '))) {
            appendCharacterReference(out, c);
        } else {
            out += c;
        }
    }
}

void appendEscaped(std::string& out, const String& text, Blanks blanks)
{
    appendEscaped(out, base::utf8(text), blanks);
}

} // namespace Pegasus::wire
