// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/TableFunction.h"

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMValue.h>
#include <cmpi/cmpi.h>

#include <cstring>
#include <string_view>

// CIM values to what providers read and write, a CMPIValue with its type code, and back.
namespace Pegasus::cmpi {

class Broker;

struct NamedValue
{
    CIMName name;
    CIMValue value;
};

// Returns: the CMPI code of a CIM type; CMPI_instance for embedded objects and instances alike.
CMPIType cmpiTypeOf(CIMType type, bool isArray);

// Returns: the CIM type of a code, its array bit ignored; CMPI_chars and CMPI_charsptr are strings.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE for codes that lack a CIM type.
CIMType cimTypeOf(CMPIType type);

// Reads a value's own bytes: its memory may end right after them, and may be aligned for that type only.
template <typename T> T readValue(const CMPIValue* value)
{
    T result;
    std::memcpy(&result, value, sizeof(T)); // NOLINT(bugprone-sizeof-expression): pointers are meant too
    return result;
}

// Returns: a provider's text, with U+FFFD for what is not UTF-8.
// Throws: with strict providers CMPI_RC_ERR_FAILED for such a text.
String decodeText(std::string_view text);

// Copies what a provider passes as (value, type). Text of type CMPI_chars starts at `value` itself. Of any other type
// exactly the type's own bytes are read: providers pass the address of a variable of that size.
// Returns: a null of the type for a null pointer, or one to a null object or array. A null element of an array becomes
//     the type's zero, since CIM arrays hold no nulls.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE.
CIMValue decodeValue(const CMPIValue* value, CMPIType type);

// Returns: the value for a provider.
// Ownership: objects in it belong to the current frame.
CMPIData encodeValue(Broker& broker, const CIMValue& value);

} // namespace Pegasus::cmpi
