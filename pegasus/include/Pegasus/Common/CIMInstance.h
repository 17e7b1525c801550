// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMQualifier.h>

PEGASUS_NAMESPACE_BEGIN

class CIMConstClass;
class CIMConstObject;
class CIMObject;
class CIMInstance;
struct CIMInstanceRep;
extern template class RepPointer<CIMInstanceRep>;

// Read-only handle to an instance. Copies of a handle share the instance; clone() copies it.
// Throws: UninitializedObjectException from every member of a default-constructed handle but isUninitialized();
// IndexOutOfBoundsException; DynamicCastFailedException from an object that holds a class.
class PEGASUS_COMMON_LINKAGE CIMConstInstance
{
  public:
    CIMConstInstance() noexcept = default;
    explicit CIMConstInstance(const CIMConstObject& object);
    CIMConstInstance(const CIMName& className);

    const CIMName& getClassName() const;
    const CIMObjectPath& getPath() const;
    // Returns: the index, or PEG_NOT_FOUND.
    Uint32 findQualifier(const CIMName& name) const;
    CIMConstQualifier getQualifier(Uint32 index) const;
    Uint32 getQualifierCount() const;
    Uint32 findProperty(const CIMName& name) const;
    CIMConstProperty getProperty(Uint32 index) const;
    Uint32 getPropertyCount() const;
    // The path made of the class's key properties. A null key has an empty text.
    // Throws: NoSuchProperty when the instance lacks a key of the class.
    CIMObjectPath buildPath(const CIMConstClass& cimClass) const;
    Boolean isUninitialized() const;
    Boolean identical(const CIMConstInstance& instance) const;
    CIMInstance clone() const;

  protected:
    friend struct ObjectAccess;

    // The representation with its path and properties as objects. An instance of an answer has them from the first
    // time that something asks for them. Thread: any.
    CIMInstanceRep& unpacked() const;

    RepPointer<CIMInstanceRep> fRep;
};

// An instance of a CIM class.
class PEGASUS_COMMON_LINKAGE CIMInstance : public CIMConstInstance
{
  public:
    CIMInstance() noexcept = default;
    explicit CIMInstance(const CIMObject& object);
    CIMInstance(const CIMName& className) : CIMConstInstance(className) {}

    // Throws: TypeMismatchException when the class names differ.
    void setPath(const CIMObjectPath& path);
    // Throws: AlreadyExistsException.
    CIMInstance& addQualifier(const CIMQualifier& qualifier);
    using CIMConstInstance::getQualifier;
    CIMQualifier getQualifier(Uint32 index);
    void removeQualifier(Uint32 index);
    // Throws: AlreadyExistsException.
    CIMInstance& addProperty(const CIMProperty& property);
    using CIMConstInstance::getProperty;
    CIMProperty getProperty(Uint32 index);
    void removeProperty(Uint32 index);
    // Keeps the listed properties (a null list: all), and qualifiers and class origins if they are asked for.
    void instanceFilter(Boolean includeQualifiers, Boolean includeClassOrigin, const CIMPropertyList& propertyList);
};

PEGASUS_NAMESPACE_END
