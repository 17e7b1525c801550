#pragma once

#include "pegasus/wire/XmlError.h"

#include <Pegasus/Common/String.h>

#include <string>
#include <string_view>

namespace Pegasus::wire {

// Character data as it stands in a message, and what it means: reading it, and at the end writing it. Thread: any.

std::string_view trimBlanks(std::string_view text);

// Returns: whether there is a reference, a carriage return or a character that XML forbids.
bool needsResolving(std::string_view text);

// Appends `text` with the five entities and character references resolved and line ends as line feeds. References to
// control characters are let through, because servers send them.
// Returns: empty, or what was wrong (a malformed or unknown reference, a control character).
std::string resolveReferences(std::string_view text, std::string& out);

// Appends text of a CDATA section: only the line ends are changed.
void appendNormalized(std::string& out, std::string_view text);

// `<?xml version="1.x" encoding="utf-8"?>`; the default encoding is UTF-8. Throws: XmlError.
void checkXmlDeclaration(std::string_view declaration, XmlPlace place);

// Appends `text` (UTF-8) as XML text or attribute value: & < > " ' become entities. What a parser would change becomes
// a character reference: control characters, and a blank at the beginning, at the end or after another blank.
void appendEscaped(std::string& out, std::string_view text);
void appendEscaped(std::string& out, const String& text);

} // namespace Pegasus::wire
