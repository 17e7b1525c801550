// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/BrokerServices.h"
#include "pegasus/mof/MemoryHandler.h"

#include <string>

namespace fuzz {

// A server with a few classes and one instance. Its log is read, so that a bad text in it is found.
class FuzzServices : public Pegasus::cmpi::BrokerServices
{
  public:
    FuzzServices();

    Pegasus::CIMClass getClass(const Pegasus::CIMNamespaceName& nameSpace, const Pegasus::CIMName& className) override;
    Pegasus::CIMInstance getInstance(const Pegasus::CIMNamespaceName& nameSpace, const Pegasus::CIMObjectPath& path,
                                     const Pegasus::CIMPropertyList& properties) override;
    Pegasus::Array<Pegasus::CIMInstance> enumerateInstances(const Pegasus::CIMNamespaceName& nameSpace,
                                                            const Pegasus::CIMName& className,
                                                            const Pegasus::CIMPropertyList& properties) override;
    Pegasus::Array<Pegasus::CIMObjectPath> enumerateInstanceNames(const Pegasus::CIMNamespaceName& nameSpace,
                                                                  const Pegasus::CIMName& className) override;
    Pegasus::CIMValue invokeMethod(const Pegasus::CIMNamespaceName& nameSpace, const Pegasus::CIMObjectPath& path,
                                   const Pegasus::CIMName& method, const Pegasus::Array<Pegasus::CIMParamValue>& in,
                                   Pegasus::Array<Pegasus::CIMParamValue>& out) override;
    bool strictProviders() const override { return strict; }
    void log(Severity severity, const std::string& text) noexcept override;

    bool strict = false;

  private:
    Pegasus::mof::MemoryHandler fDefinitions;
};

} // namespace fuzz
