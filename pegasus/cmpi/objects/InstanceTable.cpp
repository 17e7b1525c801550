// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/InstanceObject.h"

// The functions through which providers use a CMPIInstance.
namespace Pegasus::cmpi {
namespace {

CMPIData getProperty(const CMPIInstance* self, const char* name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] { return objectOf<InstanceObject>(self).property(name); });
}

CMPIData getPropertyAt(const CMPIInstance* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] { return objectOf<InstanceObject>(self).propertyAt(index, name); });
}

CMPICount getPropertyCount(const CMPIInstance* self, CMPIStatus* rc)
{
    return answer(rc, CMPICount{0}, [&] { return objectOf<InstanceObject>(self).propertyCount(); });
}

CMPIStatus setProperty(const CMPIInstance* self, const char* name, const CMPIValue* value, CMPIType type)
{
    return perform([&] { objectOf<InstanceObject>(self).setProperty(name, value, type); });
}

CMPIObjectPath* getObjectPath(const CMPIInstance* self, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIObjectPath*>(nullptr), [&]() -> CMPIObjectPath* {
        const InstanceObject& instance = objectOf<InstanceObject>(self);
        return Frame::current().make<ObjectPathObject>(instance.broker, instance.completePath());
    });
}

// The lists are ignored: the result filters every instance by the request's own list.
CMPIStatus setPropertyFilter(const CMPIInstance* self, const char**, const char**)
{
    return perform([&] { objectOf<InstanceObject>(self); });
}

CMPIStatus setObjectPath(const CMPIInstance* self, const CMPIObjectPath* path)
{
    return perform([&] { objectOf<InstanceObject>(self).setPath(objectOf<ObjectPathObject>(path).state); });
}

CMPIStatus setPropertyWithOrigin(const CMPIInstance* self, const char* name, const CMPIValue* value, CMPIType type,
                                 const char*)
{
    return setProperty(self, name, value, type);
}

} // namespace

const CMPIInstanceFT kInstanceTable{kTableVersion,
                                    releaseObject<InstanceObject, CMPIInstance>,
                                    cloneObject<InstanceObject, CMPIInstance>,
                                    getProperty,
                                    getPropertyAt,
                                    getPropertyCount,
                                    setProperty,
                                    getObjectPath,
                                    setPropertyFilter,
                                    setObjectPath,
                                    setPropertyWithOrigin};

} // namespace Pegasus::cmpi
