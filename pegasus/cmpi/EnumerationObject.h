#pragma once

#include "pegasus/cmpi/ValueCodec.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObjectPath.h>

#include <vector>

namespace Pegasus::cmpi {

// A CMPIEnumeration: what an upcall found, as it was then. Elements are turned into objects when they are asked for.
class EnumerationObject final : public Owned, public CMPIEnumeration
{
  public:
    // Instances and paths get the name space that was asked.
    EnumerationObject(Broker& owner, const Array<CIMInstance>& instances, const CIMNamespaceName& nameSpace);
    EnumerationObject(Broker& owner, const Array<CIMObjectPath>& paths, const CIMNamespaceName& nameSpace);
    EnumerationObject(const EnumerationObject& other);

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
