// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/module/ProviderModule.h"
#include "pegasus/server/net/RequestLoop.h"

#include <memory>
#include <mutex>

namespace Pegasus::server {

// Carries out an agent's requests on its provider module, which the first request loads.
//
// Throws (handle): CIMException for an error of the operation or when loading the module fails; what the answer
// throws.
// Thread: any.
class AgentHandler : public RequestHandler
{
  public:
    // `strictOwners`: refuse a library that users other than root and this one can change.
    // Requires: services outlive this.
    AgentHandler(const std::string& module, cmpi::BrokerServices& services, bool strictOwners)
        : fModuleName(module), fServices(services), fStrictOwners(strictOwners)
    {
    }

    void handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer) override;
    bool knowsMethod(const CimRequest&) const override { return true; }

  private:
    cmpi::ProviderModule& module(const HttpRequest& http);
    void requireOwned(const std::string& library) const;
    void unload(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void enumerateInstances(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void enumerateInstanceNames(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void getInstance(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void createInstance(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void modifyInstance(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void deleteInstance(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void invokeMethod(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);

    std::string fModuleName;
    cmpi::BrokerServices& fServices;
    bool fStrictOwners;
    std::mutex fMutex; // held while the library is loaded
    std::unique_ptr<cmpi::ProviderModule> fModule;
};

} // namespace Pegasus::server
