// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/ValueCodec.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObjectPath.h>

#include <vector>

namespace Pegasus::cmpi {

// A CMPIEnumeration: the results of an upcall. An element becomes an object when the provider asks for it.
class EnumerationObject final : public Owned, public CMPIEnumeration
{
  public:
    // Instances and paths get `nameSpace`, in which the upcall asked: the server leaves it out.
    EnumerationObject(Broker& owner, const Array<CIMInstance>& instances, const CIMNamespaceName& nameSpace);
    EnumerationObject(Broker& owner, const Array<CIMObjectPath>& paths, const CIMNamespaceName& nameSpace);
    EnumerationObject(const EnumerationObject& other);

    CMPIType type() const { return fType; }
    bool hasNext() const { return fNext < fElements.size(); }
    // Throws: CMPI_RC_NO_MORE_ELEMENTS.
    CMPIData next();
    CMPIArray* toArray() const;

    Lifetime lifetime = Lifetime::kFrame;

  private:
    Broker& fBroker;
    CMPIType fType; // of one element
    std::vector<CIMValue> fElements;
    std::size_t fNext = 0;
};

extern const CMPIEnumerationFT kEnumerationTable;

} // namespace Pegasus::cmpi
