// SPDX-License-Identifier: MIT
#include "pegasus/mof/Token.h"

#include "pegasus/base/AsciiCase.h"

namespace Pegasus::mof {

namespace {

constexpr std::size_t kShownBytes = 40;

} // namespace

bool Token::isWord(std::string_view word) const
{
    return kind == TokenKind::kIdentifier && base::equalNoCase(text, word);
}

std::string Token::shown() const
{
    switch (kind) {
    case TokenKind::kEnd:
        return "end of file";
    case TokenKind::kPragma:
        return "'#pragma'";
    case TokenKind::kString:
        return "a string";
    case TokenKind::kCharacter:
        return "a character";
    case TokenKind::kAlias:
        return "'$" + text.substr(0, kShownBytes) + "'";
    default:
        return "'" + text.substr(0, kShownBytes) + "'";
    }
}

} // namespace Pegasus::mof
