#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <functional>

namespace Pegasus::repository {

// Looks a qualifier declaration up. Returns false if there is none.
using QualifierLookup = std::function<bool(const CIMName& name, CIMQualifierDecl& declaration)>;

// The qualifiers of one element: gives each the flavor of its declaration, narrowed by what the use itself says.
// On the wire a use that says nothing comes with neither "overridable" nor "to subclass".
//
// Throws CIM_ERR_FAILED: "undeclared qualifier: X", "bad qualifier type: X",
// "qualifier invalid in this scope: X scope=CLASS".
CIMQualifier checkedQualifier(const CIMConstQualifier& use, const CIMScope& scope, const QualifierLookup& lookup);

// Throws CIM_ERR_FAILED "qualifier cannot be overridden: X" if a use differs from the one that it overrides although
// that one's flavor forbids it.
void checkOverride(const CIMConstQualifier& use, const CIMConstQualifier& inherited);

} // namespace Pegasus::repository
