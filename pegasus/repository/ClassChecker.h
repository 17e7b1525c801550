#pragma once

#include "pegasus/repository/QualifierRules.h"

namespace Pegasus::repository {

// The rules of DSP0004 that a new class must keep, as far as OpenPegasus enforces them.
//
// Requires: superClass is resolved, or uninitialised for a root class.
// Returns: the class to store: a copy whose qualifiers have their effective flavors, without what the caller may have
// written about origin and propagation.
// Throws: CIM_ERR_INVALID_PARAMETER ("Non-association class contains reference property", "key property X is an
// array"), CIM_ERR_FAILED ("type mismatch" for an override of another type, and what QualifierRules say).
CIMClass checkClass(const CIMConstClass& newClass, const CIMConstClass& superClass, const QualifierLookup& lookup);

} // namespace Pegasus::repository
