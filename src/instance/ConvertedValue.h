// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClient.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// A value of the server and the host's value that it became, so that the next equal one can share the latter.
class TConvertedValue
{
  public:
    bool IsKept() const { return fIsKept; }
    // Returns: whether the kept value is the same, down to its type.
    bool IsOf(const Pegasus::CIMValue& served) const { return fIsKept && served == fServed; }
    const TCIMValue& Get() const { return fConverted; }

    // Keeps the pair in place of the last one. Returns at once for a type whose equal values can differ: 0 and -0, one
    // time in two time zones, references of two classes.
    void Keep(const Pegasus::CIMValue& served, Pegasus::CIMType type, const TCIMValue& converted)
    {
        if (type <= Pegasus::CIMTYPE_SINT64 || type == Pegasus::CIMTYPE_CHAR16 || type == Pegasus::CIMTYPE_STRING) {
            fServed = served;
            fConverted = converted;
            fIsKept = true;
        }
    }

  private:
    Pegasus::CIMValue fServed;
    TCIMValue fConverted;
    bool fIsKept = false;
};

} // namespace NKOLVRX20
