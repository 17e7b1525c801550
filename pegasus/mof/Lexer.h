// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/SourceText.h"
#include "pegasus/mof/Token.h"

#include <functional>
#include <string>

namespace Pegasus::mof {

// Reports a warning: the compilation goes on.
using WarningSink = std::function<void(const SourcePlace& place, const std::string& text)>;

// Cuts a source text into tokens. Blanks and comments are dropped; adjacent string literals become one token.
// Requires: the text and the limits outlive the lexer.
class Lexer
{
  public:
    Lexer(const SourceText& source, const CompileLimits& limits, WarningSink warn);

    // Returns: the next token; kEnd at the end, repeatedly.
    // Throws: MofError at the offending byte.
    Token next();
    // Cuts a string literal, without escapes: each run of backslashes becomes a slash, as vendors of another system
    // write paths.
    // Throws: MofError.
    Token path();

    // Where next() starts; after an error, where it stopped.
    std::size_t offset() const noexcept { return fAt; }
    void goTo(std::size_t offset) noexcept { fAt = offset; }

  private:
    void skipBlanksAndComments();
    void skipBlockComment();
    Token word(TokenKind kind, std::size_t start);
    Token number();
    Token strings();
    Token character();
    void stringLiteral(std::string& value);
    bool escape(std::string& value);
    bool hexEscape(std::string& value);
    void keepBackslash(std::string& value);

    bool atEnd() const noexcept { return fAt >= fText.size(); }
    char peek(std::size_t ahead = 0) const noexcept { return fAt + ahead < fText.size() ? fText[fAt + ahead] : '\0'; }
    [[noreturn]] void fail(std::size_t offset, const std::string& cause) const { fSource.fail(offset, cause); }

    const SourceText& fSource;
    const std::string& fText;
    const CompileLimits& fLimits;
    WarningSink fWarn;
    std::size_t fAt = 0;
    std::string fJoined; // of strings(), for its memory
};

} // namespace Pegasus::mof
