#pragma once

#include "pegasus/cmpi/Slot.h"

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMValue.h>

#include <vector>

namespace Pegasus::cmpi {

class Broker;

struct NamedValue
{
    CIMName name;
    CIMValue value;
};

// Returns: the CMPI code of a CIM type; embedded objects and instances are CMPI_instance.
CMPIType cmpiTypeOf(CIMType type, bool isArray);

// Returns: the CIM type of a code, its array bit ignored; CMPI_chars and CMPI_charsptr are strings.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE for codes that are no CIM type.
CIMType cimTypeOf(CMPIType type);

// Copies what a provider passes as (value, type): text behind the pointer itself for CMPI_chars, no more bytes than the
// type has otherwise. A null pointer, or one to a null object or array, gives a null of the type; a null element of an
// array its type's zero, since CIM arrays have none.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE.
CIMValue decodeValue(const CMPIValue* value, CMPIType type);

// Returns: the value for a provider; objects in it belong to the current frame.
CMPIData encodeValue(Broker& broker, const CIMValue& value);

// The same for a key: integers of every width as 64 bits (CMPI_keyInteger), state CMPI_keyValue.
CMPIData encodeKey(Broker& broker, const CIMValue& value);

// Integers, booleans and character sets of a key's text or value turned into `type`; other pairs only when they are
// equal. Returns: a null of `type` when the value does not fit it.
CIMValue convertKey(const CIMValue& value, CIMType type);

// Builds the array of `type` from its elements; a null one becomes the type's zero.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE.
CIMValue arrayOf(CIMType type, const std::vector<CIMValue>& elements);
// Returns: the elements of an array value, none of a null.
std::vector<CIMValue> elementsOf(const CIMValue& array);

} // namespace Pegasus::cmpi
