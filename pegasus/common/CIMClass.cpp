// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectReps.h"

namespace Pegasus {

template class RepPointer<CIMClassRep>;

CIMConstClass::CIMConstClass(const CIMName& className, const CIMName& superClassName) : fRep(new CIMClassRep())
{
    fRep->fPath.setClassName(notNull(className));
    fRep->fSuperClassName = superClassName;
}

CIMConstClass::CIMConstClass(const CIMConstObject& object) : fRep(ObjectAccess::classIn(object).fRep)
{
    if (!fRep) {
        throw DynamicCastFailedException();
    }
}

CIMClass::CIMClass(const CIMObject& object) : CIMConstClass(static_cast<const CIMConstObject&>(object)) {}

Boolean CIMConstClass::isAssociation() const
{
    return ObjectAccess::isTrue(fRep.checked().fQualifiers, "Association");
}

Boolean CIMConstClass::isAbstract() const
{
    return ObjectAccess::isTrue(fRep.checked().fQualifiers, "Abstract");
}

const CIMName& CIMConstClass::getClassName() const
{
    return fRep.checked().fPath.getClassName();
}

const CIMObjectPath& CIMConstClass::getPath() const
{
    return fRep.checked().fPath;
}

const CIMName& CIMConstClass::getSuperClassName() const
{
    return fRep.checked().fSuperClassName;
}

Uint32 CIMConstClass::findQualifier(const CIMName& name) const
{
    return ObjectAccess::find(fRep.checked().fQualifiers, name);
}

CIMConstQualifier CIMConstClass::getQualifier(Uint32 index) const
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

Uint32 CIMConstClass::getQualifierCount() const
{
    return fRep.checked().fQualifiers.size();
}

Uint32 CIMConstClass::findProperty(const CIMName& name) const
{
    return ObjectAccess::find(fRep.checked().fProperties, name);
}

CIMConstProperty CIMConstClass::getProperty(Uint32 index) const
{
    return ObjectAccess::at(fRep.checked().fProperties, index);
}

Uint32 CIMConstClass::getPropertyCount() const
{
    return fRep.checked().fProperties.size();
}

Uint32 CIMConstClass::findMethod(const CIMName& name) const
{
    return ObjectAccess::find(fRep.checked().fMethods, name);
}

CIMConstMethod CIMConstClass::getMethod(Uint32 index) const
{
    return ObjectAccess::at(fRep.checked().fMethods, index);
}

Uint32 CIMConstClass::getMethodCount() const
{
    return fRep.checked().fMethods.size();
}

void CIMConstClass::getKeyNames(Array<CIMName>& keyNames) const
{
    const Array<CIMProperty>& properties = fRep.checked().fProperties;
    for (Uint32 i = 0; i < properties.size(); ++i) {
        if (ObjectAccess::isTrue(ObjectAccess::rep(properties[i]).fQualifiers, "Key")) {
            keyNames.append(properties[i].getName());
        }
    }
}

Boolean CIMConstClass::hasKeys() const
{
    Array<CIMName> keyNames;
    getKeyNames(keyNames);
    return keyNames.size() > 0;
}

CIMInstance CIMConstClass::buildInstance(Boolean includeQualifiers, Boolean includeClassOrigin,
                                         const CIMPropertyList& propertyList) const
{
    const CIMClassRep& rep = fRep.checked();
    CIMInstance instance(getClassName());
    CIMInstanceRep& made = ObjectAccess::rep(instance);
    made.fQualifiers = ObjectAccess::clone(rep.fQualifiers);
    made.fProperties = ObjectAccess::clone(rep.fProperties);
    instance.instanceFilter(includeQualifiers, includeClassOrigin, propertyList);
    return instance;
}

Boolean CIMConstClass::isUninitialized() const
{
    return !fRep;
}

Boolean CIMConstClass::identical(const CIMConstClass& cimClass) const
{
    const CIMClassRep& x = fRep.checked();
    const CIMClassRep& y = cimClass.fRep.checked();
    return &x == &y ||
           (x.fPath.identical(y.fPath) && x.fSuperClassName.equal(y.fSuperClassName) &&
            ObjectAccess::identical(x.fQualifiers, y.fQualifiers) &&
            ObjectAccess::identical(x.fProperties, y.fProperties) && ObjectAccess::identical(x.fMethods, y.fMethods));
}

CIMClass CIMConstClass::clone() const
{
    auto* copy = new CIMClassRep(fRep.checked());
    CIMClass cimClass = ObjectAccess::wrap<CIMClass>(copy);
    copy->fQualifiers = ObjectAccess::clone(copy->fQualifiers);
    copy->fProperties = ObjectAccess::clone(copy->fProperties);
    copy->fMethods = ObjectAccess::clone(copy->fMethods);
    return cimClass;
}

void CIMClass::setPath(const CIMObjectPath& path)
{
    if (!path.getClassName().equal(getClassName())) {
        throw TypeMismatchException();
    }
    fRep->fPath = path;
}

void CIMClass::setSuperClassName(const CIMName& superClassName)
{
    fRep.checked().fSuperClassName = superClassName;
}

CIMClass& CIMClass::addQualifier(const CIMQualifier& qualifier)
{
    ObjectAccess::add(fRep.checked().fQualifiers, qualifier, "qualifier");
    return *this;
}

CIMQualifier CIMClass::getQualifier(Uint32 index)
{
    return ObjectAccess::at(fRep.checked().fQualifiers, index);
}

void CIMClass::removeQualifier(Uint32 index)
{
    fRep.checked().fQualifiers.remove(index);
}

CIMClass& CIMClass::addProperty(const CIMProperty& property)
{
    ObjectAccess::add(fRep.checked().fProperties, property, "property");
    return *this;
}

CIMProperty CIMClass::getProperty(Uint32 index)
{
    return ObjectAccess::at(fRep.checked().fProperties, index);
}

void CIMClass::removeProperty(Uint32 index)
{
    fRep.checked().fProperties.remove(index);
}

CIMClass& CIMClass::addMethod(const CIMMethod& method)
{
    ObjectAccess::add(fRep.checked().fMethods, method, "method");
    return *this;
}

CIMMethod CIMClass::getMethod(Uint32 index)
{
    return ObjectAccess::at(fRep.checked().fMethods, index);
}

void CIMClass::removeMethod(Uint32 index)
{
    fRep.checked().fMethods.remove(index);
}

} // namespace Pegasus
