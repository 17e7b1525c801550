// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/TableFunction.h"
#include "pegasus/cmpi/services/PropertyFilter.h"
#include "pegasus/cmpi/services/ProviderRequest.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMValue.h>

#include <exception>
#include <string>

namespace Pegasus::cmpi {

// A CMPIResult: passes the kind of result that the operation expects to its sink at once, and refuses other kinds.
// An exception of the sink is kept until the provider has returned; until then the provider gets CMPI_RC_ERR_FAILED.
class ResultObject final : public Owned, public CMPIResult
{
  public:
    // Null sinks refuse.
    // Requires: `filter` and what the sinks refer to outlive the object.
    ResultObject(const PropertyFilter& filter, InstanceSink instances, PathSink paths, ReturnValueSink data);

    // Writes instances, and refuses other kinds.
    ResultObject(const PropertyFilter& filter, InstanceTextSink instances);

    void returnInstance(const CMPIInstance* instance);
    void returnPath(const CMPIObjectPath* path);
    void returnData(const CMPIValue* value, CMPIType type);
    // Everything after this is refused.
    void done() { fDone = true; }
    bool isDone() const { return fDone; }

    // Throws: what the sink threw, if it did.
    void rethrow() const;

    Lifetime lifetime = Lifetime::kArgument;

  private:
    template <typename Sink, typename Make> void deliver(const Sink& sink, Make&& make);

    const PropertyFilter& fFilter;
    InstanceSink fInstances;
    InstanceTextSink fTexts;
    std::string fText; // the last one; its memory serves the next
    PathSink fPaths;
    ReturnValueSink fData;
    bool fDone = false;
    std::exception_ptr fFailure;
};

extern const CMPIResultFT kResultTable;

} // namespace Pegasus::cmpi
