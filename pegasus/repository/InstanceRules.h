#pragma once

#include "pegasus/repository/Repository.h"

namespace Pegasus::repository {

// The instance to store: every property of its class, those not given in front with the class's defaults and marked
// propagated, the given ones behind in their order; names spelled and origins set as the class has them.
//
// Requires: itsClass is resolved.
// Throws: CIM_ERR_FAILED ("no such property: X", "type mismatch"), CIM_ERR_NOT_SUPPORTED (abstract class).
CIMInstance completeInstance(const CIMConstInstance& given, const CIMConstClass& itsClass);

// The path of a completed instance, without host and namespace. A null text key counts as empty.
// Throws: CIM_ERR_FAILED "class has no keys: X", CIM_ERR_INVALID_PARAMETER for a null key of another type.
CIMObjectPath instancePath(const CIMConstInstance& completed, const CIMConstClass& itsClass);

// Puts the values of `modified` (all, or those listed) into a stored instance; keys stay.
// Throws: CIM_ERR_FAILED ("no such property: X", "type mismatch").
void mergeValues(CIMInstance& stored, const CIMConstInstance& modified, const CIMPropertyList& list);

// Takes out of a stored instance what the options do not ask for. shape: the class whose properties are wanted, or
// uninitialised for all.
void filterInstance(CIMInstance& stored, const CIMConstClass& shape, const InstanceOptions& options);

// One text for all paths that are equal (DSP0004): letter case, key order and the spelling of numbers do not matter.
// Host and namespace of the path itself are left out.
std::string pathKey(const CIMObjectPath& path);

} // namespace Pegasus::repository
