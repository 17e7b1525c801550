#pragma once

#include "host/cli/Document.h"

#include <string>

namespace vrxhost {

// Returns: text for a person; null properties are left out and control bytes are shown as escapes.
std::string RenderTable(const TDocument& document);

// Returns: one JSON document (UTF-8, ends with a newline) with true types: numbers (64 bits exact), booleans, null,
// arrays; datetimes and references as strings, a char16 as a one-character string. Bytes that are no UTF-8 become
// U+FFFD, a real that is no finite number becomes null.
std::string RenderJson(const TDocument& document);

} // namespace vrxhost
