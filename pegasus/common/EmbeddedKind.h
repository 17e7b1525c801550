// SPDX-License-Identifier: MIT
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

// For embeddedKind() only.
EmbeddedKind embeddedKindByQualifier(const Array<CIMQualifier>& qualifiers);

// The one rule for embedded objects (DSP0004, DSP0201). A property holds them when its type says so (object, instance:
// from the attribute EmbeddedObject on the wire), or when it is a string with
//   - the qualifier EmbeddedObject, boolean and true: an object; else
//   - the qualifier EmbeddedInstance, a string (the name of a class, which is ignored): an instance.
// Thread: any.
inline EmbeddedKind embeddedKind(CIMType type, const Array<CIMQualifier>& qualifiers)
{
    if (type == CIMTYPE_OBJECT) {
        return EmbeddedKind::kObject;
    }
    if (type == CIMTYPE_INSTANCE) {
        return EmbeddedKind::kInstance;
    }
    // Inline up to here: most properties lack qualifiers, and decoders ask for each of them.
    return type == CIMTYPE_STRING && qualifiers.size() > 0 ? embeddedKindByQualifier(qualifiers) : EmbeddedKind::kNone;
}
// Throws: UninitializedObjectException.
EmbeddedKind embeddedKind(const CIMConstProperty& property);

} // namespace Pegasus
