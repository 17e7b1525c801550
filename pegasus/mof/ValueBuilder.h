#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/Literal.h"

#include <Pegasus/Common/CIMType.h>
#include <Pegasus/Common/CIMValue.h>

namespace Pegasus::mof {

// The type that a value must take on.
struct ValueType
{
    CIMType type = CIMTYPE_BOOLEAN;
    bool isArray = false;
    Uint32 arraySize = 0; // the fixed number of elements, 0 for any
};

// Gives a written constant its type. Throws MofError at the literal that does not fit; references look into aliases.
CIMValue buildValue(const TokenCursor& cursor, const AliasTable& aliases, const Initializer& initializer,
                    const ValueType& type);

// UTF-8 to CIM text. Throws MofError at offset if the bytes are not valid UTF-8.
String cimString(const TokenCursor& cursor, const std::string& text, std::size_t offset);

} // namespace Pegasus::mof
