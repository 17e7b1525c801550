#pragma once

#include <Pegasus/Common/CIMClass.h>

namespace Pegasus::repository {

// Properties that hold embedded objects are declared as strings with a qualifier, but come out of the decoder as
// objects or instances. In the repository they have the types with which OpenPegasus gives them out: a scalar with
// EmbeddedInstance is an instance, every other one stays a string.

// The type for a property as declared.
CIMType embeddedType(const CIMConstProperty& property);

// Its value with that type; a default of another type cannot be kept and becomes null.
CIMValue embeddedValue(const CIMConstProperty& property);

// A decoded class with these types in place of the decoder's.
CIMClass withEmbeddedTypes(CIMClass decoded);

// May a value of the given type be stored in a property of the declared one?
bool isStorableAs(const CIMConstProperty& given, const CIMConstProperty& declared);

} // namespace Pegasus::repository
