// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMQualifier.h>
#include <Pegasus/Common/CIMValue.h>

PEGASUS_NAMESPACE_BEGIN

class CIMProperty;
struct CIMPropertyRep;
extern template class RepPointer<CIMPropertyRep>;

// Read-only handle to a property. Copies of a handle share the property; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle but isUninitialized();
// TypeMismatchException for a fixed size on a scalar, a reference class on another type, an array of references.
class PEGASUS_COMMON_LINKAGE CIMConstProperty
{
  public:
    CIMConstProperty() noexcept = default;
    CIMConstProperty(const CIMName& name, const CIMValue& value, Uint32 arraySize = 0,
                     const CIMName& referenceClassName = CIMName(), const CIMName& classOrigin = CIMName(),
                     Boolean propagated = false);

    const CIMName& getName() const;
    const CIMValue& getValue() const;
    CIMType getType() const;
    Boolean isArray() const;
    // Returns: the declared fixed size, 0 if absent.
    Uint32 getArraySize() const;
    const CIMName& getReferenceClassName() const;
    const CIMName& getClassOrigin() const;
    Boolean getPropagated() const;
    // Returns: the index, or PEG_NOT_FOUND.
    Uint32 findQualifier(const CIMName& name) const;
    CIMConstQualifier getQualifier(Uint32 index) const;
    Uint32 getQualifierCount() const;
    Boolean isUninitialized() const;
    Boolean identical(const CIMConstProperty& property) const;
    CIMProperty clone() const;

  protected:
    friend struct ObjectAccess;

    RepPointer<CIMPropertyRep> fRep;
};

// A property of a class (a declaration with its default) or of an instance.
class PEGASUS_COMMON_LINKAGE CIMProperty : public CIMConstProperty
{
  public:
    CIMProperty() noexcept = default;
    using CIMConstProperty::CIMConstProperty;

    void setName(const CIMName& name);
    // Throws: TypeMismatchException when type or array flag differ.
    void setValue(const CIMValue& value);
    void setClassOrigin(const CIMName& classOrigin);
    void setPropagated(Boolean propagated);
    // Throws: AlreadyExistsException.
    CIMProperty& addQualifier(const CIMQualifier& qualifier);
    using CIMConstProperty::getQualifier;
    CIMQualifier getQualifier(Uint32 index);
    void removeQualifier(Uint32 index);
};

PEGASUS_NAMESPACE_END
