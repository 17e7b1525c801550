// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ListedNames.h"
#include "pegasus/repository/Repository.h"

namespace Pegasus::repository {

// Returns: the instance to store. It has every property of its class: first the omitted ones, with the class's
//     defaults and marked propagated, then the given ones in their order. Names and origins are the class's.
// Requires: `itsClass` is resolved.
// Throws: CIM_ERR_FAILED ("no such property: X", "type mismatch"), CIM_ERR_NOT_SUPPORTED (abstract class).
CIMInstance completeInstance(const CIMConstInstance& given, const CIMConstClass& itsClass);

// Returns: the path of a completed instance: its class and keys. A null text key counts as empty.
// Throws: CIM_ERR_FAILED "class has no keys: X", CIM_ERR_INVALID_PARAMETER for a null key of another type.
CIMObjectPath instancePath(const CIMConstInstance& completed, const CIMConstClass& itsClass);

// Returns: a stored instance with the values of `modified` (all, or those listed) in place of its own.
// Requires: `stored` is complete. The caller checks that its path stays the same.
// Throws: CIM_ERR_FAILED ("no such property: X", "type mismatch").
CIMInstance mergedInstance(const CIMInstance& stored, const CIMConstInstance& modified, const CIMConstClass& itsClass,
                           const ListedNames& listed);

// Returns: the listed part of a stored instance, with its path. Like OpenPegasus, what is picked comes in the class's
//     order, a whole instance in the order of storage.
// `stored`: spent afterwards. `shape`: the class whose properties are picked; uninitialised for the whole instance.
CIMInstance filteredInstance(CIMInstance stored, const CIMConstClass& shape, const ListedNames& listed,
                             bool includeClassOrigin);

} // namespace Pegasus::repository
