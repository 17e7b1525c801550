// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/BrokerServices.h"

#include <Pegasus/Client/CIMClient.h>

#include <memory>
#include <mutex>
#include <vector>

namespace Pegasus::server {

// Upcalls of an agent's providers: requests of an ordinary client to the server's local socket, on as many connections
// as calls run at once.
//
// Throws: CIMException with the operation's status; another Pegasus::Exception when the server is unreachable.
// Thread: any. Blocks: kUpcallTimeoutMs at most.
class AgentServices : public cmpi::BrokerServices
{
  public:
    AgentServices(const std::string& module, bool strictProviders) : fModule(module), fStrictProviders(strictProviders)
    {
    }

    CIMClass getClass(const CIMNamespaceName& nameSpace, const CIMName& className) override;
    CIMInstance getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                            const CIMPropertyList& properties) override;
    Array<CIMInstance> enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                          const CIMPropertyList& properties) override;
    Array<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className) override;
    CIMValue invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                          const Array<CIMParamValue>& in, Array<CIMParamValue>& out) override;
    CIMObjectPath createInstance(const CIMNamespaceName& nameSpace, const CIMInstance& instance) override;
    void modifyInstance(const CIMNamespaceName& nameSpace, const CIMInstance& instance,
                        const CIMPropertyList& properties) override;
    void deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path) override;
    bool strictProviders() const override { return fStrictProviders; }
    void log(Severity severity, const std::string& text) noexcept override;

  private:
    // Runs a call on a client of its own. A client whose call failed without a CIM status is dropped.
    template <typename Call> auto withClient(const Call& call);
    std::unique_ptr<CIMClient> takeClient();
    void giveBack(std::unique_ptr<CIMClient> client);

    std::string fModule;
    bool fStrictProviders;
    std::mutex fMutex;
    std::vector<std::unique_ptr<CIMClient>> fIdle;
};

} // namespace Pegasus::server
