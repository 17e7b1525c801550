#pragma once

#include "pegasus/repository/ClassCache.h"
#include "pegasus/repository/QualifierStore.h"

namespace Pegasus::repository {

// Classes: stored as created, given out resolved. Errors and limits: see Repository. Thread: one thread at a time.
class ClassStore
{
  public:
    ClassStore(Storage& storage, ObjectText& texts, QualifierStore& qualifiers, const Limits& limits);

    // With everything inherited. Uninitialised if there is none.
    CIMClass resolved(NamespaceId nameSpace, const CIMName& name);
    CIMClass get(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options);
    // The same as a CLASS element.
    std::shared_ptr<const std::string> text(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options);
    bool has(NamespaceId nameSpace, const CIMName& name);
    CIMName superClass(NamespaceId nameSpace, const CIMName& name);
    std::vector<CIMName> listNames(NamespaceId nameSpace, const CIMName& name, bool isDeep);

    void create(NamespaceId nameSpace, const CIMConstClass& newClass);
    void modify(NamespaceId nameSpace, const CIMConstClass& modified);
    void remove(NamespaceId nameSpace, const CIMName& name);

  private:
    CIMClass existing(NamespaceId nameSpace, const CIMName& name);
    void put(NamespaceId nameSpace, const CIMConstClass& newClass);
    CIMClass resolvedSuperClass(NamespaceId nameSpace, const CIMConstClass& newClass);
    void checkDepth(NamespaceId nameSpace, const CIMConstClass& newClass);
    void expectUnused(NamespaceId nameSpace, const CIMName& name);

    Storage& fStorage;
    ObjectText& fTexts;
    QualifierStore& fQualifiers;
    const Limits& fLimits;
    ClassCache fCache;
};

} // namespace Pegasus::repository
