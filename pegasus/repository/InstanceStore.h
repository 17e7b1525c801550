// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ClassStore.h"

namespace Pegasus::repository {

// Instances of stored classes. Errors and limits: see Repository.
// Requires: what the constructor takes outlives the store.
// Thread: one thread at a time.
class InstanceStore
{
  public:
    InstanceStore(Storage& storage, ObjectCodec& codec, ClassStore& classes)
        : fStorage(storage), fCodec(codec), fClasses(classes)
    {
    }

    // Stores an instance that was completed and encoded for its class. Throws: CIM_ERR_ALREADY_EXISTS.
    void insert(NamespaceId nameSpace, const CIMObjectPath& path, const std::string& text);
    CIMInstance get(NamespaceId nameSpace, const CIMObjectPath& path, const InstanceOptions& options);
    void modify(NamespaceId nameSpace, const CIMConstInstance& modified, const CIMPropertyList& list);
    void remove(NamespaceId nameSpace, const CIMObjectPath& path);
    // Reads the instances that follow `after` (0 at first) until the batch is full, and moves `after` to the last one.
    // Returns: the batch; empty at the end.
    std::vector<CIMInstance> nextBatch(NamespaceId nameSpace, const CIMName& className, const InstanceOptions& options,
                                       std::int64_t& after);

    // Returns: the resolved class. Throws: CIM_ERR_INVALID_CLASS.
    CIMClass classOf(NamespaceId nameSpace, const CIMName& name);

  private:
    InstanceRow find(NamespaceId nameSpace, const CIMObjectPath& path);
    CIMInstance withPath(NamespaceId nameSpace, const std::string& body);

    Storage& fStorage;
    ObjectCodec& fCodec;
    ClassStore& fClasses;
};

} // namespace Pegasus::repository
