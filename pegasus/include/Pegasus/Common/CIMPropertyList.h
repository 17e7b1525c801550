// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Array.h>
#include <Pegasus/Common/CIMName.h>

PEGASUS_NAMESPACE_BEGIN

// Which properties are wanted: a null list means all, an empty list none.
// Throws: UninitializedObjectException for a list with a null name; IndexOutOfBoundsException.
class PEGASUS_COMMON_LINKAGE CIMPropertyList
{
  public:
    CIMPropertyList() = default;
    CIMPropertyList(const Array<CIMName>& propertyNames);

    void set(const Array<CIMName>& propertyNames);
    void clear();
    Boolean isNull() const { return fIsNull; }
    Uint32 size() const { return fNames.size(); }
    const CIMName& operator[](Uint32 index) const;
    Array<CIMName> getPropertyNameArray() const { return fNames; }
    Boolean contains(const CIMName& name) const;
    // "NULL", "EMPTY" or the names with ", " between.
    String toString() const;

  private:
    Array<CIMName> fNames;
    Boolean fIsNull = true;
};

PEGASUS_NAMESPACE_END
