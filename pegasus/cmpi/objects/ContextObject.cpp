// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ContextObject.h"

#include "pegasus/base/Text.h"

namespace Pegasus::cmpi {
namespace {

CMPIData getEntry(const CMPIContext* self, const char* name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] {
        ContextObject& context = objectOf<ContextObject>(self);
        return context.values.get(context.broker, name);
    });
}

CMPIData getEntryAt(const CMPIContext* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] {
        ContextObject& context = objectOf<ContextObject>(self);
        return context.values.getAt(context.broker, index, name);
    });
}

CMPICount getEntryCount(const CMPIContext* self, CMPIStatus* rc)
{
    return answer(rc, CMPICount{0},
                  [&] { return static_cast<CMPICount>(objectOf<ContextObject>(self).values.all().size()); });
}

CMPIStatus addEntry(const CMPIContext* self, const char* name, const CMPIValue* value, CMPIType type)
{
    return perform([&] { objectOf<ContextObject>(self).values.set(name, value, type); });
}

} // namespace

const CMPIContextFT kContextTable{kTableVersion,
                                  releaseObject<ContextObject, CMPIContext>,
                                  cloneObject<ContextObject, CMPIContext>,
                                  getEntry,
                                  getEntryAt,
                                  getEntryCount,
                                  addEntry};

ContextObject::ContextObject(Broker& owner) : CMPIContext{nullptr, &kContextTable}, broker(owner)
{
    hdl = this;
}

ContextObject::ContextObject(Broker& owner, const ProviderRequest& request, unsigned depth) : ContextObject(owner)
{
    const Uint32 flags = (request.includeQualifiers ? CMPI_FLAG_IncludeQualifiers : 0U) |
                         (request.includeClassOrigin ? CMPI_FLAG_IncludeClassOrigin : 0U);
    static const CIMName kFlags(CMPIInvocationFlags);
    static const CIMName kPrincipal(CMPIPrincipal);
    static const CIMName kLanguage(CMPIAcceptLanguage);
    static const CIMName kNamespace(CMPIInitNameSpace);
    static const CIMName kRole(CMPIRole);
    values.reserve(5);
    values.append(kFlags, CIMValue(flags));
    values.append(kPrincipal, CIMValue(request.principal));
    values.append(kLanguage, CIMValue(request.acceptLanguages));
    values.append(kNamespace, CIMValue(request.nameSpace.getString()));
    values.append(kRole, CIMValue(String())); // this server has no roles
    origin = std::make_shared<const CallOrigin>(CallOrigin{&owner, request.provider, request.nameSpace, depth});
}

std::string ContextObject::text(const char* name) const
{
    const CIMValue* found = values.find(name);
    String result;
    if (found != nullptr && found->getType() == CIMTYPE_STRING && !found->isArray()) {
        found->get(result);
    }
    return base::utf8(result);
}

} // namespace Pegasus::cmpi
