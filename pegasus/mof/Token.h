#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace Pegasus::mof {

enum class TokenKind
{
    End,
    Identifier, // text: the spelling; keywords are identifiers, in any letter case
    Alias,      // text: the name after the dollar sign
    Integer,    // text: the spelling, sign included
    Real,       // text: the spelling, sign included
    String,     // text: the value in UTF-8, escapes resolved
    Character,  // text: the value in UTF-8, escapes resolved
    Pragma,     // the word #pragma
    Punctuation // text: one of { } [ ] ( ) , ; : =
};

struct Token
{
    TokenKind kind = TokenKind::End;
    std::string text;
    std::size_t offset = 0; // of the first byte in the source

    bool isPunctuation(char sign) const { return kind == TokenKind::Punctuation && text[0] == sign; }
    // Is it this word, given in lower case, whatever its letter case?
    bool isWord(std::string_view lowerWord) const;
    // How a diagnostic shows it: 'word', "end of file", …
    std::string shown() const;
};

// ASCII letters only, as CIM names compare.
std::string toLower(std::string_view text);

} // namespace Pegasus::mof
