// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/services/DeclaredProperty.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObject.h>

namespace Pegasus::cmpi {
namespace {

CIMValue asDeclared(const PropertySchema& property, const CIMValue& value)
{
    if (property.embedded == EmbeddedKind::kNone) {
        return value;
    }
    if (value.isNull()) { // a null embedded object is marked as an instance or not at all
        return {property.embedded == EmbeddedKind::kInstance ? CIMTYPE_INSTANCE : CIMTYPE_STRING, property.isArray};
    }
    if (property.embedded != EmbeddedKind::kObject || value.getType() != CIMTYPE_INSTANCE) {
        return value;
    }
    if (!value.isArray()) {
        CIMInstance instance;
        value.get(instance);
        return CIMValue(CIMObject(instance));
    }
    Array<CIMInstance> instances;
    value.get(instances);
    Array<CIMObject> objects;
    for (Uint32 i = 0; i < instances.size(); ++i) {
        objects.append(CIMObject(instances[i]));
    }
    return CIMValue(objects);
}

Uint32 sizeOf(const CIMValue& value)
{
    return value.isArray() && !value.isNull() ? value.getArraySize() : 0;
}

} // namespace

bool accepts(const PropertySchema& declared, const CIMValue& value)
{
    if (declared.isArray != value.isArray()) {
        return false;
    }
    const CIMType type = value.getType();
    return type == declared.type || (declared.embedded != EmbeddedKind::kNone &&
                                     (type == CIMTYPE_INSTANCE || type == CIMTYPE_OBJECT || type == CIMTYPE_STRING));
}

CIMProperty propertyOf(const PropertySchema& declared, const CIMValue& value)
{
    const bool isReference = declared.type == CIMTYPE_REFERENCE && !declared.isArray;
    const CIMValue typed = asDeclared(declared, value);
    return {declared.name,       typed, sizeOf(typed), isReference ? declared.referenceClass : CIMName(), CIMName(),
            declared.isInherited};
}

} // namespace Pegasus::cmpi
