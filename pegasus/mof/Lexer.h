#pragma once

#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/SourceText.h"
#include "pegasus/mof/Token.h"

namespace Pegasus::mof {

// Cuts a source text into tokens. Blanks and comments are dropped; adjacent string literals become one token.
// Requires: the text and the limits outlive the lexer.
class Lexer
{
  public:
    Lexer(const SourceText& source, const CompileLimits& limits);

    // Returns: the next token; kEnd at the end, repeatedly.
    // Throws: MofError at the offending byte.
    Token next();

  private:
    void skipBlanksAndComments();
    void skipBlockComment();
    Token word(TokenKind kind, std::size_t start);
    Token number();
    Token strings();
    Token character();
    void stringLiteral(std::string& value);
    void escape(std::string& value);
    void hexEscape(std::string& value);

    bool atEnd() const noexcept { return fAt >= fText.size(); }
    char peek(std::size_t ahead = 0) const noexcept { return fAt + ahead < fText.size() ? fText[fAt + ahead] : '\0'; }
    [[noreturn]] void fail(std::size_t offset, const std::string& cause) const { fSource.fail(offset, cause); }

    const SourceText& fSource;
    const std::string& fText;
    const CompileLimits& fLimits;
    std::size_t fAt = 0;
};

} // namespace Pegasus::mof
