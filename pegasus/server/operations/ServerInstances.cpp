#include "pegasus/server/operations/ServerInstances.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/server/operations/ConfigService.h"
#include "pegasus/server/operations/RegistrationChecks.h"

namespace Pegasus::server {

namespace {

const char* const kNamespaceClass = "__Namespace";

CIMObjectPath namespacePath(const std::string& name)
{
    Array<CIMKeyBinding> keys;
    keys.append(CIMKeyBinding(CIMName("Name"), String(name.c_str()), CIMKeyBinding::STRING));
    return CIMObjectPath(String(), CIMNamespaceName(), CIMName(kNamespaceClass), keys);
}

class NamespaceInstances : public ServerInstances
{
  public:
    NamespaceInstances(ServerCore& core, const CIMNamespaceName& above) : fCore(core), fAbove(above) {}

  private:
    // Those below `fAbove`, by their names from there on.
    std::vector<CIMInstance> make() const override
    {
        const std::string prefix = base::utf8(fAbove) + "/";
        std::vector<CIMInstance> instances;
        for (const CIMNamespaceName& nameSpace : fCore.repository.namespaces()) {
            const std::string name = base::utf8(nameSpace);
            if (name.size() <= prefix.size() || !base::startsWithNoCase(name, prefix)) {
                continue;
            }
            const std::string below = name.substr(prefix.size());
            CIMInstance instance((CIMName(kNamespaceClass)));
            instance.addProperty(CIMProperty(CIMName("Name"), CIMValue(String(below.c_str()))));
            instance.setPath(namespacePath(below));
            instances.push_back(instance);
        }
        return instances;
    }

    ServerCore& fCore;
    CIMNamespaceName fAbove;
};

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

bool isNamespaceClass(const CIMName& className)
{
    return className == CIMName(kNamespaceClass);
}

std::unique_ptr<ServerInstances> ServerInstances::find(ServerCore& core, const CIMNamespaceName& nameSpace,
                                                       const CIMName& className)
{
    if (isNamespaceClass(className)) {
        return std::make_unique<NamespaceInstances>(core, nameSpace);
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
    if (ProviderRegistry::isRegistration(nameSpace, className) || ServerInstances::find(core, nameSpace, className)) {
        throw CIMException(CIM_ERR_NOT_SUPPORTED, className.getString());
    }
}

CIMObjectPath createNamespace(ServerCore& core, const CIMNamespaceName& nameSpace, const CIMInstance& instance)
{
    std::string name = base::utf8(nameSpace);
    const std::string below = stringProperty(instance, "Name");
    if (!below.empty()) {
        name += "/" + below;
    }
    if (!CIMNamespaceName::legal(String(name.c_str()))) {
        throw CIMException(CIM_ERR_INVALID_PARAMETER, String(("invalid CIM namespace name: " + name).c_str()));
    }
    core.repository.createNamespace(CIMNamespaceName(String(name.c_str())));
    return namespacePath(name);
}

} // namespace Pegasus::server
