// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/TokenCursor.h"

#include <cstddef>
#include <string>
#include <vector>

namespace Pegasus::mof {

// A constant as written. Its type is known only where it is used.
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

    // Returns: how a diagnostic shows it: 256, "a string", …
    std::string shown() const;
};

// What follows an equal sign, or stands in a qualifier's parentheses or braces.
struct Initializer
{
    bool isArray = false;
    std::vector<Literal> elements; // exactly one unless it is an array
    std::size_t offset = 0;

    bool isNull() const { return !isArray && elements.front().kind == Literal::Kind::kNull; }
};

// OpenPegasus's compiler accepts "{}" in instances only.
enum class EmptyArray
{
    kAccepted,
    kRefused
};

// These functions throw MofError.
Literal parseLiteral(TokenCursor& cursor);
// Parses an array in braces.
Initializer parseArrayInitializer(TokenCursor& cursor, EmptyArray empty = EmptyArray::kRefused);
// Parses either form.
Initializer parseInitializer(TokenCursor& cursor, EmptyArray empty = EmptyArray::kRefused);

} // namespace Pegasus::mof
