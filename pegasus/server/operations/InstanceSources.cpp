// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/InstanceSources.h"

#include <algorithm>

namespace Pegasus::server {

InstanceSources::InstanceSources(const ServerCore& core, const CIMNamespaceName& nameSpace, const CIMName& className)
    : fCore(core), fNameSpace(nameSpace), fClassName(className)
{
    if (!core.repository.hasClass(nameSpace, className)) {
        throw CIMException(CIM_ERR_INVALID_CLASS, className.getString());
    }
    std::vector<CIMName> names = core.repository.enumerateClassNames(nameSpace, className, true);
    names.insert(names.begin(), className);
    for (const CIMName& name : names) {
        if (auto provider = core.registry.find(nameSpace, name, ProviderType::kInstance)) {
            fProvided.emplace_back(name, std::move(*provider));
        }
    }
}

bool InstanceSources::isProvided(const CIMName& className) const
{
    return std::any_of(fProvided.begin(), fProvided.end(),
                       [&](const auto& provided) { return provided.first == className; });
}

CIMPropertyList InstanceSources::properties(const repository::InstanceOptions& options) const
{
    if (options.deepInheritance) {
        return options.propertyList;
    }
    repository::ClassOptions classOptions;
    classOptions.localOnly = false;
    classOptions.includeQualifiers = false;
    classOptions.propertyList = options.propertyList;
    const CIMConstClass named = fCore.repository.getClass(fNameSpace, fClassName, classOptions);
    Array<CIMName> names;
    for (Uint32 i = 0; i < named.getPropertyCount(); ++i) {
        names.append(named.getProperty(i).getName());
    }
    return CIMPropertyList(names);
}

} // namespace Pegasus::server
