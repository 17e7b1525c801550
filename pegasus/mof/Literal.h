#pragma once

#include "pegasus/mof/TokenCursor.h"

#include <cstddef>
#include <string>
#include <vector>

namespace Pegasus::mof {

// A constant as written, before it is known which type it must have.
struct Literal
{
    enum class Kind
    {
        kNull,
        kBoolean, // text: "true" or "false"
        kInteger,
        kReal,
        kString,
        kCharacter,
        kAlias
    };

    Kind kind = Kind::kNull;
    std::string text;
    std::size_t offset = 0;

    // How a diagnostic shows it: 256, "a string", …
    std::string shown() const;
};

// What stands behind an equal sign, or in a qualifier's parentheses or braces.
struct Initializer
{
    bool isArray = false;
    std::vector<Literal> elements; // exactly one if it is no array
    std::size_t offset = 0;

    bool isNull() const { return !isArray && elements.front().kind == Literal::Kind::kNull; }
};

// Throw MofError.
Literal parseLiteral(TokenCursor& cursor);
// The braces of an array are expected at the cursor.
Initializer parseArrayInitializer(TokenCursor& cursor);
// Either form.
Initializer parseInitializer(TokenCursor& cursor);

} // namespace Pegasus::mof
