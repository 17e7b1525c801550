// SPDX-License-Identifier: MIT
#include "pegasus/common/NameIndex.h"
#include "pegasus/repository/ClassRules.h"

namespace Pegasus::repository {

namespace {

// Lists are filled by append(), which leaves out addProperty()'s search for an equal name: the names of one class
// differ, and an inherited member is taken only if the class has none of its name.

// In reverse order, as OpenPegasus answers.
void inheritQualifiers(Array<CIMQualifier>& to, const Array<CIMQualifier>& from, const Array<CIMQualifier>& local)
{
    const NameIndex<CIMQualifier> own(local);
    for (Uint32 i = from.size(); i-- > 0;) {
        const CIMQualifier& inherited = from[i];
        if (inherited.getFlavor().hasFlavor(CIMFlavor::TOSUBCLASS) && !own.has(inherited.getName())) {
            to.append(CIMQualifier(inherited.getName(), inherited.getValue(), inherited.getFlavor(), true));
        }
    }
}

// Returns: a handle to a copy of `from` that shares its parts.
template <typename Rep, typename Handle> Handle shallowCopy(const Handle& from)
{
    return ObjectAccess::wrap<Handle>(new Rep(ObjectAccess::rep(from)));
}

// Returns: the qualifiers of an element that overrides `inherited`.
template <typename Handle> Array<CIMQualifier> overridingQualifiers(const Handle& local, const Handle& inherited)
{
    Array<CIMQualifier> qualifiers;
    inheritQualifiers(qualifiers, qualifiersOf(inherited), qualifiersOf(local));
    qualifiers.appendArray(qualifiersOf(local));
    return qualifiers;
}

// For properties and methods.
template <typename Rep, typename Handle> Handle inheritedMember(const Handle& from)
{
    Handle member = shallowCopy<Rep>(from);
    ObjectAccess::rep(member).fPropagated = true;
    return member;
}

// Returns: a copy of a property or method of the class `owner`, which may override that of `index` in `inherited`.
template <typename Rep, typename Handle>
Handle ownMember(const Handle& local, const CIMName& owner, const Array<Handle>& inherited, Uint32 index)
{
    Handle member = shallowCopy<Rep>(local);
    Rep& rep = ObjectAccess::rep(member);
    rep.fPropagated = false;
    rep.fClassOrigin = owner;
    if (index != PEG_NOT_FOUND) {
        rep.fClassOrigin = inherited[index].getClassOrigin();
        rep.fQualifiers = overridingQualifiers(local, inherited[index]);
    }
    return member;
}

CIMParameter overridingParameter(const CIMParameter& local, const CIMParameter& inherited)
{
    CIMParameter parameter = shallowCopy<CIMParameterRep>(local);
    ObjectAccess::rep(parameter).fQualifiers = overridingQualifiers(local, inherited);
    return parameter;
}

Array<CIMParameter> overridingParameters(const Array<CIMParameter>& local, const Array<CIMParameter>& inherited)
{
    const NameIndex<CIMParameter> above(inherited);
    Array<CIMParameter> parameters;
    for (Uint32 i = 0; i < local.size(); ++i) {
        const Uint32 index = above.find(local[i].getName());
        parameters.append(index == PEG_NOT_FOUND ? local[i] : overridingParameter(local[i], inherited[index]));
    }
    return parameters;
}

template <typename Rep, typename Handle>
void addInherited(Array<Handle>& to, const Array<Handle>& local, const Array<Handle>& inherited)
{
    const NameIndex<Handle> own(local);
    to.reserveCapacity(local.size() + inherited.size());
    for (Uint32 i = 0; i < inherited.size(); ++i) {
        if (!own.has(inherited[i].getName())) {
            to.append(inheritedMember<Rep>(inherited[i]));
        }
    }
}

void addOwnProperties(CIMClassRep& to, const CIMClassRep& local, const CIMClassRep& superClass)
{
    const NameIndex<CIMProperty> above(superClass.fProperties);
    for (Uint32 i = 0; i < local.fProperties.size(); ++i) {
        const CIMProperty& property = local.fProperties[i];
        to.fProperties.append(ownMember<CIMPropertyRep>(property, local.fPath.getClassName(), superClass.fProperties,
                                                        above.find(property.getName())));
    }
}

void addOwnMethods(CIMClassRep& to, const CIMClassRep& local, const CIMClassRep& superClass)
{
    const NameIndex<CIMMethod> above(superClass.fMethods);
    for (Uint32 i = 0; i < local.fMethods.size(); ++i) {
        const Uint32 index = above.find(local.fMethods[i].getName());
        CIMMethod method =
            ownMember<CIMMethodRep>(local.fMethods[i], local.fPath.getClassName(), superClass.fMethods, index);
        if (index != PEG_NOT_FOUND) {
            Array<CIMParameter>& parameters = ObjectAccess::rep(method).fParameters;
            parameters = overridingParameters(parameters, ObjectAccess::rep(superClass.fMethods[index]).fParameters);
        }
        to.fMethods.append(method);
    }
}

} // namespace

CIMClass resolveClass(CIMClass local, CIMClass superClass)
{
    const CIMClassRep& from = ObjectAccess::rep(local);
    const CIMClassRep nothing;
    const CIMClassRep& above = superClass.isUninitialized() ? nothing : ObjectAccess::rep(superClass);
    CIMClass resolved(local.getClassName(), local.getSuperClassName());
    CIMClassRep& to = ObjectAccess::rep(resolved);
    inheritQualifiers(to.fQualifiers, above.fQualifiers, from.fQualifiers);
    to.fQualifiers.appendArray(from.fQualifiers);
    addInherited<CIMPropertyRep>(to.fProperties, from.fProperties, above.fProperties);
    addInherited<CIMMethodRep>(to.fMethods, from.fMethods, above.fMethods);
    addOwnProperties(to, from, above);
    addOwnMethods(to, from, above);
    return resolved;
}

} // namespace Pegasus::repository
