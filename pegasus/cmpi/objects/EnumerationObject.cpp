// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/EnumerationObject.h"

#include "pegasus/cmpi/objects/ArrayObject.h"

namespace Pegasus::cmpi {
namespace {

CIMObjectPath placed(CIMObjectPath path, const CIMName& className, const CIMNamespaceName& nameSpace)
{
    if (path.getClassName().isNull()) {
        path.setClassName(className);
    }
    path.setNameSpace(nameSpace);
    return path;
}

// Past the end the data has the elements' type, as on OpenPegasus.
CMPIData getNext(const CMPIEnumeration* self, CMPIStatus* rc)
{
    CMPIData end = kNull;
    end.type = answer(nullptr, CMPIType{CMPI_null}, [&] { return objectOf<EnumerationObject>(self).type(); });
    return answer(rc, end, [&] { return objectOf<EnumerationObject>(self).next(); });
}

CMPIBoolean hasNext(const CMPIEnumeration* self, CMPIStatus* rc)
{
    return answer(rc, CMPIBoolean{0}, [&]() -> CMPIBoolean { return objectOf<EnumerationObject>(self).hasNext(); });
}

CMPIArray* toArray(const CMPIEnumeration* self, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIArray*>(nullptr), [&] { return objectOf<EnumerationObject>(self).toArray(); });
}

} // namespace

const CMPIEnumerationFT kEnumerationTable{kTableVersion,
                                          releaseObject<EnumerationObject, CMPIEnumeration>,
                                          cloneObject<EnumerationObject, CMPIEnumeration>,
                                          getNext,
                                          hasNext,
                                          toArray};

EnumerationObject::EnumerationObject(Broker& owner, const Array<CIMInstance>& instances,
                                     const CIMNamespaceName& nameSpace)
    : CMPIEnumeration{nullptr, &kEnumerationTable}, fBroker(owner), fType(CMPI_instance)
{
    hdl = this;
    fElements.reserve(instances.size());
    for (Uint32 i = 0; i < instances.size(); ++i) {
        CIMInstance instance = instances[i];
        instance.setPath(placed(instance.getPath(), instance.getClassName(), nameSpace));
        fElements.emplace_back(instance);
    }
}

EnumerationObject::EnumerationObject(Broker& owner, const Array<CIMObjectPath>& paths,
                                     const CIMNamespaceName& nameSpace)
    : CMPIEnumeration{nullptr, &kEnumerationTable}, fBroker(owner), fType(CMPI_ref)
{
    hdl = this;
    fElements.reserve(paths.size());
    for (Uint32 i = 0; i < paths.size(); ++i) {
        fElements.emplace_back(placed(paths[i], CIMName(), nameSpace));
    }
}

EnumerationObject::EnumerationObject(const EnumerationObject& other)
    : CMPIEnumeration{nullptr, &kEnumerationTable}, fBroker(other.fBroker), fType(other.fType),
      fElements(other.fElements), fNext(other.fNext)
{
    hdl = this;
}

CMPIData EnumerationObject::next()
{
    if (!hasNext()) {
        throw CmpiError{CMPI_RC_NO_MORE_ELEMENTS, {}};
    }
    return encodeValue(fBroker, fElements[fNext++]);
}

CMPIArray* EnumerationObject::toArray() const
{
    return Frame::current().make<ArrayObject>(fBroker, fType, fElements);
}

} // namespace Pegasus::cmpi
