// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMQualifier.h>

PEGASUS_NAMESPACE_BEGIN

class CIMParameter;
struct CIMParameterRep;
extern template class RepPointer<CIMParameterRep>;

// Read-only handle to a parameter declaration. Copies of a handle share it; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle but isUninitialized();
// TypeMismatchException for a fixed size on a scalar, a reference that lacks a class, a class on another type.
class PEGASUS_COMMON_LINKAGE CIMConstParameter
{
  public:
    CIMConstParameter() noexcept = default;
    CIMConstParameter(const CIMName& name, CIMType type, Boolean isArray = false, Uint32 arraySize = 0,
                      const CIMName& referenceClassName = CIMName());

    const CIMName& getName() const;
    Boolean isArray() const;
    Uint32 getArraySize() const;
    const CIMName& getReferenceClassName() const;
    CIMType getType() const;
    Uint32 findQualifier(const CIMName& name) const;
    CIMConstQualifier getQualifier(Uint32 index) const;
    Uint32 getQualifierCount() const;
    Boolean isUninitialized() const;
    Boolean identical(const CIMConstParameter& parameter) const;
    CIMParameter clone() const;

  protected:
    friend struct ObjectAccess;

    RepPointer<CIMParameterRep> fRep;
};

// The declaration of a method's parameter.
class PEGASUS_COMMON_LINKAGE CIMParameter : public CIMConstParameter
{
  public:
    CIMParameter() noexcept = default;
    using CIMConstParameter::CIMConstParameter;

    void setName(const CIMName& name);
    // Throws: AlreadyExistsException.
    CIMParameter& addQualifier(const CIMQualifier& qualifier);
    using CIMConstParameter::getQualifier;
    CIMQualifier getQualifier(Uint32 index);
    void removeQualifier(Uint32 index);
};

PEGASUS_NAMESPACE_END
