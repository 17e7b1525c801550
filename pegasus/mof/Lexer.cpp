// SPDX-License-Identifier: MIT
#include "pegasus/mof/Lexer.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/ByteBlock.h"
#include "pegasus/base/NumberText.h"

#include <cstdio>
#include <cstring>

namespace Pegasus::mof {

namespace {

bool startsName(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}

bool continuesName(char c)
{
    return startsName(c) || base::isAsciiDigit(c);
}

bool isBlank(char c)
{
    return c == ' ' || c == '\t' || c == '\n' || c == '\r' || c == '\f' || c == '\v';
}

bool isPunctuation(char c)
{
    return c != '\0' && std::strchr("{}[](),;:=", c) != nullptr;
}

std::string shownByte(char c)
{
    char text[16];
    if (c > ' ' && c < 0x7F) {
        std::snprintf(text, sizeof text, "'%c'", c);
    } else {
        std::snprintf(text, sizeof text, "byte 0x%02X", static_cast<unsigned char>(c));
    }
    return text;
}

// Appends a UTF-16 code unit as UTF-8. Each half of a surrogate pair becomes three bytes; String joins the halves
// again.
void appendCodeUnit(std::string& value, unsigned unit)
{
    if (unit < 0x80u) {
        value += static_cast<char>(unit);
        return;
    }
    if (unit < 0x800u) {
        value += static_cast<char>(0xC0u | (unit >> 6));
    } else {
        value += static_cast<char>(0xE0u | (unit >> 12));
        value += static_cast<char>(0x80u | ((unit >> 6) & 0x3Fu));
    }
    value += static_cast<char>(0x80u | (unit & 0x3Fu));
}

// Returns: what a one-letter escape stands for; NUL for another letter.
char simpleEscape(char letter)
{
    switch (letter) {
    case 'b':
        return '\b';
    case 't':
        return '\t';
    case 'n':
        return '\n';
    case 'f':
        return '\f';
    case 'r':
        return '\r';
    case '"':
    case '\'':
    case '\\':
        return letter;
    default:
        return '\0';
    }
}

} // namespace

Lexer::Lexer(const SourceText& source, const CompileLimits& limits, WarningSink warn)
    : fSource(source), fText(source.text()), fLimits(limits), fWarn(std::move(warn))
{
    if (source.hasByteOrderMark()) {
        fAt = 3;
    }
}

Token Lexer::next()
{
    skipBlanksAndComments();
    if (atEnd()) {
        return Token{TokenKind::kEnd, "", fAt};
    }
    const char c = peek();
    if (startsName(c)) {
        return word(TokenKind::kIdentifier, fAt);
    }
    if (base::isAsciiDigit(c) || c == '+' || c == '-' || c == '.') {
        return number();
    }
    if (c == '"') {
        return strings();
    }
    if (c == '\'') {
        return character();
    }
    if (c == '$' && startsName(peek(1))) {
        return word(TokenKind::kAlias, ++fAt - 1);
    }
    if (isPunctuation(c)) {
        return Token{TokenKind::kPunctuation, std::string(1, c), fAt++};
    }
    if (c == '#') {
        Token directive = word(TokenKind::kPragma, ++fAt - 1);
        if (base::equalNoCase(directive.text, "pragma")) {
            return directive;
        }
        fail(directive.offset, "unknown directive '#" + directive.text + "'");
    }
    fail(fAt, "unexpected " + shownByte(c));
}

Token Lexer::path()
{
    skipBlanksAndComments();
    Token token{TokenKind::kString, "", fAt};
    if (peek() != '"') {
        fail(fAt, "expected a path in quotes");
    }
    const std::size_t end = std::min(fText.find_first_of("\"\n", fAt + 1), fText.size());
    if (end == fText.size() || fText[end] == '\n') {
        fail(fAt, "string is not closed on its line");
    }
    if (end - fAt > fLimits.tokenBytes) {
        fail(fAt, "path is longer than the limit tokenBytes (" + std::to_string(fLimits.tokenBytes) + ")");
    }
    while (++fAt < end) {
        if (fText[fAt] != '\\') {
            token.text += fText[fAt];
        } else if (token.text.empty() || token.text.back() != '/') {
            token.text += '/';
        }
    }
    ++fAt;
    return token;
}

void Lexer::skipBlanksAndComments()
{
    for (;;) {
        while (!atEnd() && isBlank(peek())) {
            ++fAt;
        }
        if (peek() == '/' && peek(1) == '/') {
            fAt = std::min(fText.find('\n', fAt), fText.size());
        } else if (peek() == '/' && peek(1) == '*') {
            skipBlockComment();
        } else {
            return;
        }
    }
}

void Lexer::skipBlockComment()
{
    const std::size_t end = fText.find("*/", fAt + 2);
    if (end == std::string::npos) {
        fWarn(fSource.place(fAt), "comment is not closed: it takes the rest of the file");
    }
    fAt = end == std::string::npos ? fText.size() : end + 2;
}

Token Lexer::word(TokenKind kind, std::size_t start)
{
    const std::size_t first = fAt;
    while (continuesName(peek())) {
        ++fAt;
    }
    if (fAt - first > fLimits.tokenBytes) {
        fail(start, "name is longer than the limit tokenBytes (" + std::to_string(fLimits.tokenBytes) + ")");
    }
    return Token{kind, fText.substr(first, fAt - first), start};
}

// Takes every character that can belong to a number. Its value is made, and its spelling checked, where the type is
// known.
Token Lexer::number()
{
    const std::size_t start = fAt;
    bool isReal = false;
    if (peek() == '+' || peek() == '-') {
        ++fAt;
    }
    const bool isHex = peek() == '0' && (peek(1) == 'x' || peek(1) == 'X');
    while (continuesName(peek()) || peek() == '.') {
        const bool isExponent = !isHex && isReal && (peek() == 'e' || peek() == 'E');
        isReal = isReal || peek() == '.';
        ++fAt;
        if (isExponent && (peek() == '+' || peek() == '-')) {
            ++fAt;
        }
    }
    if (fAt - start > fLimits.tokenBytes) {
        fail(start, "number is longer than the limit tokenBytes (" + std::to_string(fLimits.tokenBytes) + ")");
    }
    return Token{isReal ? TokenKind::kReal : TokenKind::kInteger, fText.substr(start, fAt - start), start};
}

Token Lexer::strings()
{
    const std::size_t start = fAt;
    fJoined.clear();
    do {
        stringLiteral(fJoined);
        if (fJoined.size() > fLimits.stringBytes) {
            fail(start, "string is longer than the limit stringBytes (" + std::to_string(fLimits.stringBytes) + ")");
        }
        skipBlanksAndComments();
    } while (peek() == '"');
    return Token{TokenKind::kString, fJoined, start};
}

void Lexer::stringLiteral(std::string& value)
{
    const std::size_t start = fAt++;
    for (;;) {
        const std::size_t plainEnd = base::findMarked(
            fText, fAt, [](const base::ByteBlock& c) { return (c == '"') | (c == '\\') | (c == '\n'); });
        value.append(fText, fAt, plainEnd - fAt);
        fAt = plainEnd;
        if (atEnd() || peek() == '\n') {
            fail(start, "string is not closed on its line");
        }
        if (peek() == '"') {
            break;
        }
        if (!escape(value)) {
            keepBackslash(value);
        }
    }
    ++fAt;
}

// Takes an escape and appends its meaning.
// Returns: false for an unknown escape, which is left in the text.
bool Lexer::escape(std::string& value)
{
    const char letter = peek(1);
    if (letter == 'x' || letter == 'X') {
        return hexEscape(value);
    }
    const char meaning = simpleEscape(letter);
    if (meaning == '\0') {
        return false;
    }
    value += meaning;
    fAt += 2;
    return true;
}

bool Lexer::hexEscape(std::string& value)
{
    constexpr std::size_t kMaxDigits = 4;
    const std::size_t digits = fAt + 2;
    std::size_t end = digits;
    unsigned unit = 0;
    for (; end < digits + kMaxDigits && end < fText.size() && base::hexDigitValue(fText[end]) >= 0; ++end) {
        unit = unit * 16 + static_cast<unsigned>(base::hexDigitValue(fText[end]));
    }
    if (end == digits) {
        return false;
    }
    if (unit == 0) {
        fail(fAt, "\\x0 is not a character");
    }
    appendCodeUnit(value, unit);
    fAt = end;
    return true;
}

// OpenPegasus's compiler keeps the backslash of an unknown escape. Files with paths of another system rely on it.
void Lexer::keepBackslash(std::string& value)
{
    const bool isShown = peek(1) > ' ' && peek(1) < 0x7F;
    fWarn(fSource.place(fAt), "unknown escape sequence \\" + std::string(isShown ? 1 : 0, peek(1)) +
                                  ": the backslash is part of the string");
    value += fText[fAt++];
}

Token Lexer::character()
{
    Token token{TokenKind::kCharacter, "", fAt++};
    while (!atEnd() && peek() != '\'' && peek() != '\n') {
        if (peek() != '\\') {
            token.text += fText[fAt++];
        } else if (!escape(token.text)) {
            fail(fAt, "unknown escape sequence in a character literal");
        }
        if (token.text.size() > 4) {
            break;
        }
    }
    if (peek() != '\'') {
        fail(token.offset, "character literal is not closed after one character");
    }
    ++fAt;
    if (token.text.empty()) {
        fail(token.offset, "character literal is empty");
    }
    return token;
}

} // namespace Pegasus::mof
