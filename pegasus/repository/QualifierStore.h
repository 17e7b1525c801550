#pragma once

#include "pegasus/repository/ObjectText.h"
#include "pegasus/repository/QualifierRules.h"
#include "pegasus/repository/Storage.h"

#include <string>
#include <unordered_map>
#include <vector>

namespace Pegasus::repository {

// Qualifier declarations, each decoded once. Errors and limits: see Repository. Thread: one thread at a time.
class QualifierStore
{
  public:
    QualifierStore(Storage& storage, ObjectText& texts) : fStorage(storage), fTexts(texts) {}

    // Uninitialised if there is none.
    CIMQualifierDecl find(NamespaceId nameSpace, const CIMName& name);
    std::vector<CIMQualifierDecl> list(NamespaceId nameSpace);
    void set(NamespaceId nameSpace, const CIMConstQualifierDecl& declaration);
    void remove(NamespaceId nameSpace, const CIMName& name);

    QualifierLookup lookupIn(NamespaceId nameSpace);

  private:
    Storage& fStorage;
    ObjectText& fTexts;
    std::unordered_map<std::string, CIMQualifierDecl> fKnown; // by namespace and folded name
};

} // namespace Pegasus::repository
