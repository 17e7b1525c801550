// SPDX-License-Identifier: MIT
#include "pegasus/common/EmbeddedKind.h"

#include "pegasus/common/ObjectReps.h"

namespace Pegasus {

EmbeddedKind embeddedKindByQualifier(const Array<CIMQualifier>& qualifiers)
{
    static const CIMName kEmbeddedObject("EmbeddedObject");
    static const CIMName kEmbeddedInstance("EmbeddedInstance");
    if (ObjectAccess::isTrue(qualifiers, kEmbeddedObject)) {
        return EmbeddedKind::kObject;
    }
    const Uint32 index = ObjectAccess::find(qualifiers, kEmbeddedInstance);
    const bool isFound = index != PEG_NOT_FOUND && qualifiers[index].getType() == CIMTYPE_STRING;
    return isFound ? EmbeddedKind::kInstance : EmbeddedKind::kNone;
}

EmbeddedKind embeddedKind(const CIMConstProperty& property)
{
    return embeddedKind(property.getType(), ObjectAccess::rep(property).fQualifiers);
}

} // namespace Pegasus
