// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/ObjectReps.h"
#include "pegasus/repository/QualifierRules.h"
#include "pegasus/repository/Repository.h"

// What happens to a class on its way into the repository and out of it: checkClass() before it is stored,
// withEmbeddedTypes() and resolveClass() when it is read, filterClass() for an answer. One source file each.
namespace Pegasus::repository {

// Checks a new class by the rules of DSP0004, as far as OpenPegasus enforces them.
//
// Requires: `superClass` is resolved, or uninitialised for a root class.
// Returns: the class to store: a copy whose qualifiers have their effective flavors. Origin and propagation that the
//     caller may have set are left out; they follow from the hierarchy.
// Throws: CIM_ERR_INVALID_PARAMETER ("Non-association class contains reference property", "key property X is an
//     array"); CIM_ERR_FAILED ("type mismatch" for an override of another type, and as QualifierRules).
CIMClass checkClass(const CIMConstClass& newClass, const CIMConstClass& superClass, const QualifierLookup& lookup);

// MOF declares a property that holds an embedded object as a string with a qualifier; the CIM-XML decoder makes it an
// object or an instance. The repository uses the types in which OpenPegasus returns such properties: a scalar with
// EmbeddedInstance is an instance, every other one stays a string.

// Returns: a decoded class with these types in place of the decoder's.
CIMClass withEmbeddedTypes(CIMClass decoded);

// Returns: a property's value with its type of these; null when its default has another type.
CIMValue embeddedValue(const CIMConstProperty& property);

// Completes a stored class with what it inherits, as clients see it and in OpenPegasus's order:
//
// - Elements that the class leaves alone come first, in the superclass's order, marked propagated, with the
//   superclass's qualifiers unchanged.
// - Its own elements follow as declared. One that overrides an inherited element keeps that element's origin, and gets
//   the inherited qualifiers whose flavor is ToSubclass and which it leaves unset, marked propagated, before its own.
// - The qualifiers of the class itself are inherited in the same way.
//
// Requires: `local` passed checkClass() with this superclass; `superClass` is resolved, or uninitialised for a root
//     class.
// Returns: a class that shares its unchanged parts with both.
CIMClass resolveClass(CIMClass local, CIMClass superClass);

// Returns: the part of a resolved class that the options ask for. It shares unchanged parts with `resolved`.
CIMClass filterClass(CIMClass resolved, const ClassOptions& options);

// Returns: the list that a class, property, method or parameter holds.
template <typename Handle> const Array<CIMQualifier>& qualifiersOf(const Handle& handle)
{
    return ObjectAccess::rep(handle).fQualifiers;
}

} // namespace Pegasus::repository
