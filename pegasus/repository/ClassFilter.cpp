// SPDX-License-Identifier: MIT
#include "pegasus/repository/ClassRules.h"

namespace Pegasus::repository {

namespace {

template <typename To, typename From> void copyQualifiers(To& to, From& from, const ClassOptions& options)
{
    if (!options.includeQualifiers) {
        return;
    }
    for (Uint32 i = 0; i < from.getQualifierCount(); ++i) {
        const CIMQualifier qualifier = from.getQualifier(i);
        if (!options.localOnly || !qualifier.getPropagated()) {
            to.addQualifier(qualifier);
        }
    }
}

CIMProperty filterProperty(CIMProperty from, const ClassOptions& options)
{
    CIMProperty property(from.getName(), from.getValue(), from.getArraySize(), from.getReferenceClassName(),
                         options.includeClassOrigin ? from.getClassOrigin() : CIMName(), from.getPropagated());
    copyQualifiers(property, from, options);
    return property;
}

CIMParameter filterParameter(CIMParameter from, const ClassOptions& options)
{
    CIMParameter parameter(from.getName(), from.getType(), from.isArray(), from.getArraySize(),
                           from.getReferenceClassName());
    copyQualifiers(parameter, from, options);
    return parameter;
}

CIMMethod filterMethod(CIMMethod from, const ClassOptions& options)
{
    CIMMethod method(from.getName(), from.getType(), options.includeClassOrigin ? from.getClassOrigin() : CIMName(),
                     from.getPropagated());
    copyQualifiers(method, from, options);
    for (Uint32 i = 0; i < from.getParameterCount(); ++i) {
        method.addParameter(filterParameter(from.getParameter(i), options));
    }
    return method;
}

} // namespace

bool isListed(const CIMPropertyList& list, const CIMName& name)
{
    return list.isNull() || list.contains(name);
}

CIMClass filterClass(CIMClass resolved, const ClassOptions& options)
{
    CIMClass filtered(resolved.getClassName(), resolved.getSuperClassName());
    copyQualifiers(filtered, resolved, options);
    for (Uint32 i = 0; i < resolved.getPropertyCount(); ++i) {
        const CIMProperty property = resolved.getProperty(i);
        if (!(options.localOnly && property.getPropagated()) && isListed(options.propertyList, property.getName())) {
            filtered.addProperty(filterProperty(property, options));
        }
    }
    for (Uint32 i = 0; i < resolved.getMethodCount(); ++i) {
        const CIMMethod method = resolved.getMethod(i);
        if (!(options.localOnly && method.getPropagated())) {
            filtered.addMethod(filterMethod(method, options));
        }
    }
    return filtered;
}

} // namespace Pegasus::repository
