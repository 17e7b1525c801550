// SPDX-License-Identifier: MIT
#include "pegasus/mof/TokenCursor.h"

#include <utility>

namespace Pegasus::mof {

TokenCursor::TokenCursor(const SourceText& source, const CompileLimits& limits, const WarningSink& warn)
    : fSource(source), fLimits(limits), fWarn(warn), fLexer(source, limits, warn)
{
}

const Token& TokenCursor::current()
{
    if (!fIsCut) {
        fCurrent = fLexer.next();
    }
    fIsCut = true;
    return fCurrent;
}

Token TokenCursor::take()
{
    current();
    fIsCut = false;
    return std::move(fCurrent);
}

bool TokenCursor::skipPunctuation(char sign)
{
    if (!atPunctuation(sign)) {
        return false;
    }
    take();
    return true;
}

bool TokenCursor::skipWord(std::string_view word)
{
    if (!atWord(word)) {
        return false;
    }
    take();
    return true;
}

void TokenCursor::expectPunctuation(char sign)
{
    if (!skipPunctuation(sign)) {
        failExpected(std::string("'") + sign + "'");
    }
}

Token TokenCursor::expect(TokenKind kind, std::string_view what)
{
    if (current().kind != kind) {
        failExpected(what);
    }
    return take();
}

Token TokenCursor::takePath()
{
    Token path = fLexer.path();
    fIsCut = false;
    return path;
}

void TokenCursor::failExpected(std::string_view what)
{
    fail("expected " + std::string(what) + " instead of " + current().shown());
}

} // namespace Pegasus::mof
