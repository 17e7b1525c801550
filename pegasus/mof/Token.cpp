#include "pegasus/mof/Token.h"

#include <algorithm>

namespace Pegasus::mof {

namespace {

constexpr std::size_t kShownBytes = 40;

char lower(char c)
{
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

} // namespace

std::string toLower(std::string_view text)
{
    std::string result(text);
    std::transform(result.begin(), result.end(), result.begin(), lower);
    return result;
}

bool Token::isWord(std::string_view lowerWord) const
{
    return kind == TokenKind::Identifier && text.size() == lowerWord.size() &&
           std::equal(text.begin(), text.end(), lowerWord.begin(), [](char a, char b) { return lower(a) == b; });
}

std::string Token::shown() const
{
    switch (kind) {
    case TokenKind::End:
        return "end of file";
    case TokenKind::Pragma:
        return "'#pragma'";
    case TokenKind::String:
        return "a string";
    case TokenKind::Character:
        return "a character";
    case TokenKind::Alias:
        return "'$" + text.substr(0, kShownBytes) + "'";
    default:
        return "'" + text.substr(0, kShownBytes) + "'";
    }
}

} // namespace Pegasus::mof
