#pragma once

#include <Pegasus/Common/CIMClass.h>

namespace Pegasus::repository {

// Completes a stored class with what it inherits, as clients see it and in OpenPegasus's order:
//
// - Elements that the class does not override come first, in the superclass's order, marked propagated, with the
//   superclass's qualifiers unchanged.
// - Its own elements follow as declared. One that overrides an inherited element keeps that element's origin. Before
// its
//   own qualifiers it gets the inherited ones whose flavor is ToSubclass and which it does not set, marked propagated.
// - The qualifiers of the class itself are inherited in the same way.
//
// Requires: `local` passed checkClass() with this superclass; `superClass` is resolved, or uninitialised for a root
//     class.
// Returns: a class that shares its unchanged parts with both.
CIMClass resolveClass(CIMClass local, CIMClass superClass);

} // namespace Pegasus::repository
