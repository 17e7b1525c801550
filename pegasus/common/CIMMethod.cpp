// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectReps.h"

namespace Pegasus {

template class RepPointer<CIMParameterRep>;
template class RepPointer<CIMMethodRep>;

// ---- CIMParameter

CIMConstParameter::CIMConstParameter(const CIMName& name, CIMType type, Boolean isArray, Uint32 arraySize,
                                     const CIMName& referenceClassName)
    : fRep(new CIMParameterRep())
{
    if ((arraySize != 0 && !isArray) || (type == CIMTYPE_REFERENCE) == referenceClassName.isNull()) {
        throw TypeMismatchException();
    }
    fRep->fName = notNull(name);
    fRep->fType = type;
    fRep->fIsArray = isArray;
    fRep->fArraySize = arraySize;
    fRep->fReferenceClassName = referenceClassName;
}

const CIMName& CIMConstParameter::getName() const
{
    return fRep.checked().fName;
}

Boolean CIMConstParameter::isArray() const
{
    return fRep.checked().fIsArray;
}

Uint32 CIMConstParameter::getArraySize() const
{
    return fRep.checked().fArraySize;
}

const CIMName& CIMConstParameter::getReferenceClassName() const
{
    return fRep.checked().fReferenceClassName;
}

CIMType CIMConstParameter::getType() const
{
    return fRep.checked().fType;
}

Uint32 CIMConstParameter::findQualifier(const CIMName& name) const
{
    return ObjectAccess::find(fRep.checked().fQualifiers, name);
}

CIMConstQualifier CIMConstParameter::getQualifier(Uint32 index) const
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

Uint32 CIMConstParameter::getQualifierCount() const
{
    return fRep.checked().fQualifiers.size();
}

Boolean CIMConstParameter::isUninitialized() const
{
    return !fRep;
}

Boolean CIMConstParameter::identical(const CIMConstParameter& parameter) const
{
    const CIMParameterRep& x = fRep.checked();
    const CIMParameterRep& y = parameter.fRep.checked();
    return &x == &y || (x.fName.equal(y.fName) && x.fType == y.fType && x.fIsArray == y.fIsArray &&
                        x.fArraySize == y.fArraySize && x.fReferenceClassName.equal(y.fReferenceClassName) &&
                        ObjectAccess::identical(x.fQualifiers, y.fQualifiers));
}

CIMParameter CIMConstParameter::clone() const
{
    auto* copy = new CIMParameterRep(fRep.checked());
    CIMParameter parameter = ObjectAccess::wrap<CIMParameter>(copy);
    copy->fQualifiers = ObjectAccess::clone(copy->fQualifiers);
    return parameter;
}

void CIMParameter::setName(const CIMName& name)
{
    fRep.checked().fName = notNull(name);
}

CIMParameter& CIMParameter::addQualifier(const CIMQualifier& qualifier)
{
    ObjectAccess::add(fRep.checked().fQualifiers, qualifier, "qualifier");
    return *this;
}

CIMQualifier CIMParameter::getQualifier(Uint32 index)
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

void CIMParameter::removeQualifier(Uint32 index)
{
    fRep.checked().fQualifiers.remove(index);
}

// ---- CIMMethod

CIMConstMethod::CIMConstMethod(const CIMName& name, CIMType type, const CIMName& classOrigin, Boolean propagated)
    : fRep(new CIMMethodRep())
{
    fRep->fName = notNull(name);
    fRep->fType = type;
    fRep->fClassOrigin = classOrigin;
    fRep->fPropagated = propagated;
}

const CIMName& CIMConstMethod::getName() const
{
    return fRep.checked().fName;
}

CIMType CIMConstMethod::getType() const
{
    return fRep.checked().fType;
}

const CIMName& CIMConstMethod::getClassOrigin() const
{
    return fRep.checked().fClassOrigin;
}

Boolean CIMConstMethod::getPropagated() const
{
    return fRep.checked().fPropagated;
}

Uint32 CIMConstMethod::findQualifier(const CIMName& name) const
{
    return ObjectAccess::find(fRep.checked().fQualifiers, name);
}

CIMConstQualifier CIMConstMethod::getQualifier(Uint32 index) const
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

Uint32 CIMConstMethod::getQualifierCount() const
{
    return fRep.checked().fQualifiers.size();
}

Uint32 CIMConstMethod::findParameter(const CIMName& name) const
{
    return ObjectAccess::find(fRep.checked().fParameters, name);
}

CIMConstParameter CIMConstMethod::getParameter(Uint32 index) const
{
    return ObjectAccess::at(fRep.checked().fParameters, index);
}

Uint32 CIMConstMethod::getParameterCount() const
{
    return fRep.checked().fParameters.size();
}

Boolean CIMConstMethod::isUninitialized() const
{
    return !fRep;
}

Boolean CIMConstMethod::identical(const CIMConstMethod& method) const
{
    const CIMMethodRep& x = fRep.checked();
    const CIMMethodRep& y = method.fRep.checked();
    return &x == &y || (x.fName.equal(y.fName) && x.fType == y.fType && x.fClassOrigin.equal(y.fClassOrigin) &&
                        x.fPropagated == y.fPropagated && ObjectAccess::identical(x.fQualifiers, y.fQualifiers) &&
                        ObjectAccess::identical(x.fParameters, y.fParameters));
}

CIMMethod CIMConstMethod::clone() const
{
    auto* copy = new CIMMethodRep(fRep.checked());
    CIMMethod method = ObjectAccess::wrap<CIMMethod>(copy);
    copy->fQualifiers = ObjectAccess::clone(copy->fQualifiers);
    copy->fParameters = ObjectAccess::clone(copy->fParameters);
    return method;
}

void CIMMethod::setName(const CIMName& name)
{
    fRep.checked().fName = notNull(name);
}

void CIMMethod::setType(CIMType type)
{
    fRep.checked().fType = type;
}

void CIMMethod::setClassOrigin(const CIMName& classOrigin)
{
    fRep.checked().fClassOrigin = classOrigin;
}

void CIMMethod::setPropagated(Boolean propagated)
{
    fRep.checked().fPropagated = propagated;
}

CIMMethod& CIMMethod::addQualifier(const CIMQualifier& qualifier)
{
    ObjectAccess::add(fRep.checked().fQualifiers, qualifier, "qualifier");
    return *this;
}

CIMQualifier CIMMethod::getQualifier(Uint32 index)
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

void CIMMethod::removeQualifier(Uint32 index)
{
    fRep.checked().fQualifiers.remove(index);
}

CIMMethod& CIMMethod::addParameter(const CIMParameter& parameter)
{
    ObjectAccess::add(fRep.checked().fParameters, parameter, "parameter");
    return *this;
}

CIMParameter CIMMethod::getParameter(Uint32 index)
{
    return ObjectAccess::at(fRep.checked().fParameters, index);
}

void CIMMethod::removeParameter(Uint32 index)
{
    fRep.checked().fParameters.remove(index);
}

} // namespace Pegasus
