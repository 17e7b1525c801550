// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectReps.h"
#include "pegasus/common/StringRep.h"

namespace Pegasus {
namespace {

// Calls `action` with the class or the instance that the object is.
template <typename Object, typename Class, typename Instance, typename Action>
decltype(auto) visitObject(const Object& object, Class& cimClass, Instance& instance, Action&& action)
{
    if (object.isClass()) {
        return action(cimClass);
    }
    return action(instance); // throws when that is not one either
}

} // namespace

CIMConstObject::CIMConstObject(const CIMConstClass& cimClass)
{
    // Only the const members of this object reach the handle.
    static_cast<CIMConstClass&>(fClass) = cimClass;
}

CIMConstObject::CIMConstObject(const CIMConstInstance& cimInstance)
{
    static_cast<CIMConstInstance&>(fInstance) = cimInstance;
}

CIMConstObject::CIMConstObject(const CIMClass& cimClass) : fClass(cimClass) {}
CIMConstObject::CIMConstObject(const CIMInstance& cimInstance) : fInstance(cimInstance) {}

const CIMName& CIMConstObject::getClassName() const
{
    return visitObject(*this, fClass, fInstance, [](auto& x) -> const CIMName& { return x.getClassName(); });
}

const CIMObjectPath& CIMConstObject::getPath() const
{
    return visitObject(*this, fClass, fInstance, [](auto& x) -> const CIMObjectPath& { return x.getPath(); });
}

Uint32 CIMConstObject::findQualifier(const CIMName& name) const
{
    return visitObject(*this, fClass, fInstance, [&](auto& x) { return x.findQualifier(name); });
}

CIMConstQualifier CIMConstObject::getQualifier(Uint32 index) const
{
    return visitObject(*this, fClass, fInstance, [&](auto& x) -> CIMConstQualifier { return x.getQualifier(index); });
}

Uint32 CIMConstObject::getQualifierCount() const
{
    return visitObject(*this, fClass, fInstance, [](auto& x) { return x.getQualifierCount(); });
}

Uint32 CIMConstObject::findProperty(const CIMName& name) const
{
    return visitObject(*this, fClass, fInstance, [&](auto& x) { return x.findProperty(name); });
}

CIMConstProperty CIMConstObject::getProperty(Uint32 index) const
{
    return visitObject(*this, fClass, fInstance, [&](auto& x) -> CIMConstProperty { return x.getProperty(index); });
}

Uint32 CIMConstObject::getPropertyCount() const
{
    return visitObject(*this, fClass, fInstance, [](auto& x) { return x.getPropertyCount(); });
}

Boolean CIMConstObject::isUninitialized() const
{
    return fClass.isUninitialized() && fInstance.isUninitialized();
}

Boolean CIMConstObject::isClass() const
{
    return !fClass.isUninitialized();
}

Boolean CIMConstObject::isInstance() const
{
    return !fInstance.isUninitialized();
}

Boolean CIMConstObject::identical(const CIMConstObject& object) const
{
    if (isUninitialized() || object.isUninitialized()) {
        throw UninitializedObjectException();
    }
    if (isClass() != object.isClass()) {
        return false;
    }
    return isClass() ? fClass.identical(object.fClass) : fInstance.identical(object.fInstance);
}

CIMObject CIMConstObject::clone() const
{
    return visitObject(*this, fClass, fInstance, [](auto& x) { return CIMObject(x.clone()); });
}

void CIMObject::setPath(const CIMObjectPath& path)
{
    visitObject(*this, fClass, fInstance, [&](auto& x) { x.setPath(path); });
}

CIMObject& CIMObject::addQualifier(const CIMQualifier& qualifier)
{
    visitObject(*this, fClass, fInstance, [&](auto& x) { x.addQualifier(qualifier); });
    return *this;
}

CIMQualifier CIMObject::getQualifier(Uint32 index)
{
    return visitObject(*this, fClass, fInstance, [&](auto& x) -> CIMQualifier { return x.getQualifier(index); });
}

void CIMObject::removeQualifier(Uint32 index)
{
    visitObject(*this, fClass, fInstance, [&](auto& x) { x.removeQualifier(index); });
}

CIMObject& CIMObject::addProperty(const CIMProperty& property)
{
    visitObject(*this, fClass, fInstance, [&](auto& x) { x.addProperty(property); });
    return *this;
}

CIMProperty CIMObject::getProperty(Uint32 index)
{
    return visitObject(*this, fClass, fInstance, [&](auto& x) -> CIMProperty { return x.getProperty(index); });
}

void CIMObject::removeProperty(Uint32 index)
{
    visitObject(*this, fClass, fInstance, [&](auto& x) { x.removeProperty(index); });
}

void CIMObject::instanceFilter(Boolean includeQualifiers, Boolean includeClassOrigin,
                               const CIMPropertyList& propertyList)
{
    if (isInstance()) {
        fInstance.instanceFilter(includeQualifiers, includeClassOrigin, propertyList);
    }
}

} // namespace Pegasus
