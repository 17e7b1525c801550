// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ObjectCodec.h"
#include "pegasus/repository/Storage.h"

#include <cstdint>
#include <mutex>
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
    struct Key
    {
        NamespaceId nameSpace;
        CIMName name;

        bool operator==(const Key& other) const { return nameSpace == other.nameSpace && name.equal(other.name); }
    };
    struct Hash
    {
        std::size_t operator()(const Key& key) const noexcept;
    };

    std::mutex fSetting; // taken before fMutex: one set() at a time, which may take long without blocking find()
    std::mutex& fMutex;
    Storage& fStorage;
    const ObjectEncoder& fEncoder;
    std::uint64_t fSetCount = 0; // of finished set(): tells find() that what it decoded may be out of date
    std::unordered_map<Key, CIMQualifierDecl, Hash> fKnown;
};

} // namespace Pegasus::repository
