// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMFlavor.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMValue.h>

PEGASUS_NAMESPACE_BEGIN

class CIMQualifier;
struct CIMQualifierRep;
extern template class RepPointer<CIMQualifierRep>;

// Read-only handle to a qualifier. Copies of a handle share the qualifier; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle but isUninitialized().
class PEGASUS_COMMON_LINKAGE CIMConstQualifier
{
  public:
    CIMConstQualifier() noexcept = default;
    CIMConstQualifier(const CIMName& name, const CIMValue& value, const CIMFlavor& flavor = CIMFlavor(CIMFlavor::NONE),
                      Boolean propagated = false);

    const CIMName& getName() const;
    CIMType getType() const;
    Boolean isArray() const;
    const CIMValue& getValue() const;
    const CIMFlavor& getFlavor() const;
    Uint32 getPropagated() const;
    Boolean isUninitialized() const;
    Boolean identical(const CIMConstQualifier& qualifier) const;
    CIMQualifier clone() const;

  protected:
    friend struct ObjectAccess;

    RepPointer<CIMQualifierRep> fRep;
};

// A qualifier on a class, property, method or parameter.
class PEGASUS_COMMON_LINKAGE CIMQualifier : public CIMConstQualifier
{
  public:
    CIMQualifier() noexcept = default;
    using CIMConstQualifier::CIMConstQualifier;

    void setName(const CIMName& name);
    void setValue(const CIMValue& value);
    void setFlavor(const CIMFlavor& flavor);
    void unsetFlavor(const CIMFlavor& flavor);
    void setPropagated(Boolean propagated);
};

PEGASUS_NAMESPACE_END
