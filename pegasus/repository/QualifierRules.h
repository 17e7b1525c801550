// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <functional>

namespace Pegasus::repository {

// Finds the declaration of a qualifier.
// Returns: false when it is absent.
using QualifierLookup = std::function<bool(const CIMName& name, CIMQualifierDecl& declaration)>;

// Checks one use of a qualifier against its declaration.
// Returns: the use with the flavor of its declaration, narrowed by the flavor of the use. A use that omits its
//     flavor arrives from the wire with overridable and to-subclass both off, and takes the declaration's flavor.
// Throws: CIM_ERR_FAILED: "undeclared qualifier: X", "bad qualifier type: X",
//     "qualifier invalid in this scope: X scope=CLASS".
CIMQualifier checkedQualifier(const CIMConstQualifier& use, const CIMScope& scope, const QualifierLookup& lookup);

// Checks a use against the inherited one that it overrides.
// Throws: CIM_ERR_FAILED "qualifier cannot be overridden: X" if the value differs although the inherited flavor is
//     DisableOverride.
void checkOverride(const CIMConstQualifier& use, const CIMConstQualifier& inherited);

} // namespace Pegasus::repository
