#pragma once

#include "pegasus/cmpi/module/ProviderModule.h"
#include "pegasus/server/net/Connection.h"

#include <memory>
#include <mutex>

namespace Pegasus::server {

// Carries out an agent's requests on its provider module, which is loaded by the first.
class AgentHandler : public RequestHandler
{
  public:
    // Requires: services outlive this.
    AgentHandler(const std::string& module, cmpi::BrokerServices& services) : fModuleName(module), fServices(services)
    {
    }

    void handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer) override;
    bool knowsMethod(const CimRequest&) const override { return true; }

  private:
    cmpi::ProviderModule& module(const HttpRequest& http);
    void unload();
    void enumerateInstances(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void enumerateInstanceNames(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void getInstance(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);
    void invokeMethod(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);

    std::string fModuleName;
    cmpi::BrokerServices& fServices;
    std::mutex fMutex; // held while the library is loaded
    std::unique_ptr<cmpi::ProviderModule> fModule;
};

} // namespace Pegasus::server
