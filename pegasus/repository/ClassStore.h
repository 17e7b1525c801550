// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ObjectCodec.h"
#include "pegasus/repository/QualifierRules.h"
#include "pegasus/repository/ResolvedClassCache.h"

#include <mutex>

namespace Pegasus::repository {

// Classes: stored as they were created, returned with what they inherit. Errors and limits: see Repository.
//
// A large class takes long to decode, to check and to encode. The lock is held to read and write rows and the cache
// alone.
// Requires: what the constructor takes outlives the store. The caller does not hold `mutex`.
// Thread: any.
class ClassStore
{
  public:
    // `mutex`: the lock of `storage`.
    ClassStore(std::mutex& mutex, Storage& storage, const ObjectEncoder& encoder, const RepositoryLimits& limits);

    // Returns: the class with everything that it inherits; uninitialised when absent.
    CIMClass resolved(NamespaceId nameSpace, const CIMName& name) { return resolve(nameSpace, name).whole; }
    // The same. Throws: CIM_ERR_NOT_FOUND.
    CIMClass existing(NamespaceId nameSpace, const CIMName& name);
    // Returns: the CLASS element that keepText() got for these options, which have no property list; null if none.
    std::shared_ptr<const std::string> findText(NamespaceId nameSpace, const CIMName& name,
                                                const ClassOptions& options);
    void keepText(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options,
                  const std::shared_ptr<const std::string>& text);
    bool has(NamespaceId nameSpace, const CIMName& name);
    std::vector<CIMName> listNames(NamespaceId nameSpace, const CIMName& name, bool isDeep);

    // Throws: what Repository::createClass throws.
    void create(NamespaceId nameSpace, const CIMConstClass& newClass, const QualifierLookup& lookup);

  private:
    ResolvedClass resolve(NamespaceId nameSpace, const CIMName& name);
    ResolvedClass superClassFor(NamespaceId nameSpace, const CIMConstClass& newClass);

    std::mutex& fMutex;
    Storage& fStorage;
    const ObjectEncoder& fEncoder;
    const RepositoryLimits& fLimits;
    ResolvedClassCache fCache;
};

} // namespace Pegasus::repository
