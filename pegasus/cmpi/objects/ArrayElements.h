#pragma once

#include <Pegasus/Common/CIMValue.h>

#include <vector>

// A CIM array is one value; a CMPI array is filled and read element by element.
namespace Pegasus::cmpi {

// Builds the array of `type` from its elements; a null one becomes the type's zero.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE for a type that has no arrays.
CIMValue arrayOf(CIMType type, const std::vector<CIMValue>& elements);

// Returns: the elements of an array value; an empty vector for a null.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE.
std::vector<CIMValue> elementsOf(const CIMValue& array);

} // namespace Pegasus::cmpi
