// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/ObjectCodec.h"
#include "pegasus/repository/Storage.h"

#include <string>
#include <unordered_map>
#include <vector>

namespace Pegasus::repository {

// Qualifier declarations, each decoded once: every qualifier of every new class is checked against its declaration.
// Errors and limits: see Repository.
// Requires: what the constructor takes outlives the store.
// Thread: one thread at a time.
class QualifierStore
{
  public:
    QualifierStore(Storage& storage, ObjectCodec& codec) : fStorage(storage), fCodec(codec) {}

    // Returns: the declaration; uninitialised when absent.
    CIMQualifierDecl find(NamespaceId nameSpace, const CIMName& name);
    std::vector<CIMQualifierDecl> list(NamespaceId nameSpace);
    void set(NamespaceId nameSpace, const CIMConstQualifierDecl& declaration);

  private:
    Storage& fStorage;
    ObjectCodec& fCodec;
    std::unordered_map<std::string, CIMQualifierDecl> fKnown; // by namespace and name key
};

} // namespace Pegasus::repository
