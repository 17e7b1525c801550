// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlError.h"

#include <Pegasus/Common/String.h>

#include <string>
#include <string_view>

namespace Pegasus::wire {

// Character data as it stands in a message, and what it means: reading it, and at the end writing it. Thread: any.

constexpr std::string_view kBlanks = " \t\r\n";

constexpr bool isBlank(char c)
{
    return c == ' ' || c == '\t' || c == '\r' || c == '\n';
}

std::string_view trimBlanks(std::string_view text);
bool isBlank(std::string_view text);
// Whether this may follow a message: blanks, and the zeros of a server that counts the end of its string.
bool isPadding(std::string_view text);

// Returns: whether there is a reference or a carriage return.
bool needsResolving(std::string_view text);

// Appends `text` with the five entities and character references resolved and line ends as line feeds. Control
// characters are let through, raw and as references, because servers send them.
// Returns: empty, or what was wrong (a malformed or unknown reference).
std::string resolveReferences(std::string_view text, std::string& out);

// Appends text of a CDATA section: only the line ends are changed.
void appendNormalized(std::string& out, std::string_view text);

// Returns: whether `text` is a reference to the character 0, as in "&#0;". resolveReferences() refuses it: a text ends
// there for most readers.
bool isZeroReference(std::string_view text);

// `<?xml version="1.x" encoding="utf-8"?>`. US-ASCII and ISO-8859-1 are taken too, as OpenPegasus does: the bytes are
// UTF-8 all the same, because HTTP's charset goes before this one. Throws: XmlError.
void checkXmlDeclaration(std::string_view declaration, XmlPlace place);

// How blanks are written that a parser would cut: at the beginning, at the end and after another blank.
enum class Blanks
{
    kReferences, // as character references: the reader keeps them
    kRaw         // as they are
};

// Returns: whether the text is ASCII that appendEscaped() with kRaw leaves as it is.
bool isPlainText(std::string_view text);

// Appends `text` (UTF-8) as XML text or attribute value: & < > " ' become entities. What a parser would change becomes
// a character reference: control characters and, unless `blanks` says otherwise, blanks.
void appendEscaped(std::string& out, std::string_view text, Blanks blanks = Blanks::kReferences);
void appendEscaped(std::string& out, const String& text, Blanks blanks = Blanks::kReferences);

} // namespace Pegasus::wire
