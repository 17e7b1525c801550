#pragma once

#include "pegasus/repository/QualifierRules.h"

namespace Pegasus::repository {

// Checks a new class by the rules of DSP0004, as far as OpenPegasus enforces them.
//
// Requires: `superClass` is resolved, or uninitialised for a root class.
// Returns: the class to store: a copy whose qualifiers have their effective flavors. Origin and propagation that the
//     caller may have set are left out; they follow from the hierarchy.
// Throws: CIM_ERR_INVALID_PARAMETER ("Non-association class contains reference property", "key property X is an
//     array"); CIM_ERR_FAILED ("type mismatch" for an override of another type, and as QualifierRules).
CIMClass checkClass(const CIMConstClass& newClass, const CIMConstClass& superClass, const QualifierLookup& lookup);

} // namespace Pegasus::repository
