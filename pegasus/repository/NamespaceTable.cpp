// SPDX-License-Identifier: MIT
#include "pegasus/repository/NamespaceTable.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/LookupKey.h"

namespace Pegasus::repository {

NamespaceTable::NamespaceTable(Storage& storage, std::size_t maxCount) : fStorage(storage), fMaxCount(maxCount)
{
    for (const auto& [number, name] : fStorage.namespaces()) {
        fIds[base::foldCase(name)] = number;
        fNames[number] = CIMNamespaceName(name.c_str());
    }
    const CIMNamespaceName root("root");
    if (!has(root)) {
        create(root);
    }
}

NamespaceId NamespaceTable::id(const CIMNamespaceName& name) const
{
    const auto found = fIds.find(nameKey(name));
    if (found == fIds.end()) {
        fail(CIM_ERR_INVALID_NAMESPACE, base::utf8(name.getString()));
    }
    return found->second;
}

bool NamespaceTable::has(const CIMNamespaceName& name) const
{
    return fIds.count(nameKey(name)) != 0;
}

std::vector<CIMNamespaceName> NamespaceTable::list() const
{
    std::vector<CIMNamespaceName> names;
    for (const auto& [number, name] : fNames) {
        names.push_back(name);
    }
    return names;
}

void NamespaceTable::create(const CIMNamespaceName& name)
{
    if (has(name)) {
        fail(CIM_ERR_ALREADY_EXISTS, base::utf8(name.getString()));
    }
    if (fIds.size() >= fMaxCount) {
        fail(CIM_ERR_SERVER_LIMITS_EXCEEDED,
             "more namespaces than the limit namespaceCount (" + std::to_string(fMaxCount) + ")");
    }
    const NamespaceId number = fStorage.insertNamespace(base::utf8(name.getString()));
    fIds[nameKey(name)] = number;
    fNames[number] = name;
}

} // namespace Pegasus::repository
