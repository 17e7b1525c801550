// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/BrokerServices.h"
#include "pegasus/cmpi/services/SchemaCache.h"
#include "pegasus/cmpi/services/UpcallNesting.h"

#include <cmpi/cmpi.h>

#include <mutex>
#include <string>
#include <unordered_set>

namespace Pegasus::cmpi {

// The function tables of a broker. They are made in cmpi/broker, one layer above: their functions need every object.
struct BrokerTables
{
    const CMPIBrokerFT& upcalls;
    const CMPIBrokerEncFT& factories;
    const CMPIBrokerExtFT& threads;
    const CMPIBrokerMemFT& memory;
};

// The CMPIBroker that the providers of one library see. They keep its address, so it lives as long as the library is
// loaded.
// Thread: all members may be called on any thread at any time.
class Broker final : public CMPIBroker
{
  public:
    // Requires: `services` and the tables outlive the broker.
    Broker(BrokerServices& services, const BrokerTables& tables);
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    BrokerServices& services() const { return fServices; }
    SchemaCache& classes() { return fClasses; }
    UpcallNesting& nesting() { return fNesting; }

    // Logs a provider's mistake the first time only, since providers repeat theirs for every instance. The number of
    // remembered warnings is bounded; beyond it, new mistakes stay unlogged.
    void warnOnce(const std::string& text);

    // Returns: the broker that a provider passed to one of the tables' functions.
    // Requires: it is one that the provider was given, or a copy of it.
    // Throws: CMPI_RC_ERR_INVALID_HANDLE for null.
    static Broker& of(const CMPIBroker* broker);

  private:
    BrokerServices& fServices;
    SchemaCache fClasses;
    UpcallNesting fNesting;
    std::mutex fMutex; // guards fWarnings
    std::unordered_set<std::string> fWarnings;
};

} // namespace Pegasus::cmpi
