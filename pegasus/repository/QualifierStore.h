// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ObjectCodec.h"
#include "pegasus/repository/Storage.h"

#include <cstdint>
#include <mutex>
#include <string>
#include <unordered_map>
#include <vector>

namespace Pegasus::repository {

// Qualifier declarations, each decoded once: every qualifier of every new class is checked against its declaration.
// Errors and limits: see Repository.
// Requires: what the constructor takes outlives the store. The caller does not hold `mutex`.
// Thread: any.
class QualifierStore
{
  public:
    // `mutex`: the lock of `storage`.
    QualifierStore(std::mutex& mutex, Storage& storage, const ObjectEncoder& encoder)
        : fMutex(mutex), fStorage(storage), fEncoder(encoder)
    {
    }

    // Returns: the declaration; uninitialised when absent.
    CIMQualifierDecl find(NamespaceId nameSpace, const CIMName& name);
    std::vector<CIMQualifierDecl> list(NamespaceId nameSpace);
    void set(NamespaceId nameSpace, const CIMConstQualifierDecl& declaration);

  private:
    std::mutex fSetting; // taken before fMutex: one set() at a time, which may take long without blocking find()
    std::mutex& fMutex;
    Storage& fStorage;
    const ObjectEncoder& fEncoder;
    std::uint64_t fSetCount = 0; // of finished set(): tells find() that what it decoded may be out of date
    std::unordered_map<std::string, CIMQualifierDecl> fKnown; // by namespace and name key
};

} // namespace Pegasus::repository
