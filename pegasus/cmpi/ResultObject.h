#pragma once

#include "pegasus/cmpi/PropertyFilter.h"
#include "pegasus/cmpi/Slot.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMValue.h>

#include <exception>
#include <functional>

namespace Pegasus::cmpi {

// A CMPIResult: what the operation accepts goes to its sink at once, anything else is refused.
// An exception of the sink is kept until the provider has returned; the provider is told CMPI_RC_ERR_FAILED from then
// on.
class ResultObject final : public Owned, public CMPIResult
{
  public:
    using InstanceSink = std::function<void(const CIMInstance&)>;
    using PathSink = std::function<void(const CIMObjectPath&)>;
    using DataSink = std::function<void(const CIMValue&)>;

    // Null sinks refuse. Requires: `filter` and what the sinks refer to outlive the object.
    ResultObject(const PropertyFilter& filter, InstanceSink instances, PathSink paths, DataSink data);

    void returnInstance(const CMPIInstance* instance);
    void returnPath(const CMPIObjectPath* path);
    void returnData(const CMPIValue* value, CMPIType type);
    void done() { fDone = true; }

    // Throws: what the sink threw, if it did.
    void rethrow() const;

    // A result is the call's; providers' releases do nothing.
    Lifetime lifetime = Lifetime::kArgument;

  private:
    template <class Sink, class Make> void deliver(const Sink& sink, Make&& make);

    const PropertyFilter& fFilter;
    InstanceSink fInstances;
    PathSink fPaths;
    DataSink fData;
    bool fDone = false;
    std::exception_ptr fFailure;
};

extern const CMPIResultFT kResultTable;

} // namespace Pegasus::cmpi
