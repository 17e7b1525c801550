// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/TokenCursor.h"
#include "pegasus/mof/ValueBuilder.h"

#include <Pegasus/Common/CIMName.h>

namespace Pegasus::mof {

// The parts of a declaration that say a type.

// Returns: true for the word of a DSP0004 data type, and sets `type`.
bool isDataType(const Token& word, CIMType& type);

// The next three parse at the cursor and throw MofError.

// Parses an optional "[]" or "[n]", and completes `type`.
void parseArraySuffix(TokenCursor& cursor, ValueType& type);

// Parses a data type, or a class name and REF, which also sets `referenceClass`.
ValueType parseElementType(TokenCursor& cursor, CIMName& referenceClass);

// Parses a CIM name; `what` describes it in the message.
CIMName parseName(TokenCursor& cursor, std::string_view what);

} // namespace Pegasus::mof
