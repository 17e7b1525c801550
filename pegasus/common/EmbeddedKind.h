#pragma once

#include <Pegasus/Common/CIMProperty.h>

namespace Pegasus {

// What a property holds besides plain values.
enum class EmbeddedKind
{
    kNone,
    kObject,   // an instance or a class
    kInstance, // an instance
};

// The one rule for embedded objects (DSP0004, DSP0201). A property holds them when its type says so (object, instance:
// from the attribute EmbeddedObject on the wire), or when it is a string with
//   - the qualifier EmbeddedObject, boolean and true: an object; else
//   - the qualifier EmbeddedInstance, a string (the name of a class, which is not looked at): an instance.
// Thread: any.
EmbeddedKind embeddedKind(CIMType type, const Array<CIMQualifier>& qualifiers);
// Throws: UninitializedObjectException.
EmbeddedKind embeddedKind(const CIMConstProperty& property);

} // namespace Pegasus
