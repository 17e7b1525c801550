#pragma once

#include <Pegasus/Common/CIMClass.h>

namespace Pegasus::repository {

// A class with everything it inherits, as clients see it.
//
// What it inherits as a whole comes first, in the superclass's order, marked propagated, with the superclass's
// qualifiers as they are; its own follow as declared. An own element that overrides an inherited one keeps the origin
// and takes on, in front of its own and marked propagated, the qualifiers that the flavor hands down and that it does
// not give itself. The same goes for the qualifiers of the class.
//
// Requires: local passed checkClass() below superClass; superClass is resolved, or uninitialised for a root class.
// Returns: a class that shares its unchanged parts with both.
CIMClass resolveClass(CIMClass local, CIMClass superClass);

} // namespace Pegasus::repository
