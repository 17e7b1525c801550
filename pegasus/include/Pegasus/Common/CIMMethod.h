// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMParameter.h>
#include <Pegasus/Common/CIMQualifier.h>

PEGASUS_NAMESPACE_BEGIN

class CIMMethod;
struct CIMMethodRep;
extern template class RepPointer<CIMMethodRep>;

// Read-only handle to a method declaration. Copies of a handle share it; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle but isUninitialized().
class PEGASUS_COMMON_LINKAGE CIMConstMethod
{
  public:
    CIMConstMethod() noexcept = default;
    CIMConstMethod(const CIMName& name, CIMType type, const CIMName& classOrigin = CIMName(),
                   Boolean propagated = false);

    const CIMName& getName() const;
    CIMType getType() const;
    const CIMName& getClassOrigin() const;
    Boolean getPropagated() const;
    Uint32 findQualifier(const CIMName& name) const;
    CIMConstQualifier getQualifier(Uint32 index) const;
    Uint32 getQualifierCount() const;
    Uint32 findParameter(const CIMName& name) const;
    CIMConstParameter getParameter(Uint32 index) const;
    Uint32 getParameterCount() const;
    Boolean isUninitialized() const;
    Boolean identical(const CIMConstMethod& method) const;
    CIMMethod clone() const;

  protected:
    friend struct ObjectAccess;

    RepPointer<CIMMethodRep> fRep;
};

// The declaration of a method.
class PEGASUS_COMMON_LINKAGE CIMMethod : public CIMConstMethod
{
  public:
    CIMMethod() noexcept = default;
    using CIMConstMethod::CIMConstMethod;

    void setName(const CIMName& name);
    void setType(CIMType type);
    void setClassOrigin(const CIMName& classOrigin);
    void setPropagated(Boolean propagated);
    // Throws: AlreadyExistsException.
    CIMMethod& addQualifier(const CIMQualifier& qualifier);
    using CIMConstMethod::getQualifier;
    CIMQualifier getQualifier(Uint32 index);
    void removeQualifier(Uint32 index);
    // Throws: AlreadyExistsException.
    CIMMethod& addParameter(const CIMParameter& parameter);
    using CIMConstMethod::getParameter;
    CIMParameter getParameter(Uint32 index);
    void removeParameter(Uint32 index);
};

PEGASUS_NAMESPACE_END
