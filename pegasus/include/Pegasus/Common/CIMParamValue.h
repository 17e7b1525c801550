// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMValue.h>

PEGASUS_NAMESPACE_BEGIN

struct CIMParamValueRep;
extern template class RepPointer<CIMParamValueRep>;

// A method's argument: name, value, and whether the type travels with it. Copies share one argument; clone() copies it.
// Throws: UninitializedObjectException for an empty name, and from a default-constructed one.
class PEGASUS_COMMON_LINKAGE CIMParamValue
{
  public:
    CIMParamValue() noexcept = default;
    CIMParamValue(String parameterName, CIMValue value, Boolean isTyped = true);

    String getParameterName() const;
    CIMValue getValue() const;
    Boolean isTyped() const;
    void setParameterName(String& parameterName);
    void setValue(CIMValue& value);
    void setIsTyped(Boolean isTyped);
    CIMParamValue clone() const;
    Boolean isUninitialized() const;

  private:
    RepPointer<CIMParamValueRep> fRep;
};

PEGASUS_NAMESPACE_END
