// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace Pegasus::mof {

enum class TokenKind
{
    kEnd,
    kIdentifier, // text: the spelling; keywords are identifiers, in any letter case
    kAlias,      // text: the name after the dollar sign
    kInteger,    // text: the spelling, sign included
    kReal,       // text: the spelling, sign included
    kString,     // text: the value in UTF-8, escapes resolved
    kCharacter,  // text: the value in UTF-8, escapes resolved
    kPragma,     // the word #pragma
    kPunctuation // text: one of { } [ ] ( ) , ; : =
};

struct Token
{
    TokenKind kind = TokenKind::kEnd;
    std::string text;
    std::size_t offset = 0; // of the first byte in the source

    bool isPunctuation(char sign) const { return kind == TokenKind::kPunctuation && text[0] == sign; }
    // Returns: true for this word, whatever its case.
    bool isWord(std::string_view word) const;
    // Returns: how a diagnostic shows it: 'word', "end of file", …
    std::string shown() const;
};

} // namespace Pegasus::mof
