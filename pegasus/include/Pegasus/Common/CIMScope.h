// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>
#include <Pegasus/Common/String.h>

PEGASUS_NAMESPACE_BEGIN

// The kinds of element that a qualifier may be put on.
class PEGASUS_COMMON_LINKAGE CIMScope
{
  public:
    CIMScope() : fBits(0) {}
    CIMScope(const CIMScope& scope) = default;
    CIMScope& operator=(const CIMScope& scope) = default;

    // Returns: true when every kind of `scope` is in this one.
    Boolean hasScope(const CIMScope& scope) const;
    void addScope(const CIMScope& scope);
    Boolean equal(const CIMScope& scope) const;
    // Names in a fixed order, with a blank between; all seven for ANY, empty for NONE.
    String toString() const;
    CIMScope operator+(const CIMScope& scope) const;

    static const CIMScope NONE;
    static const CIMScope CLASS;
    static const CIMScope ASSOCIATION;
    static const CIMScope INDICATION;
    static const CIMScope PROPERTY;
    static const CIMScope REFERENCE;
    static const CIMScope METHOD;
    static const CIMScope PARAMETER;
    static const CIMScope ANY;

  private:
    constexpr explicit CIMScope(Uint32 bits) : fBits(bits) {}

    Uint32 fBits;
};

PEGASUS_NAMESPACE_END
