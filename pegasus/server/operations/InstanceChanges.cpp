// SPDX-License-Identifier: MIT
// The operations that change instances: of classes with a provider through its agent, of registrations through the
// registry, of the others in the repository.
#include "pegasus/server/agent/AgentMessages.h"
#include "pegasus/server/operations/Operations.h"
#include "pegasus/server/operations/ServerInstances.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::server::operations {

namespace {

// Passes the request on if the class has a provider. Returns: whether it has.
bool passToProvider(ServerCore& core, const HttpRequest& http, const CimRequest& request, const CIMName& className,
                    ElementSink& answer)
{
    const auto provider = core.registry.find(request.nameSpace, className, ProviderType::kInstance);
    if (provider) {
        askProvider(core, *provider, passedOn(http, request), answer);
    }
    return provider.has_value();
}

void requireClass(const ServerCore& core, const CIMNamespaceName& nameSpace, const CIMName& className)
{
    requireNamespace(core, nameSpace);
    if (!core.repository.hasClass(nameSpace, className)) {
        throw CIMException(CIM_ERR_INVALID_CLASS, className.getString());
    }
}

} // namespace

void createInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer)
{
    const CIMInstance instance = request.parameters.instance("NewInstance");
    const CIMName& className = instance.getClassName();
    CIMObjectPath path;
    if (isNamespaceClass(className)) {
        path = createNamespace(core, request.nameSpace, instance);
    } else if (ProviderRegistry::isRegistration(request.nameSpace, className)) {
        path = core.registry.registerInstance(instance);
    } else {
        requireNamespace(core, request.nameSpace);
        if (ServerInstances::find(core, request.nameSpace, className)) {
            throw CIMException(CIM_ERR_NOT_SUPPORTED, className.getString());
        }
        if (passToProvider(core, http, request, className, answer)) {
            return;
        }
        path = core.repository.createInstance(request.nameSpace, instance);
    }
    std::string text;
    wire::appendInstanceName(text, path);
    answer.write(text);
}

void modifyInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer)
{
    const CIMInstance modified = request.parameters.namedInstance("ModifiedInstance");
    const CIMPropertyList properties = request.parameters.propertyList();
    const CIMName& className = modified.getClassName();
    requireChangeable(core, request.nameSpace, className);
    requireClass(core, request.nameSpace, className);
    if (!passToProvider(core, http, request, className, answer)) {
        core.repository.modifyInstance(request.nameSpace, modified, properties);
    }
}

void deleteInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer)
{
    const CIMObjectPath path = request.parameters.instanceName("InstanceName");
    const CIMName& className = path.getClassName();
    if (ProviderRegistry::isRegistration(request.nameSpace, className)) {
        core.registry.removeInstance(path);
        return;
    }
    requireChangeable(core, request.nameSpace, className);
    requireClass(core, request.nameSpace, className);
    if (!passToProvider(core, http, request, className, answer)) {
        core.repository.deleteInstance(request.nameSpace, path);
    }
}

} // namespace Pegasus::server::operations
