// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectReps.h"

namespace Pegasus {

template class RepPointer<CIMQualifierRep>;
template class RepPointer<CIMQualifierDeclRep>;

// ---- CIMQualifier

CIMConstQualifier::CIMConstQualifier(const CIMName& name, const CIMValue& value, const CIMFlavor& flavor,
                                     Boolean propagated)
    : fRep(new CIMQualifierRep())
{
    fRep->fName = notNull(name);
    fRep->fValue = value;
    fRep->fFlavor = flavor;
    fRep->fPropagated = propagated;
}

const CIMName& CIMConstQualifier::getName() const
{
    return fRep.checked().fName;
}

CIMType CIMConstQualifier::getType() const
{
    return fRep.checked().fValue.getType();
}

Boolean CIMConstQualifier::isArray() const
{
    return fRep.checked().fValue.isArray();
}

const CIMValue& CIMConstQualifier::getValue() const
{
    return fRep.checked().fValue;
}

const CIMFlavor& CIMConstQualifier::getFlavor() const
{
    return fRep.checked().fFlavor;
}

Uint32 CIMConstQualifier::getPropagated() const
{
    return fRep.checked().fPropagated ? 1 : 0;
}

Boolean CIMConstQualifier::isUninitialized() const
{
    return !fRep;
}

Boolean CIMConstQualifier::identical(const CIMConstQualifier& qualifier) const
{
    const CIMQualifierRep& x = fRep.checked();
    const CIMQualifierRep& y = qualifier.fRep.checked();
    return &x == &y || (x.fName.equal(y.fName) && x.fValue == y.fValue && x.fFlavor.equal(y.fFlavor) &&
                        x.fPropagated == y.fPropagated);
}

CIMQualifier CIMConstQualifier::clone() const
{
    return ObjectAccess::wrap<CIMQualifier>(new CIMQualifierRep(fRep.checked()));
}

void CIMQualifier::setName(const CIMName& name)
{
    fRep.checked().fName = notNull(name);
}

void CIMQualifier::setValue(const CIMValue& value)
{
    fRep.checked().fValue = value;
}

void CIMQualifier::setFlavor(const CIMFlavor& flavor)
{
    fRep.checked().fFlavor.addFlavor(flavor);
}

void CIMQualifier::unsetFlavor(const CIMFlavor& flavor)
{
    fRep.checked().fFlavor.removeFlavor(flavor);
}

void CIMQualifier::setPropagated(Boolean propagated)
{
    fRep.checked().fPropagated = propagated;
}

// ---- CIMQualifierDecl

CIMConstQualifierDecl::CIMConstQualifierDecl(const CIMName& name, const CIMValue& value, const CIMScope& scope,
                                             const CIMFlavor& flavor, Uint32 arraySize)
    : fRep(new CIMQualifierDeclRep())
{
    fRep->fName = notNull(name);
    fRep->fValue = value;
    fRep->fScope = scope;
    fRep->fFlavor = flavor;
    fRep->fArraySize = arraySize;
}

const CIMName& CIMConstQualifierDecl::getName() const
{
    return fRep.checked().fName;
}

CIMType CIMConstQualifierDecl::getType() const
{
    return fRep.checked().fValue.getType();
}

Boolean CIMConstQualifierDecl::isArray() const
{
    return fRep.checked().fValue.isArray();
}

const CIMValue& CIMConstQualifierDecl::getValue() const
{
    return fRep.checked().fValue;
}

const CIMScope& CIMConstQualifierDecl::getScope() const
{
    return fRep.checked().fScope;
}

const CIMFlavor& CIMConstQualifierDecl::getFlavor() const
{
    return fRep.checked().fFlavor;
}

Uint32 CIMConstQualifierDecl::getArraySize() const
{
    return fRep.checked().fArraySize;
}

Boolean CIMConstQualifierDecl::isUninitialized() const
{
    return !fRep;
}

Boolean CIMConstQualifierDecl::identical(const CIMConstQualifierDecl& decl) const
{
    const CIMQualifierDeclRep& x = fRep.checked();
    const CIMQualifierDeclRep& y = decl.fRep.checked();
    return &x == &y || (x.fName.equal(y.fName) && x.fValue == y.fValue && x.fScope.equal(y.fScope) &&
                        x.fFlavor.equal(y.fFlavor) && x.fArraySize == y.fArraySize);
}

CIMQualifierDecl CIMConstQualifierDecl::clone() const
{
    return ObjectAccess::wrap<CIMQualifierDecl>(new CIMQualifierDeclRep(fRep.checked()));
}

void CIMQualifierDecl::setName(const CIMName& name)
{
    fRep.checked().fName = notNull(name);
}

void CIMQualifierDecl::setValue(const CIMValue& value)
{
    fRep.checked().fValue = value;
}

} // namespace Pegasus
