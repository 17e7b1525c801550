// SPDX-License-Identifier: MIT
#include "pegasus/repository/InstanceStore.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/InstanceRules.h"
#include "pegasus/repository/ListedNames.h"
#include "pegasus/repository/LookupKey.h"

namespace Pegasus::repository {

namespace {

// A batch spreads the cost of a query over many instances; both bounds keep its memory small, and short the time for
// which the lock is held.
constexpr std::size_t kBatchSize = 64;
constexpr std::size_t kBatchBytes = 1u << 20;

CIMObjectPath withoutNamespace(CIMObjectPath path)
{
    path.setHost(String());
    path.setNameSpace(CIMNamespaceName());
    return path;
}

} // namespace

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
    const Lock lock(fMutex);
    return lockedFind(nameSpace, path);
}

// Requires: the caller holds the lock.
InstanceRow InstanceStore::lockedFind(NamespaceId nameSpace, const CIMObjectPath& path)
{
    const std::optional<InstanceRow> row = fStorage.findInstance(nameSpace, pathKey(path));
    if (!row) {
        fail(CIM_ERR_NOT_FOUND, base::utf8(withoutNamespace(path).toString()));
    }
    return *row;
}

CIMObjectPath InstanceStore::create(NamespaceId nameSpace, const CIMConstInstance& given)
{
    const CIMClass itsClass = classOf(nameSpace, given.getClassName());
    const CIMInstance completed = completeInstance(given, itsClass);
    const CIMObjectPath path = instancePath(completed, itsClass);
    const std::string text = fEncoder.encodeInstance(completed);
    const std::string key = pathKey(path);
    const Lock lock(fMutex);
    if (fStorage.findInstance(nameSpace, key)) {
        fail(CIM_ERR_ALREADY_EXISTS, base::utf8(path.toString()));
    }
    fStorage.insertInstance(nameSpace, base::utf8(path.getClassName()), key, text);
    return path;
}

CIMInstance InstanceStore::get(NamespaceId nameSpace, const CIMObjectPath& path, const InstanceOptions& options)
{
    const CIMClass itsClass = classOf(nameSpace, path.getClassName());
    CIMInstance instance = ObjectDecoder(fEncoder).decodeInstance(find(nameSpace, path).body);
    instance.setPath(instancePath(instance, itsClass));
    const ListedNames listed(options.propertyList);
    return filteredInstance(instance, listed.areAll() ? CIMClass() : itsClass, listed, options.includeClassOrigin);
}

// The row is read, worked on while the lock is free, and written if it is still the same; else once more, so that two
// modifications of one instance both count. Each further round means that another modification has succeeded.
void InstanceStore::modify(NamespaceId nameSpace, const CIMConstInstance& modified, const CIMPropertyList& list)
{
    const CIMClass itsClass = classOf(nameSpace, modified.getPath().getClassName());
    const ListedNames listed(list);
    for (bool isWritten = false; !isWritten;) {
        const InstanceRow row = find(nameSpace, modified.getPath());
        const CIMInstance stored = ObjectDecoder(fEncoder).decodeInstance(row.body);
        const CIMInstance merged = mergedInstance(stored, modified, itsClass, listed);
        if (pathKey(instancePath(merged, itsClass)) != pathKey(modified.getPath())) {
            fail(CIM_ERR_INVALID_PARAMETER, "a key property cannot change");
        }
        const std::string text = fEncoder.encodeInstance(merged);
        const Lock lock(fMutex);
        isWritten = fStorage.replaceInstance(row, text);
    }
}

void InstanceStore::remove(NamespaceId nameSpace, const CIMObjectPath& path)
{
    classOf(nameSpace, path.getClassName());
    const Lock lock(fMutex);
    fStorage.deleteInstance(lockedFind(nameSpace, path).sequence);
}

void InstanceStore::visit(NamespaceId nameSpace, const CIMName& className, const InstanceOptions& options,
                          const InstanceVisitor& visitor)
{
    const CIMClass named = classOf(nameSpace, className);
    const ListedNames listed(options.propertyList);
    ObjectDecoder decoder(fEncoder);
    std::int64_t after = 0;
    const auto nextBatch = [&] {
        const Lock lock(fMutex);
        return fStorage.listInstances(nameSpace, base::utf8(className), after, kBatchSize, kBatchBytes);
    };
    for (auto batch = nextBatch(); !batch.empty(); batch = nextBatch()) {
        for (const InstanceRow& row : batch) {
            after = row.sequence;
            CIMInstance instance = decoder.decodeInstance(row.body);
            const CIMClass itsClass = classOf(nameSpace, instance.getClassName());
            instance.setPath(instancePath(instance, itsClass));
            const CIMClass whole = listed.areAll() ? CIMClass() : itsClass;
            const CIMClass& shape = options.deepInheritance ? whole : named;
            if (!visitor(filteredInstance(instance, shape, listed, options.includeClassOrigin))) {
                return;
            }
        }
    }
}

} // namespace Pegasus::repository
