// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ObjectCodec.h"
#include "pegasus/repository/ResolvedClassCache.h"

namespace Pegasus::repository {

// Classes: stored as they were created, returned with what they inherit. Errors and limits: see Repository.
//
// A large class takes long to check and to encode. The repository does both without its lock, between a call of this
// store that fetches what they need and one that keeps the result.
// Requires: what the constructor takes outlives the store.
// Thread: one thread at a time.
class ClassStore
{
  public:
    ClassStore(Storage& storage, ObjectCodec& codec, const RepositoryLimits& limits);

    // Returns: the class with everything that it inherits; uninitialised when absent.
    CIMClass resolved(NamespaceId nameSpace, const CIMName& name);
    // The same. Throws: CIM_ERR_NOT_FOUND.
    CIMClass existing(NamespaceId nameSpace, const CIMName& name);
    // Returns: the CLASS element that keepText() got for these options, which have no property list; null if none.
    std::shared_ptr<const std::string> findText(NamespaceId nameSpace, const CIMName& name,
                                                const ClassOptions& options);
    void keepText(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options,
                  const std::shared_ptr<const std::string>& text);
    bool has(NamespaceId nameSpace, const CIMName& name);
    std::vector<CIMName> listNames(NamespaceId nameSpace, const CIMName& name, bool isDeep);

    // Returns: the resolved superclass of a class that can be created; uninitialised for a root class.
    // Throws: CIM_ERR_ALREADY_EXISTS, CIM_ERR_INVALID_SUPERCLASS.
    CIMClass superClassFor(NamespaceId nameSpace, const CIMConstClass& newClass);
    // Stores a class that was checked against superClassFor(). `text` is its encoded, `whole` its resolved form.
    // Throws: CIM_ERR_ALREADY_EXISTS when another thread was faster.
    void insert(NamespaceId nameSpace, const CIMConstClass& local, const std::string& text, const CIMClass& whole);

  private:
    void requireAbsent(NamespaceId nameSpace, const CIMName& name);
    void checkDepth(NamespaceId nameSpace, const CIMConstClass& newClass);

    Storage& fStorage;
    ObjectCodec& fCodec;
    const RepositoryLimits& fLimits;
    ResolvedClassCache fCache;
};

} // namespace Pegasus::repository
