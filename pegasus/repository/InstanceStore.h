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

    CIMObjectPath create(NamespaceId nameSpace, const CIMConstInstance& newInstance);
    CIMInstance get(NamespaceId nameSpace, const CIMObjectPath& path, const InstanceOptions& options);
    void modify(NamespaceId nameSpace, const CIMConstInstance& modified, const CIMPropertyList& list);
    void remove(NamespaceId nameSpace, const CIMObjectPath& path);
    // Reads the instances that follow `after` (0 at first) until the batch is full, and moves `after` to the last one.
    // Returns: the batch; empty at the end.
    std::vector<CIMInstance> nextBatch(NamespaceId nameSpace, const CIMName& className, const InstanceOptions& options,
                                       std::int64_t& after);

  private:
    CIMClass classOf(NamespaceId nameSpace, const CIMName& name);
    InstanceRow find(NamespaceId nameSpace, const CIMObjectPath& path);
    CIMInstance withPath(NamespaceId nameSpace, const std::string& body);

    Storage& fStorage;
    ObjectCodec& fCodec;
    ClassStore& fClasses;
};

} // namespace Pegasus::repository
