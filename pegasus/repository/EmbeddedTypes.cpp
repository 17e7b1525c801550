// SPDX-License-Identifier: MIT
#include "pegasus/common/EmbeddedKind.h"
#include "pegasus/common/ObjectReps.h"
#include "pegasus/repository/ClassRules.h"

namespace Pegasus::repository {

namespace {

CIMType embeddedType(const CIMConstProperty& property)
{
    const CIMType type = property.getType();
    if (type != CIMTYPE_STRING && type != CIMTYPE_OBJECT && type != CIMTYPE_INSTANCE) {
        return type;
    }
    // By the qualifiers alone, as if the type were string: it replaces the type that the decoder chose.
    switch (embeddedKind(CIMTYPE_STRING, ObjectAccess::rep(property).fQualifiers)) {
    case EmbeddedKind::kInstance:
        return property.isArray() ? CIMTYPE_STRING : CIMTYPE_INSTANCE;
    case EmbeddedKind::kObject:
        return CIMTYPE_STRING;
    default:
        return type;
    }
}

bool changesType(const CIMConstProperty& property)
{
    return embeddedType(property) != property.getType();
}

CIMProperty retyped(CIMProperty property)
{
    CIMProperty result(property.getName(), embeddedValue(property), property.getArraySize(),
                       property.getReferenceClassName(), property.getClassOrigin(), property.getPropagated());
    for (Uint32 i = 0; i < property.getQualifierCount(); ++i) {
        result.addQualifier(property.getQualifier(i));
    }
    return result;
}

} // namespace

CIMValue embeddedValue(const CIMConstProperty& property)
{
    const CIMType type = embeddedType(property);
    return type == property.getType() ? property.getValue()
                                      : CIMValue(type, property.isArray(), property.getArraySize());
}

CIMClass withEmbeddedTypes(CIMClass decoded)
{
    bool isAsIs = true;
    for (Uint32 i = 0; i < decoded.getPropertyCount(); ++i) {
        isAsIs = isAsIs && !changesType(decoded.getProperty(i));
    }
    if (isAsIs) {
        return decoded;
    }
    CIMClass result(decoded.getClassName(), decoded.getSuperClassName());
    for (Uint32 i = 0; i < decoded.getQualifierCount(); ++i) {
        result.addQualifier(decoded.getQualifier(i));
    }
    for (Uint32 i = 0; i < decoded.getPropertyCount(); ++i) {
        result.addProperty(retyped(decoded.getProperty(i)));
    }
    for (Uint32 i = 0; i < decoded.getMethodCount(); ++i) {
        result.addMethod(decoded.getMethod(i));
    }
    return result;
}

} // namespace Pegasus::repository
