// SPDX-License-Identifier: MIT
#include "pegasus/repository/InstanceStore.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/InstanceRules.h"
#include "pegasus/repository/LookupKey.h"

namespace Pegasus::repository {

namespace {

// A batch spreads the cost of a query over many instances; both bounds keep its memory small.
constexpr std::size_t kBatchSize = 64;
constexpr std::size_t kBatchBytes = 1u << 20;

CIMObjectPath withoutNamespace(CIMObjectPath path)
{
    path.setHost(String());
    path.setNameSpace(CIMNamespaceName());
    return path;
}

} // namespace

void InstanceStore::insert(NamespaceId nameSpace, const CIMObjectPath& path, const std::string& text)
{
    const std::string key = pathKey(path);
    if (fStorage.findInstance(nameSpace, key)) {
        fail(CIM_ERR_ALREADY_EXISTS, base::utf8(path.toString()));
    }
    fStorage.insertInstance(nameSpace, base::utf8(path.getClassName()), key, text);
}

CIMInstance InstanceStore::get(NamespaceId nameSpace, const CIMObjectPath& path, const InstanceOptions& options)
{
    const CIMInstance instance = withPath(nameSpace, find(nameSpace, path).body);
    const bool isWhole = options.propertyList.isNull();
    return filteredInstance(instance, isWhole ? CIMClass() : classOf(nameSpace, path.getClassName()), options);
}

void InstanceStore::modify(NamespaceId nameSpace, const CIMConstInstance& modified, const CIMPropertyList& list)
{
    const InstanceRow row = find(nameSpace, modified.getPath());
    const CIMClass itsClass = classOf(nameSpace, modified.getPath().getClassName());
    const CIMInstance merged = mergedInstance(fCodec.decodeInstance(row.body), modified, itsClass, list);
    if (pathKey(instancePath(merged, itsClass)) != pathKey(modified.getPath())) {
        fail(CIM_ERR_INVALID_PARAMETER, "a key property cannot change");
    }
    fStorage.updateInstance(row.sequence, fCodec.encodeInstance(merged));
}

void InstanceStore::remove(NamespaceId nameSpace, const CIMObjectPath& path)
{
    fStorage.deleteInstance(find(nameSpace, path).sequence);
}

std::vector<CIMInstance> InstanceStore::nextBatch(NamespaceId nameSpace, const CIMName& className,
                                                  const InstanceOptions& options, std::int64_t& after)
{
    const CIMClass itsClass = classOf(nameSpace, className);
    std::vector<CIMInstance> batch;
    for (const InstanceRow& row :
         fStorage.listInstances(nameSpace, base::utf8(className), after, kBatchSize, kBatchBytes))
    {
        after = row.sequence;
        const CIMInstance instance = withPath(nameSpace, row.body);
        CIMClass shape;
        if (!options.deepInheritance) {
            shape = itsClass;
        } else if (!options.propertyList.isNull()) {
            shape = classOf(nameSpace, instance.getClassName());
        }
        batch.push_back(filteredInstance(instance, shape, options));
    }
    return batch;
}

CIMClass InstanceStore::classOf(NamespaceId nameSpace, const CIMName& name)
{
    CIMClass itsClass = fClasses.resolved(nameSpace, name);
    if (itsClass.isUninitialized()) {
        fail(CIM_ERR_INVALID_CLASS, base::utf8(name));
    }
    return itsClass;
}

InstanceRow InstanceStore::find(NamespaceId nameSpace, const CIMObjectPath& path)
{
    classOf(nameSpace, path.getClassName());
    const std::optional<InstanceRow> row = fStorage.findInstance(nameSpace, pathKey(path));
    if (!row) {
        fail(CIM_ERR_NOT_FOUND, base::utf8(withoutNamespace(path).toString()));
    }
    return *row;
}

CIMInstance InstanceStore::withPath(NamespaceId nameSpace, const std::string& body)
{
    CIMInstance instance = fCodec.decodeInstance(body);
    instance.setPath(instancePath(instance, classOf(nameSpace, instance.getClassName())));
    return instance;
}

} // namespace Pegasus::repository
