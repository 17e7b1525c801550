#pragma once

#include "pegasus/mof/TokenCursor.h"
#include "pegasus/mof/ValueBuilder.h"

#include <Pegasus/Common/CIMName.h>

namespace Pegasus::mof {

// Is the word one of DSP0004's data types? Sets type if so.
bool isDataType(const Token& word, CIMType& type);

// "[]", "[n]" or nothing. Throws MofError.
void parseArraySuffix(TokenCursor& cursor, ValueType& type);

// A type at the cursor, or a class name and REF, which also sets referenceClass. Throws MofError.
ValueType parseElementType(TokenCursor& cursor, CIMName& referenceClass);

// A CIM name at the cursor; what says which in the message. Throws MofError.
CIMName parseName(TokenCursor& cursor, std::string_view what);

} // namespace Pegasus::mof
