#pragma once

#include "pegasus/repository/QualifierStore.h"
#include "pegasus/repository/ResolvedClassCache.h"

namespace Pegasus::repository {

// Classes: stored as they were created, returned with what they inherit. Errors and limits: see Repository.
// Requires: what the constructor takes outlives the store.
// Thread: one thread at a time.
class ClassStore
{
  public:
    ClassStore(Storage& storage, ObjectCodec& codec, QualifierStore& qualifiers, const RepositoryLimits& limits);

    // Returns: the class with everything that it inherits; uninitialised when absent.
    CIMClass resolved(NamespaceId nameSpace, const CIMName& name);
    CIMClass get(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options);
    // The same as a CLASS element.
    std::shared_ptr<const std::string> text(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options);
    bool has(NamespaceId nameSpace, const CIMName& name);
    std::vector<CIMName> listNames(NamespaceId nameSpace, const CIMName& name, bool isDeep);

    void create(NamespaceId nameSpace, const CIMConstClass& newClass);

  private:
    CIMClass existing(NamespaceId nameSpace, const CIMName& name);
    CIMClass resolvedSuperClass(NamespaceId nameSpace, const CIMConstClass& newClass);
    void checkDepth(NamespaceId nameSpace, const CIMConstClass& newClass);

    Storage& fStorage;
    ObjectCodec& fCodec;
    QualifierStore& fQualifiers;
    const RepositoryLimits& fLimits;
    ResolvedClassCache fCache;
};

} // namespace Pegasus::repository
