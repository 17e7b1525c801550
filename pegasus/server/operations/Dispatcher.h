#pragma once

#include "pegasus/server/net/Connection.h"
#include "pegasus/server/operations/ServerCore.h"

namespace Pegasus::server {

// Finds the operation that a request names and runs it.
class Dispatcher : public RequestHandler
{
  public:
    explicit Dispatcher(ServerCore& core) : fCore(core) {}

    // Throws: CIM_ERR_NOT_SUPPORTED for the operations of the standard that this server does not have.
    void handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer) override;
    bool knowsMethod(const CimRequest& request) const override;

  private:
    ServerCore& fCore;
};

} // namespace Pegasus::server
