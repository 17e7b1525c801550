// SPDX-License-Identifier: MIT
#include "pegasus/mof/Literal.h"

namespace Pegasus::mof {

namespace {

Literal keywordLiteral(TokenCursor& cursor)
{
    const std::size_t offset = cursor.current().offset;
    if (cursor.skipWord("null")) {
        return {Literal::Kind::kNull, "", offset};
    }
    if (cursor.skipWord("true")) {
        return {Literal::Kind::kBoolean, "true", offset};
    }
    if (cursor.skipWord("false")) {
        return {Literal::Kind::kBoolean, "false", offset};
    }
    cursor.failExpected("a value");
}

} // namespace

std::string Literal::shown() const
{
    switch (kind) {
    case Kind::kNull:
        return "null";
    case Kind::kString:
        return "a string";
    case Kind::kCharacter:
        return "a character";
    case Kind::kAlias:
        return "$" + text;
    default:
        return text;
    }
}

Literal parseLiteral(TokenCursor& cursor)
{
    const auto literal = [&cursor](Literal::Kind kind) {
        Token token = cursor.take();
        return Literal{kind, std::move(token.text), token.offset};
    };
    switch (cursor.current().kind) {
    case TokenKind::kInteger:
        return literal(Literal::Kind::kInteger);
    case TokenKind::kReal:
        return literal(Literal::Kind::kReal);
    case TokenKind::kString:
        return literal(Literal::Kind::kString);
    case TokenKind::kCharacter:
        return literal(Literal::Kind::kCharacter);
    case TokenKind::kAlias:
        return literal(Literal::Kind::kAlias);
    default:
        return keywordLiteral(cursor);
    }
}

Initializer parseArrayInitializer(TokenCursor& cursor, EmptyArray empty)
{
    Initializer result;
    result.isArray = true;
    result.offset = cursor.current().offset;
    cursor.expectPunctuation('{');
    if (empty == EmptyArray::kAccepted && cursor.skipPunctuation('}')) {
        return result;
    }
    do {
        if (result.elements.size() == cursor.limits().arrayElementCount) {
            cursor.fail("array has more elements than the limit arrayElementCount (" +
                        std::to_string(cursor.limits().arrayElementCount) + ")");
        }
        result.elements.push_back(parseLiteral(cursor));
    } while (cursor.skipPunctuation(','));
    cursor.expectPunctuation('}');
    return result;
}

Initializer parseInitializer(TokenCursor& cursor, EmptyArray empty)
{
    if (cursor.atPunctuation('{')) {
        return parseArrayInitializer(cursor, empty);
    }
    Initializer result;
    result.offset = cursor.current().offset;
    result.elements.push_back(parseLiteral(cursor));
    return result;
}

} // namespace Pegasus::mof
