// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMInstance.h>
#include <cmpi/cmpi.h>

namespace lab {

// A value as CMPI's (value, type) arguments want it.
struct Argument
{
    CMPIType type = CMPI_null;
    bool isNull = false;
    CMPIValue value = {};

    const CMPIValue* pointer() const { return isNull ? nullptr : &value; }
};

// CIM objects to CMPI's, by the broker's function tables alone, as a vendor would make them. What is made lives as long
// as the provider's call.
class CmpiBuilder
{
  public:
    CmpiBuilder(const CMPIBroker* broker, const char* nameSpace) : fBroker(broker), fNameSpace(nameSpace) {}

    Argument argument(const Pegasus::CIMValue& value) const;
    // Keys with the types of the class's declaration, where the instance has them.
    CMPIObjectPath* path(const Pegasus::CIMObjectPath& from, const Pegasus::CIMInstance* instance = nullptr) const;
    CMPIInstance* instance(const Pegasus::CIMInstance& from) const;

  private:
    Argument array(const Pegasus::CIMValue& value) const;
    CMPIInstance* embedded(const Pegasus::CIMInstance& from) const;
    void setProperties(const CMPIInstance& to, const Pegasus::CIMInstance& from) const;

    const CMPIBroker* fBroker;
    const char* fNameSpace;
};

} // namespace lab
