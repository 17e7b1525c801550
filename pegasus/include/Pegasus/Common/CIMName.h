// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Array.h>
#include <Pegasus/Common/String.h>

PEGASUS_NAMESPACE_BEGIN

// Name of a CIM element: a letter, underscore or non-ASCII character, then digits too. Comparisons ignore ASCII case.
// The null name is only made by the default constructor. Throws: InvalidNameException from the constructors.
class PEGASUS_COMMON_LINKAGE CIMName
{
  public:
    CIMName() noexcept = default;
    CIMName(const String& name);
    CIMName(const char* name);

    CIMName& operator=(const String& name);
#ifdef PEGASUS_USE_EXPERIMENTAL_INTERFACES
    CIMName& operator=(const char* name) { return *this = CIMName(name); }
#endif

    const String& getString() const { return fName; }
    Boolean isNull() const { return fName.size() == 0; }
    void clear() { fName.clear(); }
    Boolean equal(const CIMName& name) const;
    static Boolean legal(const String& name);

  private:
    String fName;
};

PEGASUS_COMMON_LINKAGE Boolean operator==(const CIMName& name1, const CIMName& name2);
PEGASUS_COMMON_LINKAGE Boolean operator!=(const CIMName& name1, const CIMName& name2);

// Name of a CIM namespace: names joined by "/"; one leading "/" is taken off. Case is kept; comparisons ignore it.
// Throws: InvalidNamespaceNameException from the constructors.
class PEGASUS_COMMON_LINKAGE CIMNamespaceName
{
  public:
    CIMNamespaceName() noexcept = default;
    CIMNamespaceName(const String& name);
    CIMNamespaceName(const char* name);

    CIMNamespaceName& operator=(const String& name);
#ifdef PEGASUS_USE_EXPERIMENTAL_INTERFACES
    CIMNamespaceName& operator=(const char* name) { return *this = CIMNamespaceName(name); }
#endif

    const String& getString() const { return fName; }
    Boolean isNull() const { return fName.size() == 0; }
    void clear() { fName.clear(); }
    Boolean equal(const CIMNamespaceName& name) const;
    static Boolean legal(const String& name);

  private:
    String fName;
};

PEGASUS_COMMON_LINKAGE Boolean operator==(const CIMNamespaceName& name1, const CIMNamespaceName& name2);
PEGASUS_COMMON_LINKAGE Boolean operator!=(const CIMNamespaceName& name1, const CIMNamespaceName& name2);

PEGASUS_NAMESPACE_END
