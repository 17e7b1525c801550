// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>

PEGASUS_NAMESPACE_BEGIN

class CIMObject;

// Read-only handle to what is either a class or an instance. Copies of a handle share it; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle
// but isUninitialized(), isClass() and isInstance().
class PEGASUS_COMMON_LINKAGE CIMConstObject
{
  public:
    CIMConstObject() noexcept = default;
    CIMConstObject(const CIMConstClass& cimClass);
    CIMConstObject(const CIMConstInstance& cimInstance);
    CIMConstObject(const CIMClass& cimClass);
    CIMConstObject(const CIMInstance& cimInstance);

    const CIMName& getClassName() const;
    const CIMObjectPath& getPath() const;
    Uint32 findQualifier(const CIMName& name) const;
    CIMConstQualifier getQualifier(Uint32 index) const;
    Uint32 getQualifierCount() const;
    Uint32 findProperty(const CIMName& name) const;
    CIMConstProperty getProperty(Uint32 index) const;
    Uint32 getPropertyCount() const;
    Boolean isUninitialized() const;
    Boolean isClass() const;
    Boolean isInstance() const;
    Boolean identical(const CIMConstObject& object) const;
    CIMObject clone() const;
    // The object as CIM-XML text.
    String toString() const;

  protected:
    friend struct ObjectAccess;

    // At most one of the two is set.
    CIMClass fClass;
    CIMInstance fInstance;
};

// A class or an instance.
class PEGASUS_COMMON_LINKAGE CIMObject : public CIMConstObject
{
  public:
    CIMObject() noexcept = default;
    CIMObject(const CIMClass& cimClass) : CIMConstObject(cimClass) {}
    CIMObject(const CIMInstance& cimInstance) : CIMConstObject(cimInstance) {}

    void setPath(const CIMObjectPath& path);
    CIMObject& addQualifier(const CIMQualifier& qualifier);
    using CIMConstObject::getQualifier;
    CIMQualifier getQualifier(Uint32 index);
    void removeQualifier(Uint32 index);
    CIMObject& addProperty(const CIMProperty& property);
    using CIMConstObject::getProperty;
    CIMProperty getProperty(Uint32 index);
    void removeProperty(Uint32 index);
    // A class stays as it is.
    void instanceFilter(Boolean includeQualifiers, Boolean includeClassOrigin, const CIMPropertyList& propertyList);
};

PEGASUS_NAMESPACE_END
