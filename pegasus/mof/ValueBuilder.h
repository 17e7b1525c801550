// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/Literal.h"

#include <Pegasus/Common/CIMType.h>
#include <Pegasus/Common/CIMValue.h>

namespace Pegasus::mof {

// The type that a value must have.
struct ValueType
{
    CIMType type = CIMTYPE_BOOLEAN;
    bool isArray = false;
    Uint32 arraySize = 0; // the fixed number of elements, 0 for any
};

// Converts a written constant to its type. References to aliases take their paths from `aliases`.
// Throws: MofError at the literal that the type rejects.
CIMValue buildValue(const TokenCursor& cursor, const AliasTable& aliases, const Initializer& initializer,
                    const ValueType& type);

// Converts UTF-8 to CIM text.
// Throws: MofError at `offset` when the bytes are malformed UTF-8.
String cimString(const TokenCursor& cursor, const std::string& text, std::size_t offset);

} // namespace Pegasus::mof
