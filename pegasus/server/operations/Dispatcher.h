// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/RequestLoop.h"
#include "pegasus/server/operations/ServerCore.h"

namespace Pegasus::server {

// Finds the operation that a request names, checks the names of its parameters, and runs it.
// Thread: any.
class Dispatcher : public RequestHandler
{
  public:
    // Requires: the core outlives this.
    explicit Dispatcher(ServerCore& core) : fCore(core) {}

    // Throws: CIM_ERR_NOT_SUPPORTED for the standard's operations that this server lacks; what the operation throws.
    void handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer) override;
    bool knowsMethod(const CimRequest& request) const override;

  private:
    ServerCore& fCore;
};

} // namespace Pegasus::server
