// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentMessages.h"
#include "pegasus/server/operations/InstanceSources.h"
#include "pegasus/server/operations/Operations.h"
#include "pegasus/server/operations/ServerInstances.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::server::operations {

namespace {

void writeNamedInstance(ElementSink& answer, std::string& scratch, const CIMInstance& instance)
{
    scratch.clear();
    wire::appendNamedInstance(scratch, instance);
    answer.write(scratch);
}

// Agents' errors are kept until every class has been asked: the others' instances still arrive.
class FirstError
{
  public:
    template <typename Action> void run(const Action& action)
    {
        try {
            keep(action());
        } catch (const CIMException& error) {
            keep(statusOf(error));
        }
    }

    // Throws the first error, as the status with its text.
    void rethrow() const
    {
        if (fStatus.code != 0) {
            throw OperationFailed(fStatus, CimAnswer::ErrorPlace::kAfterElements);
        }
    }

  private:
    void keep(const CimStatus& status)
    {
        if (fStatus.code == 0) {
            fStatus = status;
        }
    }

    CimStatus fStatus;
};

} // namespace

void getInstance(ServerCore& core, const HttpRequest& http, const CimRequest& request, ElementSink& answer)
{
    requireNamespace(core, request.nameSpace);
    const CIMObjectPath path = request.parameters.instanceName("InstanceName");
    const CIMPropertyList properties = request.parameters.propertyList();
    if (const auto own = ServerInstances::find(core, request.nameSpace, path.getClassName())) {
        std::string text;
        wire::appendInstance(text, own->get(path, properties));
        answer.write(text);
        return;
    }
    if (!core.repository.hasClass(request.nameSpace, path.getClassName())) {
        throw CIMException(CIM_ERR_INVALID_CLASS, path.getClassName().getString());
    }
    if (const auto provider = core.registry.find(request.nameSpace, path.getClassName(), ProviderType::kInstance)) {
        return askProvider(core, *provider, passedOn(http, request), answer);
    }
    repository::InstanceOptions options;
    options.includeClassOrigin = request.parameters.boolean("IncludeClassOrigin", false);
    options.propertyList = properties;
    std::string text;
    wire::appendInstance(text, core.repository.getInstance(request.nameSpace, path, options));
    answer.write(text);
}

void enumerateInstances(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    requireNamespace(core, request.nameSpace);
    const CIMName className = request.parameters.className("ClassName");
    repository::InstanceOptions options;
    options.deepInheritance = request.parameters.boolean("DeepInheritance", true);
    options.includeClassOrigin = request.parameters.boolean("IncludeClassOrigin", false);
    options.propertyList = request.parameters.propertyList();
    std::string text;
    if (const auto own = ServerInstances::find(core, request.nameSpace, className)) {
        for (const CIMInstance& instance : own->all(options.propertyList)) {
            writeNamedInstance(answer, text, instance);
        }
        return;
    }
    const InstanceSources sources(core, request.nameSpace, className);
    FirstError error;
    const CIMPropertyList list = sources.properties(options);
    for (const auto& [name, provider] : sources.provided()) {
        error.run([&, providedClass = name, reference = provider] {
            return core.agents.request(reference, makeEnumerateInstancesRequest(request.nameSpace, providedClass, list),
                                       answer);
        });
    }
    core.repository.enumerateInstances(request.nameSpace, className, options, [&](const CIMInstance& instance) {
        if (!sources.isProvided(instance.getClassName())) {
            writeNamedInstance(answer, text, instance);
        }
        return true;
    });
    error.rethrow();
}

void enumerateInstanceNames(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    requireNamespace(core, request.nameSpace);
    const CIMName className = request.parameters.className("ClassName");
    std::string text;
    if (const auto own = ServerInstances::find(core, request.nameSpace, className)) {
        for (const CIMInstance& instance : own->all(CIMPropertyList())) {
            wire::appendInstanceName(text, instance.getPath());
        }
        if (!text.empty()) {
            answer.write(text);
        }
        return;
    }
    const InstanceSources sources(core, request.nameSpace, className);
    FirstError error;
    for (const auto& [name, provider] : sources.provided()) {
        error.run([&, providedClass = name, reference = provider] {
            return core.agents.request(reference, makeEnumerateInstanceNamesRequest(request.nameSpace, providedClass),
                                       answer);
        });
    }
    for (const CIMObjectPath& path : core.repository.enumerateInstanceNames(request.nameSpace, className)) {
        if (sources.isProvided(path.getClassName())) {
            continue;
        }
        text.clear();
        wire::appendInstanceName(text, path);
        answer.write(text);
    }
    error.rethrow();
}

} // namespace Pegasus::server::operations
