// SPDX-License-Identifier: MIT
// One property of an instance: GetProperty and SetProperty, by means of the whole instance.
#include "pegasus/server/agent/AgentMessages.h"
#include "pegasus/server/operations/Operations.h"
#include "pegasus/server/operations/ServerInstances.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::server::operations {

namespace {

// Keeps a provider's answer, which is one INSTANCE element.
class KeptAnswer : public ElementSink
{
  public:
    void write(std::string_view elements) override { fText += elements; }

    // Throws: CIM_ERR_FAILED for a malformed instance.
    CIMInstance instance()
    {
        try {
            wire::XmlDocument document;
            return wire::ElementDecoder().decodeInstance(document.parseFragment(fText));
        } catch (const wire::XmlError& error) {
            throw CIMException(CIM_ERR_FAILED, error.getMessage());
        }
    }

  private:
    std::string fText;
};

// What both operations name.
struct Target
{
    CIMObjectPath path;
    CIMName name;
    CIMConstProperty declaration;
    CIMPropertyList list; // the property alone
};

// Throws: CIM_ERR_INVALID_NAMESPACE, CIM_ERR_INVALID_CLASS, CIM_ERR_NO_SUCH_PROPERTY.
Target targetOf(const ServerCore& core, const CimRequest& request)
{
    Target target;
    target.path = request.parameters.instanceName("InstanceName");
    target.name = request.parameters.name("PropertyName");
    Array<CIMName> names;
    names.append(target.name);
    target.list = CIMPropertyList(names);
    requireNamespace(core, request.nameSpace);
    const CIMName& className = target.path.getClassName();
    if (!core.repository.hasClass(request.nameSpace, className)) {
        throw CIMException(CIM_ERR_INVALID_CLASS, className.getString());
    }
    repository::ClassOptions options;
    options.localOnly = false;
    options.includeQualifiers = false;
    const CIMConstClass itsClass = core.repository.getClass(request.nameSpace, className, options);
    const Uint32 index = itsClass.findProperty(target.name);
    if (index == PEG_NOT_FOUND) {
        throw CIMException(CIM_ERR_NO_SUCH_PROPERTY, target.name.getString());
    }
    target.declaration = itsClass.getProperty(index);
    return target;
}

CIMInstance instanceWith(ServerCore& core, const CIMNamespaceName& nameSpace, const Target& target)
{
    const CIMName& className = target.path.getClassName();
    if (const auto own = ServerInstances::find(core, nameSpace, className)) {
        return own->get(target.path, target.list);
    }
    if (const auto provider = core.registry.find(nameSpace, className, ProviderType::kInstance)) {
        KeptAnswer kept;
        askProvider(core, *provider, makeGetInstanceRequest(nameSpace, target.path, target.list), kept);
        return kept.instance();
    }
    repository::InstanceOptions options;
    options.propertyList = target.list;
    return core.repository.getInstance(nameSpace, target.path, options);
}

} // namespace

void getProperty(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    const Target target = targetOf(core, request);
    const CIMInstance instance = instanceWith(core, request.nameSpace, target);
    const Uint32 index = instance.findProperty(target.name);
    std::string text;
    if (index != PEG_NOT_FOUND) {
        wire::appendValue(text, instance.getProperty(index).getValue());
    }
    if (!text.empty()) {
        answer.write(text);
    }
}

void setProperty(ServerCore& core, const CimRequest& request, ElementSink&)
{
    const Target target = targetOf(core, request);
    const CIMConstProperty& declared = target.declaration;
    CIMInstance modified(target.path.getClassName());
    modified.setPath(target.path);
    modified.addProperty(CIMProperty(declared.getName(),
                                     request.parameters.value("NewValue", declared.getType(), declared.isArray()),
                                     declared.getArraySize(), declared.getReferenceClassName()));
    requireChangeable(core, request.nameSpace, target.path.getClassName());
    if (const auto provider =
            core.registry.find(request.nameSpace, target.path.getClassName(), ProviderType::kInstance))
    {
        KeptAnswer nothing;
        askProvider(core, *provider, makeModifyInstanceRequest(request.nameSpace, modified, target.list), nothing);
        return;
    }
    core.repository.modifyInstance(request.nameSpace, modified, target.list);
}

} // namespace Pegasus::server::operations
