// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>
#include <Pegasus/Common/String.h>

PEGASUS_NAMESPACE_BEGIN

// How a qualifier may be overridden and passed on. Adding a flag keeps its opposite.
class PEGASUS_COMMON_LINKAGE CIMFlavor
{
  public:
    CIMFlavor() : fBits(0) {}
    CIMFlavor(const CIMFlavor& flavor) = default;
    CIMFlavor& operator=(const CIMFlavor& flavor) = default;

    void addFlavor(const CIMFlavor& flavor);
    void removeFlavor(const CIMFlavor& flavor);
    // Returns: true when every flag of `flavor` is set here.
    Boolean hasFlavor(const CIMFlavor& flavor) const;
    Boolean equal(const CIMFlavor& flavor) const;
    // Words in a fixed order, with a blank between; empty for NONE.
    String toString() const;
    CIMFlavor operator+(const CIMFlavor& flavor) const;

    static const CIMFlavor NONE;
    static const CIMFlavor OVERRIDABLE;
    static const CIMFlavor ENABLEOVERRIDE;
    static const CIMFlavor TOSUBCLASS;
    static const CIMFlavor TOSUBELEMENTS;
    static const CIMFlavor TOINSTANCE;
    static const CIMFlavor TRANSLATABLE;
    static const CIMFlavor DISABLEOVERRIDE;
    static const CIMFlavor RESTRICTED;
    static const CIMFlavor DEFAULTS;

  private:
    constexpr explicit CIMFlavor(Uint32 bits) : fBits(bits) {}

    Uint32 fBits;
};

PEGASUS_NAMESPACE_END
