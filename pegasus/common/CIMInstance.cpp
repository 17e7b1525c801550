// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectReps.h"

#include <array>
#include <cstdint>
#include <mutex>

namespace Pegasus {

template class RepPointer<CIMInstanceRep>;

// An instance lacks a property that was needed.
class PEGASUS_COMMON_LINKAGE NoSuchProperty : public Exception
{
  public:
    NoSuchProperty(const String& name) : Exception("no such property: " + name) {}
};

namespace {

void dropQualifiersAndOrigins(CIMProperty property, Boolean includeQualifiers, Boolean includeClassOrigin)
{
    while (!includeQualifiers && property.getQualifierCount() > 0) {
        property.removeQualifier(property.getQualifierCount() - 1);
    }
    if (!includeClassOrigin) {
        property.setClassOrigin(CIMName());
    }
}

// A lock is shared by many instances: each is unpacked once, and few at the same time.
std::mutex& unpackingLock(const CIMInstanceRep& rep)
{
    static std::array<std::mutex, 16> fgLocks;
    return fgLocks[reinterpret_cast<std::uintptr_t>(&rep) / sizeof(CIMInstanceRep) % fgLocks.size()];
}

void unpack(CIMInstanceRep& rep)
{
    const std::lock_guard<std::mutex> lock(unpackingLock(rep));
    const PackedInstance* const packed = rep.fPacked.load(std::memory_order_relaxed);
    if (packed == nullptr) {
        return; // another thread has done it meanwhile
    }
    CIMObjectPath path;
    Array<CIMProperty> properties;
    packed->unpack(path, properties);
    rep.fPath = path;
    rep.fProperties.swap(properties);
    rep.fPacked.store(nullptr, std::memory_order_release);
    delete packed;
}

} // namespace

CIMInstanceRep& CIMConstInstance::unpacked() const
{
    CIMInstanceRep& rep = fRep.checked();
    if (rep.fPacked.load(std::memory_order_acquire) != nullptr) {
        unpack(rep);
    }
    return rep;
}

CIMConstInstance::CIMConstInstance(const CIMName& className) : fRep(new CIMInstanceRep())
{
    fRep->fPath.setClassName(notNull(className));
}

CIMConstInstance::CIMConstInstance(const CIMConstObject& object) : fRep(ObjectAccess::instanceIn(object).fRep)
{
    if (!fRep) {
        throw DynamicCastFailedException();
    }
}

CIMInstance::CIMInstance(const CIMObject& object) : CIMConstInstance(static_cast<const CIMConstObject&>(object)) {}

const CIMName& CIMConstInstance::getClassName() const
{
    return unpacked().fPath.getClassName();
}

const CIMObjectPath& CIMConstInstance::getPath() const
{
    return unpacked().fPath;
}

Uint32 CIMConstInstance::findQualifier(const CIMName& name) const
{
    return ObjectAccess::find(unpacked().fQualifiers, name);
}

CIMConstQualifier CIMConstInstance::getQualifier(Uint32 index) const
{
    return ObjectAccess::at(unpacked().fQualifiers, index);
}

Uint32 CIMConstInstance::getQualifierCount() const
{
    return unpacked().fQualifiers.size();
}

Uint32 CIMConstInstance::findProperty(const CIMName& name) const
{
    return ObjectAccess::find(unpacked().fProperties, name);
}

CIMConstProperty CIMConstInstance::getProperty(Uint32 index) const
{
    return ObjectAccess::at(unpacked().fProperties, index);
}

Uint32 CIMConstInstance::getPropertyCount() const
{
    return unpacked().fProperties.size();
}

CIMObjectPath CIMConstInstance::buildPath(const CIMConstClass& cimClass) const
{
    Array<CIMName> keyNames;
    cimClass.getKeyNames(keyNames);
    Array<CIMKeyBinding> keys;
    for (Uint32 i = 0; i < keyNames.size(); ++i) {
        const Uint32 index = findProperty(keyNames[i]);
        if (index == PEG_NOT_FOUND) {
            throw NoSuchProperty(keyNames[i].getString());
        }
        keys.append(CIMKeyBinding(keyNames[i], unpacked().fProperties[index].getValue()));
    }
    return CIMObjectPath(String(), CIMNamespaceName(), getClassName(), keys);
}

Boolean CIMConstInstance::isUninitialized() const
{
    return !fRep;
}

Boolean CIMConstInstance::identical(const CIMConstInstance& instance) const
{
    const CIMInstanceRep& x = unpacked();
    const CIMInstanceRep& y = instance.unpacked();
    return &x == &y || (x.fPath.identical(y.fPath) && ObjectAccess::identical(x.fQualifiers, y.fQualifiers) &&
                        ObjectAccess::identical(x.fProperties, y.fProperties));
}

CIMInstance CIMConstInstance::clone() const
{
    auto* copy = new CIMInstanceRep(unpacked());
    CIMInstance instance = ObjectAccess::wrap<CIMInstance>(copy);
    copy->fQualifiers = ObjectAccess::clone(copy->fQualifiers);
    copy->fProperties = ObjectAccess::clone(copy->fProperties);
    return instance;
}

void CIMInstance::setPath(const CIMObjectPath& path)
{
    if (!path.getClassName().equal(getClassName())) {
        throw TypeMismatchException();
    }
    unpacked().fPath = path;
}

CIMInstance& CIMInstance::addQualifier(const CIMQualifier& qualifier)
{
    ObjectAccess::add(unpacked().fQualifiers, qualifier, "qualifier");
    return *this;
}

CIMQualifier CIMInstance::getQualifier(Uint32 index)
{
    return ObjectAccess::at(unpacked().fQualifiers, index);
}

void CIMInstance::removeQualifier(Uint32 index)
{
    unpacked().fQualifiers.remove(index);
}

CIMInstance& CIMInstance::addProperty(const CIMProperty& property)
{
    ObjectAccess::add(unpacked().fProperties, property, "property");
    return *this;
}

CIMProperty CIMInstance::getProperty(Uint32 index)
{
    return ObjectAccess::at(unpacked().fProperties, index);
}

void CIMInstance::removeProperty(Uint32 index)
{
    unpacked().fProperties.remove(index);
}

void CIMInstance::instanceFilter(Boolean includeQualifiers, Boolean includeClassOrigin,
                                 const CIMPropertyList& propertyList)
{
    CIMInstanceRep& rep = unpacked();
    if (!includeQualifiers) {
        rep.fQualifiers.clear();
    }
    Array<CIMProperty> kept;
    for (Uint32 i = 0; i < rep.fProperties.size(); ++i) {
        const CIMProperty& property = rep.fProperties[i];
        if (!propertyList.isNull() && !propertyList.contains(property.getName())) {
            continue;
        }
        dropQualifiersAndOrigins(property, includeQualifiers, includeClassOrigin);
        kept.append(property);
    }
    rep.fProperties.swap(kept);
}

} // namespace Pegasus
