// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMMethod.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMQualifier.h>

PEGASUS_NAMESPACE_BEGIN

class CIMClass;
class CIMConstObject;
class CIMObject;
struct CIMClassRep;
extern template class RepPointer<CIMClassRep>;

// Read-only handle to a class. Copies of a handle share the class; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle but isUninitialized();
// IndexOutOfBoundsException; DynamicCastFailedException from an object that holds an instance.
class PEGASUS_COMMON_LINKAGE CIMConstClass
{
  public:
    CIMConstClass() noexcept = default;
    explicit CIMConstClass(const CIMConstObject& object);
    CIMConstClass(const CIMName& className, const CIMName& superClassName = CIMName());

    // Returns: true when the qualifier Association (or Abstract) is there, boolean and true.
    Boolean isAssociation() const;
    Boolean isAbstract() const;
    const CIMName& getClassName() const;
    const CIMObjectPath& getPath() const;
    // Returns: the null name when absent.
    const CIMName& getSuperClassName() const;
    // Returns: the index, or PEG_NOT_FOUND.
    Uint32 findQualifier(const CIMName& name) const;
    CIMConstQualifier getQualifier(Uint32 index) const;
    Uint32 getQualifierCount() const;
    Uint32 findProperty(const CIMName& name) const;
    CIMConstProperty getProperty(Uint32 index) const;
    Uint32 getPropertyCount() const;
    Uint32 findMethod(const CIMName& name) const;
    CIMConstMethod getMethod(Uint32 index) const;
    Uint32 getMethodCount() const;
    // Appends the names of the properties whose qualifier Key is true.
    void getKeyNames(Array<CIMName>& keyNames) const;
    Boolean hasKeys() const;
    // An instance with the class's properties (all, or those listed) and their defaults; its path has only the class.
    CIMInstance buildInstance(Boolean includeQualifiers, Boolean includeClassOrigin,
                              const CIMPropertyList& propertyList) const;
    Boolean isUninitialized() const;
    Boolean identical(const CIMConstClass& cimClass) const;
    CIMClass clone() const;

  protected:
    friend struct ObjectAccess;

    RepPointer<CIMClassRep> fRep;
};

// A CIM class. The add functions throw AlreadyExistsException and return the class.
class PEGASUS_COMMON_LINKAGE CIMClass : public CIMConstClass
{
  public:
    CIMClass() noexcept = default;
    explicit CIMClass(const CIMObject& object);
    CIMClass(const CIMName& className, const CIMName& superClassName = CIMName())
        : CIMConstClass(className, superClassName)
    {
    }

    void setPath(const CIMObjectPath& path);
    void setSuperClassName(const CIMName& superClassName);
    CIMClass& addQualifier(const CIMQualifier& qualifier);
    using CIMConstClass::getQualifier;
    CIMQualifier getQualifier(Uint32 index);
    void removeQualifier(Uint32 index);
    CIMClass& addProperty(const CIMProperty& property);
    using CIMConstClass::getProperty;
    CIMProperty getProperty(Uint32 index);
    void removeProperty(Uint32 index);
    CIMClass& addMethod(const CIMMethod& method);
    using CIMConstClass::getMethod;
    CIMMethod getMethod(Uint32 index);
    void removeMethod(Uint32 index);
};

PEGASUS_NAMESPACE_END
