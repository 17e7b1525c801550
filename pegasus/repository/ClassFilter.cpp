// SPDX-License-Identifier: MIT
#include "pegasus/repository/ClassRules.h"
#include "pegasus/repository/ListedNames.h"

namespace Pegasus::repository {

namespace {

Array<CIMQualifier> filterQualifiers(const Array<CIMQualifier>& from, const ClassOptions& options)
{
    Array<CIMQualifier> kept;
    for (Uint32 i = 0; options.includeQualifiers && i < from.size(); ++i) {
        if (!options.localOnly || !from[i].getPropagated()) {
            kept.append(from[i]);
        }
    }
    return kept;
}

// Returns: a handle to a copy of `from` that shares its parts, apart from the qualifiers.
template <typename Rep, typename Handle> Handle filterElement(const Handle& from, const ClassOptions& options)
{
    auto* copy = new Rep(ObjectAccess::rep(from));
    Handle element = ObjectAccess::wrap<Handle>(copy);
    copy->fQualifiers = filterQualifiers(copy->fQualifiers, options);
    return element;
}

// For properties and methods.
template <typename Rep, typename Handle> Handle filterMember(const Handle& from, const ClassOptions& options)
{
    Handle member = filterElement<Rep>(from, options);
    if (!options.includeClassOrigin) {
        ObjectAccess::rep(member).fClassOrigin.clear();
    }
    return member;
}

CIMMethod filterMethod(const CIMMethod& from, const ClassOptions& options)
{
    CIMMethod method = filterMember<CIMMethodRep>(from, options);
    const Array<CIMParameter>& parameters = ObjectAccess::rep(from).fParameters;
    Array<CIMParameter> filtered;
    for (Uint32 i = 0; i < parameters.size(); ++i) {
        filtered.append(filterElement<CIMParameterRep>(parameters[i], options));
    }
    ObjectAccess::rep(method).fParameters = filtered;
    return method;
}

} // namespace

CIMClass filterClass(CIMClass resolved, const ClassOptions& options)
{
    const CIMClassRep& from = ObjectAccess::rep(resolved);
    const ListedNames listed(options.propertyList);
    CIMClass filtered(resolved.getClassName(), resolved.getSuperClassName());
    CIMClassRep& to = ObjectAccess::rep(filtered);
    to.fQualifiers = filterQualifiers(from.fQualifiers, options);
    for (Uint32 i = 0; i < from.fProperties.size(); ++i) {
        const CIMProperty& property = from.fProperties[i];
        if (!(options.localOnly && property.getPropagated()) && listed.has(property.getName())) {
            to.fProperties.append(filterMember<CIMPropertyRep>(property, options));
        }
    }
    for (Uint32 i = 0; i < from.fMethods.size(); ++i) {
        const CIMMethod& method = from.fMethods[i];
        if (!(options.localOnly && method.getPropagated())) {
            to.fMethods.append(filterMethod(method, options));
        }
    }
    return filtered;
}

} // namespace Pegasus::repository
