// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMFlavor.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMScope.h>
#include <Pegasus/Common/CIMValue.h>

PEGASUS_NAMESPACE_BEGIN

class CIMQualifierDecl;
struct CIMQualifierDeclRep;
extern template class RepPointer<CIMQualifierDeclRep>;

// Read-only handle to a qualifier declaration. Copies of a handle share the declaration; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle but isUninitialized().
class PEGASUS_COMMON_LINKAGE CIMConstQualifierDecl
{
  public:
    CIMConstQualifierDecl() noexcept = default;
    CIMConstQualifierDecl(const CIMName& name, const CIMValue& value, const CIMScope& scope,
                          const CIMFlavor& flavor = CIMFlavor(CIMFlavor::DEFAULTS), Uint32 arraySize = 0);

    const CIMName& getName() const;
    CIMType getType() const;
    Boolean isArray() const;
    const CIMValue& getValue() const;
    const CIMScope& getScope() const;
    const CIMFlavor& getFlavor() const;
    Uint32 getArraySize() const;
    Boolean isUninitialized() const;
    Boolean identical(const CIMConstQualifierDecl& decl) const;
    CIMQualifierDecl clone() const;

  protected:
    friend struct ObjectAccess;

    RepPointer<CIMQualifierDeclRep> fRep;
};

// The declaration of a qualifier type: its default value, where it may stand, how it is passed on.
class PEGASUS_COMMON_LINKAGE CIMQualifierDecl : public CIMConstQualifierDecl
{
  public:
    CIMQualifierDecl() noexcept = default;
    using CIMConstQualifierDecl::CIMConstQualifierDecl;

    void setName(const CIMName& name);
    void setValue(const CIMValue& value);
};

PEGASUS_NAMESPACE_END
