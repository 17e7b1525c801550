// SPDX-License-Identifier: MIT
#include "pegasus/repository/ClassRules.h"

namespace Pegasus::repository {

namespace {

// The source arguments are non-const handles because only those return parts that can be shared. The functions change
// `to` alone.

template <typename To, typename From> void shareQualifiers(To& to, From& from)
{
    for (Uint32 i = 0; i < from.getQualifierCount(); ++i) {
        to.addQualifier(from.getQualifier(i));
    }
}

// In reverse order, as OpenPegasus answers.
template <typename To, typename From, typename Local> void inheritQualifiers(To& to, From& from, Local& local)
{
    for (Uint32 i = from.getQualifierCount(); i-- > 0;) {
        const CIMQualifier inherited = from.getQualifier(i);
        if (inherited.getFlavor().hasFlavor(CIMFlavor::TOSUBCLASS) &&
            local.findQualifier(inherited.getName()) == PEG_NOT_FOUND)
        {
            to.addQualifier(CIMQualifier(inherited.getName(), inherited.getValue(), inherited.getFlavor(), true));
        }
    }
}

CIMProperty copyProperty(CIMProperty from, const CIMName& origin, bool isPropagated)
{
    return CIMProperty(from.getName(), from.getValue(), from.getArraySize(), from.getReferenceClassName(), origin,
                       isPropagated);
}

CIMProperty inheritedProperty(CIMProperty from)
{
    CIMProperty property = copyProperty(from, from.getClassOrigin(), true);
    shareQualifiers(property, from);
    return property;
}

CIMProperty ownProperty(CIMProperty local, const CIMName& owner, CIMClass& superClass)
{
    const Uint32 index = superClass.isUninitialized() ? PEG_NOT_FOUND : superClass.findProperty(local.getName());
    if (index == PEG_NOT_FOUND) {
        CIMProperty property = copyProperty(local, owner, false);
        shareQualifiers(property, local);
        return property;
    }
    CIMProperty overridden = superClass.getProperty(index);
    CIMProperty property = copyProperty(local, overridden.getClassOrigin(), false);
    inheritQualifiers(property, overridden, local);
    shareQualifiers(property, local);
    return property;
}

void shareParameters(CIMMethod& to, CIMMethod& from)
{
    for (Uint32 i = 0; i < from.getParameterCount(); ++i) {
        to.addParameter(from.getParameter(i));
    }
}

CIMMethod inheritedMethod(CIMMethod from)
{
    CIMMethod method(from.getName(), from.getType(), from.getClassOrigin(), true);
    shareQualifiers(method, from);
    shareParameters(method, from);
    return method;
}

CIMParameter overridingParameter(CIMParameter local, CIMMethod& overridden)
{
    const Uint32 index = overridden.findParameter(local.getName());
    if (index == PEG_NOT_FOUND) {
        return local;
    }
    CIMParameter inherited = overridden.getParameter(index);
    CIMParameter parameter(local.getName(), local.getType(), local.isArray(), local.getArraySize(),
                           local.getReferenceClassName());
    inheritQualifiers(parameter, inherited, local);
    shareQualifiers(parameter, local);
    return parameter;
}

CIMMethod ownMethod(CIMMethod local, const CIMName& owner, CIMClass& superClass)
{
    const Uint32 index = superClass.isUninitialized() ? PEG_NOT_FOUND : superClass.findMethod(local.getName());
    if (index == PEG_NOT_FOUND) {
        CIMMethod method(local.getName(), local.getType(), owner, false);
        shareQualifiers(method, local);
        shareParameters(method, local);
        return method;
    }
    CIMMethod overridden = superClass.getMethod(index);
    CIMMethod method(local.getName(), local.getType(), overridden.getClassOrigin(), false);
    inheritQualifiers(method, overridden, local);
    shareQualifiers(method, local);
    for (Uint32 i = 0; i < local.getParameterCount(); ++i) {
        method.addParameter(overridingParameter(local.getParameter(i), overridden));
    }
    return method;
}

void addInherited(CIMClass& resolved, CIMClass& local, CIMClass& superClass)
{
    inheritQualifiers(resolved, superClass, local);
    for (Uint32 i = 0; i < superClass.getPropertyCount(); ++i) {
        const CIMProperty property = superClass.getProperty(i);
        if (local.findProperty(property.getName()) == PEG_NOT_FOUND) {
            resolved.addProperty(inheritedProperty(property));
        }
    }
    for (Uint32 i = 0; i < superClass.getMethodCount(); ++i) {
        const CIMMethod method = superClass.getMethod(i);
        if (local.findMethod(method.getName()) == PEG_NOT_FOUND) {
            resolved.addMethod(inheritedMethod(method));
        }
    }
}

} // namespace

CIMClass resolveClass(CIMClass local, CIMClass superClass)
{
    const CIMName name = local.getClassName();
    CIMClass resolved(name, local.getSuperClassName());
    if (!superClass.isUninitialized()) {
        addInherited(resolved, local, superClass);
    }
    shareQualifiers(resolved, local);
    for (Uint32 i = 0; i < local.getPropertyCount(); ++i) {
        resolved.addProperty(ownProperty(local.getProperty(i), name, superClass));
    }
    for (Uint32 i = 0; i < local.getMethodCount(); ++i) {
        resolved.addMethod(ownMethod(local.getMethod(i), name, superClass));
    }
    return resolved;
}

} // namespace Pegasus::repository
