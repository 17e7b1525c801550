// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Array.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/RepPointer.h>
#include <Pegasus/Common/String.h>

PEGASUS_NAMESPACE_BEGIN

class CIMValue;
struct CIMKeyBindingRep;
extern template class RepPointer<CIMKeyBindingRep>;
struct CIMObjectPathRep;
extern template class RepPointer<CIMObjectPathRep>;

// One key of an object path: name, text and kind. The text is taken unchecked, whatever the kind.
class PEGASUS_COMMON_LINKAGE CIMKeyBinding
{
  public:
    enum Type
    {
        BOOLEAN,
        STRING,
        NUMERIC,
        REFERENCE
    };

    CIMKeyBinding() noexcept = default;
    CIMKeyBinding(const CIMName& name, const String& value, Type type);
    // The kind follows the value's type. Throws: TypeMismatchException for an array, object or instance.
    CIMKeyBinding(const CIMName& name, const CIMValue& value);

    const CIMName& getName() const;
    void setName(const CIMName& name);
    const String& getValue() const;
    void setValue(const String& value);
    Type getType() const;
    void setType(Type type);
    // Would a key made from this value be the same?
    Boolean equal(CIMValue value);

  private:
    RepPointer<CIMKeyBindingRep> fRep;
};

// Name ignoring case; kind; then numbers by value, booleans ignoring case, references as paths, strings exactly.
PEGASUS_COMMON_LINKAGE Boolean operator==(const CIMKeyBinding& x, const CIMKeyBinding& y);

// Where a class or an instance is: host, namespace, class and keys, each of which may be absent.
// Keys are always kept in the order of their names. Copies are independent.
// Throws: MalformedObjectNameException from every function that takes text or a host.
class PEGASUS_COMMON_LINKAGE CIMObjectPath
{
  public:
    CIMObjectPath() noexcept = default;
    CIMObjectPath(const String& objectName);
    CIMObjectPath(const String& host, const CIMNamespaceName& nameSpace, const CIMName& className,
                  const Array<CIMKeyBinding>& keyBindings = Array<CIMKeyBinding>());

    CIMObjectPath& operator=(const String& objectName);
    void clear();
    void set(const String& host, const CIMNamespaceName& nameSpace, const CIMName& className,
             const Array<CIMKeyBinding>& keyBindings = Array<CIMKeyBinding>());
    void set(const String& objectName);

    const String& getHost() const;
    void setHost(const String& host);
    const CIMNamespaceName& getNameSpace() const;
    void setNameSpace(const CIMNamespaceName& nameSpace);
    const CIMName& getClassName() const;
    void setClassName(const CIMName& className);
    const Array<CIMKeyBinding>& getKeyBindings() const;
    void setKeyBindings(const Array<CIMKeyBinding>& keyBindings);

    // `//host/namespace:Class.key=value,...` with the absent parts left out.
    String toString() const;
    Boolean identical(const CIMObjectPath& path) const;
    Uint32 makeHashCode() const;

  private:
    friend struct PathAccess;
    RepPointer<CIMObjectPathRep> fRep;
};

PEGASUS_COMMON_LINKAGE Boolean operator==(const CIMObjectPath& x, const CIMObjectPath& y);
PEGASUS_COMMON_LINKAGE Boolean operator!=(const CIMObjectPath& x, const CIMObjectPath& y);

PEGASUS_NAMESPACE_END
