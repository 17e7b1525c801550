// SPDX-License-Identifier: MIT
#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/server/operations/RegistrationChecks.h"
#include "pegasus/server/operations/ServerInstances.h"

#include <array>

#include <unistd.h>

namespace Pegasus::server {

namespace {

const char* const kRelativeClass = "__Namespace";
const char* const kModelClass = "CIM_Namespace";

CIMProperty textProperty(const char* name, const std::string& value)
{
    return CIMProperty(CIMName(name), CIMValue(String(value.c_str())));
}

// Returns: an instance whose properties so far are its keys.
CIMInstance keyedInstance(const char* className, std::initializer_list<std::pair<const char*, std::string>> keys)
{
    CIMInstance instance((CIMName(className)));
    Array<CIMKeyBinding> bindings;
    for (const auto& [name, value] : keys) {
        instance.addProperty(textProperty(name, value));
        bindings.append(CIMKeyBinding(CIMName(name), String(value.c_str()), CIMKeyBinding::STRING));
    }
    instance.setPath(CIMObjectPath(String(), CIMNamespaceName(), CIMName(className), bindings));
    return instance;
}

// Those below `fAbove`, by their names from there on.
class RelativeNamespaces : public ServerInstances
{
  public:
    RelativeNamespaces(ServerCore& core, const CIMNamespaceName& above) : fCore(core), fAbove(above) {}

  private:
    std::vector<CIMInstance> make() const override
    {
        const std::string prefix = base::utf8(fAbove) + "/";
        std::vector<CIMInstance> instances;
        for (const CIMNamespaceName& nameSpace : fCore.repository.namespaces()) {
            const std::string name = base::utf8(nameSpace);
            if (name.size() > prefix.size() && base::startsWithNoCase(name, prefix)) {
                instances.push_back(keyedInstance(kRelativeClass, {{"Name", name.substr(prefix.size())}}));
            }
        }
        return instances;
    }

    ServerCore& fCore;
    CIMNamespaceName fAbove;
};

class AllNamespaces : public ServerInstances
{
  public:
    explicit AllNamespaces(ServerCore& core) : fCore(core) {}

  private:
    std::vector<CIMInstance> make() const override
    {
        std::array<char, 256> host = {};
        ::gethostname(host.data(), host.size() - 1);
        std::vector<CIMInstance> instances;
        for (const CIMNamespaceName& nameSpace : fCore.repository.namespaces()) {
            CIMInstance instance = keyedInstance(kModelClass, {{"SystemCreationClassName", "CIM_ComputerSystem"},
                                                               {"SystemName", host.data()},
                                                               {"ObjectManagerCreationClassName", "CIM_ObjectManager"},
                                                               {"ObjectManagerName", "cimserver"},
                                                               {"CreationClassName", kModelClass},
                                                               {"Name", base::utf8(nameSpace)}});
            instance.addProperty(CIMProperty(CIMName("ClassInfo"), CIMValue(Uint16(0)))); // unknown
            instances.push_back(instance);
        }
        return instances;
    }

    ServerCore& fCore;
};

} // namespace

bool isNamespaceClass(const CIMName& className)
{
    return className == CIMName(kRelativeClass);
}

std::unique_ptr<ServerInstances> makeNamespaceInstances(ServerCore& core, const CIMNamespaceName& nameSpace,
                                                        const CIMName& className)
{
    if (isNamespaceClass(className)) {
        return std::make_unique<RelativeNamespaces>(core, nameSpace);
    }
    const bool isModel = className == CIMName(kModelClass) && nameSpace == CIMNamespaceName(kInteropNamespace);
    if (isModel && core.repository.hasClass(nameSpace, className)) {
        return std::make_unique<AllNamespaces>(core);
    }
    return nullptr;
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
    return keyedInstance(kRelativeClass, {{"Name", name}}).getPath();
}

} // namespace Pegasus::server
