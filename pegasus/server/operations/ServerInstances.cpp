// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/ServerInstances.h"

#include "pegasus/server/operations/ConfigService.h"

namespace Pegasus::server {

namespace {

// Keeps only the properties that the list names.
void cutDown(CIMInstance& instance, const CIMPropertyList& properties)
{
    if (properties.isNull()) {
        return;
    }
    for (Uint32 i = instance.getPropertyCount(); i-- > 0;) {
        if (!properties.contains(instance.getProperty(i).getName())) {
            instance.removeProperty(i);
        }
    }
}

} // namespace

std::unique_ptr<ServerInstances> ServerInstances::find(ServerCore& core, const CIMNamespaceName& nameSpace,
                                                       const CIMName& className)
{
    if (auto namespaces = makeNamespaceInstances(core, nameSpace, className)) {
        return namespaces;
    }
    if (isConfigClass(nameSpace, className)) {
        if (!core.repository.hasClass(nameSpace, className)) {
            throw CIMException(CIM_ERR_NOT_FOUND, className.getString());
        }
        return makeConfigInstances(core);
    }
    return nullptr;
}

std::vector<CIMInstance> ServerInstances::all(const CIMPropertyList& properties) const
{
    std::vector<CIMInstance> instances = make();
    for (CIMInstance& instance : instances) {
        cutDown(instance, properties);
    }
    return instances;
}

CIMInstance ServerInstances::get(const CIMObjectPath& path, const CIMPropertyList& properties) const
{
    CIMObjectPath wanted = path;
    wanted.setHost(String());
    wanted.setNameSpace(CIMNamespaceName());
    for (CIMInstance& instance : make()) {
        if (instance.getPath() == wanted) {
            cutDown(instance, properties);
            return instance;
        }
    }
    throw CIMException(CIM_ERR_NOT_FOUND, path.toString());
}

void requireChangeable(ServerCore& core, const CIMNamespaceName& nameSpace, const CIMName& className)
{
    if (ProviderRegistry::isRegistration(nameSpace, className)) {
        throw CIMException(CIM_ERR_NOT_SUPPORTED,
                           className.getString() + String(": a registration is created and deleted, not changed"));
    }
    if (ServerInstances::find(core, nameSpace, className)) {
        throw CIMException(CIM_ERR_NOT_SUPPORTED, className.getString());
    }
}

} // namespace Pegasus::server
