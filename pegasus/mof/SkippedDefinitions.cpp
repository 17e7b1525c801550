// SPDX-License-Identifier: MIT
#include "pegasus/mof/SkippedDefinitions.h"

#include <algorithm>
#include <utility>

namespace Pegasus::mof {

namespace {

// Cuts a faulty text into tokens and skips bytes that fit nowhere.
class TolerantLexer
{
  public:
    TolerantLexer(const SourceText& source, const CompileLimits& limits, std::size_t offset)
        : fLexer(source, limits, [](const SourcePlace&, const std::string&) {})
    {
        fLexer.goTo(offset);
    }

    Token next()
    {
        for (;;) {
            const std::size_t start = fLexer.offset();
            try {
                return fLexer.next();
            } catch (const MofError&) {
                fLexer.goTo(std::max(fLexer.offset(), start + 1));
            }
        }
    }

  private:
    Lexer fLexer;
};

// "class" may also be a scope in a qualifier declaration; a comma or parenthesis follows it then.
bool beginsDefinition(const Token& word, const Token& following)
{
    const bool isNamed = following.kind == TokenKind::kIdentifier;
    return (word.isWord("instance") && following.isWord("of")) || (word.isWord("class") && isNamed) ||
           (word.isWord("qualifier") && isNamed);
}

} // namespace

std::size_t countDefinitionsAfter(const SourceText& source, const CompileLimits& limits,
                                  std::optional<std::size_t> faulty)
{
    TolerantLexer lexer(source, limits, faulty.value_or(0));
    Token word = lexer.next();
    const bool startsAsDefinition =
        word.isPunctuation('[') || word.isWord("class") || word.isWord("instance") || word.isWord("qualifier");
    std::size_t count = 0;
    while (word.kind != TokenKind::kEnd) {
        Token following = lexer.next();
        count += beginsDefinition(word, following) ? 1 : 0;
        word = std::move(following);
    }
    const bool hasCountedFaulty = faulty && startsAsDefinition && count != 0;
    return hasCountedFaulty ? count - 1 : count;
}

std::size_t countDefinitionsAfter(const OpenFiles& files, const CompileLimits& limits)
{
    std::size_t count = 0;
    for (const OpenFile& file : files) {
        count += countDefinitionsAfter(*file.source, limits, file.definition);
    }
    return count;
}

} // namespace Pegasus::mof
