// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ArgsObject.h"

namespace Pegasus::cmpi {
namespace {

CMPIStatus addArg(const CMPIArgs* self, const char* name, const CMPIValue* value, CMPIType type)
{
    return perform([&] { objectOf<ArgsObject>(self).values.set(name, value, type); });
}

CMPIData getArg(const CMPIArgs* self, const char* name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] {
        ArgsObject& args = objectOf<ArgsObject>(self);
        return args.values.get(args.broker, name);
    });
}

CMPIData getArgAt(const CMPIArgs* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] {
        ArgsObject& args = objectOf<ArgsObject>(self);
        return args.values.getAt(args.broker, index, name);
    });
}

CMPICount getArgCount(const CMPIArgs* self, CMPIStatus* rc)
{
    return answer(rc, CMPICount{0},
                  [&] { return static_cast<CMPICount>(objectOf<ArgsObject>(self).values.all().size()); });
}

CIMValue placed(const CIMValue& value, const CIMNamespaceName& nameSpace)
{
    if (value.getType() != CIMTYPE_REFERENCE || value.isArray() || value.isNull()) {
        return value;
    }
    CIMObjectPath path;
    value.get(path);
    if (path.getNameSpace().isNull()) {
        path.setNameSpace(nameSpace);
    }
    return CIMValue(path);
}

} // namespace

const CMPIArgsFT kArgsTable{
    kTableVersion, releaseObject<ArgsObject, CMPIArgs>, cloneObject<ArgsObject, CMPIArgs>, addArg, getArg, getArgAt,
    getArgCount};

ArgsObject::ArgsObject(Broker& owner) : CMPIArgs{nullptr, &kArgsTable}, broker(owner)
{
    hdl = this;
}

ArgsObject::ArgsObject(Broker& owner, const Array<CIMParamValue>& parameters, const CIMNamespaceName& nameSpace)
    : ArgsObject(owner)
{
    for (Uint32 i = 0; i < parameters.size(); ++i) {
        values.append(CIMName(parameters[i].getParameterName()), placed(parameters[i].getValue(), nameSpace));
    }
}

Array<CIMParamValue> ArgsObject::parameters() const
{
    Array<CIMParamValue> result;
    for (const NamedValue& held : values.all()) {
        result.append(CIMParamValue(held.name.getString(), held.value, true));
    }
    return result;
}

} // namespace Pegasus::cmpi
