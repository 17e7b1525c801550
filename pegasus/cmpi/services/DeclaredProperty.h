// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/ClassSchema.h"

#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/CIMValue.h>

namespace Pegasus::cmpi {

// Returns: whether a property that is declared so may hold the value.
bool accepts(const PropertySchema& declared, const CIMValue& value);

// Returns: the property with the value in the declared form: CMPI has one type for embedded objects of either kind, and
//     the class says which kind its property has.
// Requires: accepts(declared, value).
CIMProperty propertyOf(const PropertySchema& declared, const CIMValue& value);

} // namespace Pegasus::cmpi
