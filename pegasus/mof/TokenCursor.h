// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Lexer.h"

#include <string_view>

namespace Pegasus::mof {

// A parser's view of a text: the current token, and functions that expect or skip it.
// A token is cut when it is looked at. So a definition is delivered before an error right after it is found.
// Requires: the text and the limits outlive the cursor.
class TokenCursor
{
  public:
    TokenCursor(const SourceText& source, const CompileLimits& limits, const WarningSink& warn);

    const Token& current();
    // Returns: the current token, and moves on.
    Token take();

    bool atPunctuation(char sign) { return current().isPunctuation(sign); }
    bool atWord(std::string_view word) { return current().isWord(word); }
    // Moves on if the current token is this one.
    // Returns: whether it was.
    bool skipPunctuation(char sign);
    bool skipWord(std::string_view word);

    // Moves on.
    // Throws: MofError "expected … instead of …" at the current token unless it is of this kind.
    void expectPunctuation(char sign);
    Token expect(TokenKind kind, std::string_view what);
    // Takes a string whose backslashes separate folders. Requires: the current token has not been looked at.
    Token takePath();

    const CompileLimits& limits() const noexcept { return fLimits; }
    SourcePlace place(std::size_t offset) const { return fSource.place(offset); }
    [[noreturn]] void fail(const std::string& cause) { fSource.fail(current().offset, cause); }
    [[noreturn]] void failAt(std::size_t offset, const std::string& cause) const { fSource.fail(offset, cause); }
    [[noreturn]] void failExpected(std::string_view what);
    void warn(std::size_t offset, const std::string& text) const { fWarn(fSource.place(offset), text); }

  private:
    const SourceText& fSource;
    const CompileLimits& fLimits;
    WarningSink fWarn;
    Lexer fLexer;
    Token fCurrent;
    bool fIsCut = false; // fCurrent is the current token
};

} // namespace Pegasus::mof
