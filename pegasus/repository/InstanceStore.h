#pragma once

#include "pegasus/repository/ClassStore.h"

namespace Pegasus::repository {

// Instances of stored classes. Errors and limits: see Repository. Thread: one thread at a time.
class InstanceStore
{
  public:
    InstanceStore(Storage& storage, ObjectText& texts, ClassStore& classes)
        : fStorage(storage), fTexts(texts), fClasses(classes)
    {
    }

    CIMObjectPath create(NamespaceId nameSpace, const CIMConstInstance& newInstance);
    CIMInstance get(NamespaceId nameSpace, const CIMObjectPath& path, const InstanceOptions& options);
    void modify(NamespaceId nameSpace, const CIMConstInstance& modified, const CIMPropertyList& list);
    void remove(NamespaceId nameSpace, const CIMObjectPath& path);
    // Reads on behind the instance `after` (0 at first), which it moves, until the batch is full.
    // Returns nothing when there is no more.
    std::vector<CIMInstance> nextBatch(NamespaceId nameSpace, const CIMName& className, const InstanceOptions& options,
                                       std::int64_t& after);

  private:
    CIMClass classOf(NamespaceId nameSpace, const CIMName& name);
    InstanceRow find(NamespaceId nameSpace, const CIMObjectPath& path);
    CIMInstance withPath(NamespaceId nameSpace, const std::string& body);

    Storage& fStorage;
    ObjectText& fTexts;
    ClassStore& fClasses;
};

} // namespace Pegasus::repository
