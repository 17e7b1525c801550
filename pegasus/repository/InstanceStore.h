// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ClassStore.h"

namespace Pegasus::repository {

// Instances of stored classes. Errors and limits: see Repository.
//
// A large instance takes long to decode, to check and to encode. The lock is held to read and write rows alone.
// Requires: what the constructor takes outlives the store. The caller does not hold `mutex`.
// Thread: any.
class InstanceStore
{
  public:
    // `mutex`: the lock of `storage`.
    InstanceStore(std::mutex& mutex, Storage& storage, const ObjectEncoder& encoder, ClassStore& classes)
        : fMutex(mutex), fStorage(storage), fEncoder(encoder), fClasses(classes)
    {
    }

    CIMObjectPath create(NamespaceId nameSpace, const CIMConstInstance& given);
    CIMInstance get(NamespaceId nameSpace, const CIMObjectPath& path, const InstanceOptions& options);
    void modify(NamespaceId nameSpace, const CIMConstInstance& modified, const CIMPropertyList& list);
    void remove(NamespaceId nameSpace, const CIMObjectPath& path);
    void visit(NamespaceId nameSpace, const CIMName& className, const InstanceOptions& options,
               const InstanceVisitor& visitor);

  private:
    CIMClass classOf(NamespaceId nameSpace, const CIMName& name);
    InstanceRow find(NamespaceId nameSpace, const CIMObjectPath& path);
    InstanceRow lockedFind(NamespaceId nameSpace, const CIMObjectPath& path);

    std::mutex& fMutex;
    Storage& fStorage;
    const ObjectEncoder& fEncoder;
    ClassStore& fClasses;
};

} // namespace Pegasus::repository
