// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectReps.h"

namespace Pegasus {

template class RepPointer<CIMPropertyRep>;

namespace {

void checkShape(const CIMValue& value, Uint32 arraySize, const CIMName& referenceClassName)
{
    const bool isReference = value.getType() == CIMTYPE_REFERENCE;
    if ((arraySize != 0 && !value.isArray()) || (!referenceClassName.isNull() && !isReference) ||
        (isReference && value.isArray()))
    {
        throw TypeMismatchException();
    }
}

} // namespace

CIMConstProperty::CIMConstProperty(const CIMName& name, const CIMValue& value, Uint32 arraySize,
                                   const CIMName& referenceClassName, const CIMName& classOrigin, Boolean propagated)
    : fRep(new CIMPropertyRep())
{
    checkShape(value, arraySize, referenceClassName);
    fRep->fName = notNull(name);
    fRep->fValue = value;
    fRep->fArraySize = arraySize;
    fRep->fReferenceClassName = referenceClassName;
    fRep->fClassOrigin = classOrigin;
    fRep->fPropagated = propagated;
}

const CIMName& CIMConstProperty::getName() const
{
    return fRep.checked().fName;
}

const CIMValue& CIMConstProperty::getValue() const
{
    return fRep.checked().fValue;
}

CIMType CIMConstProperty::getType() const
{
    return fRep.checked().fValue.getType();
}

Boolean CIMConstProperty::isArray() const
{
    return fRep.checked().fValue.isArray();
}

Uint32 CIMConstProperty::getArraySize() const
{
    return fRep.checked().fArraySize;
}

const CIMName& CIMConstProperty::getReferenceClassName() const
{
    return fRep.checked().fReferenceClassName;
}

const CIMName& CIMConstProperty::getClassOrigin() const
{
    return fRep.checked().fClassOrigin;
}

Boolean CIMConstProperty::getPropagated() const
{
    return fRep.checked().fPropagated;
}

Uint32 CIMConstProperty::findQualifier(const CIMName& name) const
{
    return ObjectAccess::find(fRep.checked().fQualifiers, name);
}

CIMConstQualifier CIMConstProperty::getQualifier(Uint32 index) const
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

Uint32 CIMConstProperty::getQualifierCount() const
{
    return fRep.checked().fQualifiers.size();
}

Boolean CIMConstProperty::isUninitialized() const
{
    return !fRep;
}

Boolean CIMConstProperty::identical(const CIMConstProperty& property) const
{
    const CIMPropertyRep& x = fRep.checked();
    const CIMPropertyRep& y = property.fRep.checked();
    return &x == &y || (x.fName.equal(y.fName) && x.fValue == y.fValue && x.fArraySize == y.fArraySize &&
                        x.fReferenceClassName.equal(y.fReferenceClassName) && x.fClassOrigin.equal(y.fClassOrigin) &&
                        x.fPropagated == y.fPropagated && ObjectAccess::identical(x.fQualifiers, y.fQualifiers));
}

CIMProperty CIMConstProperty::clone() const
{
    auto* copy = new CIMPropertyRep(fRep.checked());
    CIMProperty property = ObjectAccess::wrap<CIMProperty>(copy);
    copy->fQualifiers = ObjectAccess::clone(copy->fQualifiers);
    return property;
}

void CIMProperty::setName(const CIMName& name)
{
    fRep.checked().fName = notNull(name);
}

void CIMProperty::setValue(const CIMValue& value)
{
    if (!fRep.checked().fValue.typeCompatible(value)) {
        throw TypeMismatchException();
    }
    fRep->fValue = value;
}

void CIMProperty::setClassOrigin(const CIMName& classOrigin)
{
    fRep.checked().fClassOrigin = classOrigin;
}

void CIMProperty::setPropagated(Boolean propagated)
{
    fRep.checked().fPropagated = propagated;
}

CIMProperty& CIMProperty::addQualifier(const CIMQualifier& qualifier)
{
    ObjectAccess::add(fRep.checked().fQualifiers, qualifier, "qualifier");
    return *this;
}

CIMQualifier CIMProperty::getQualifier(Uint32 index)
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

void CIMProperty::removeQualifier(Uint32 index)
{
    fRep.checked().fQualifiers.remove(index);
}

} // namespace Pegasus
