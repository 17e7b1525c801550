#pragma once

#include "pegasus/cmpi/BrokerServices.h"
#include "pegasus/cmpi/ClassCache.h"
#include "pegasus/cmpi/include/cmpi/cmpi.h"

#include <mutex>
#include <string>
#include <unordered_set>

namespace Pegasus::cmpi {

// The CMPIBroker that the providers of one library see. They keep its address, so it lives as long as the library is
// loaded. Thread: all members.
class Broker final : public CMPIBroker
{
  public:
    explicit Broker(BrokerServices& services);
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    BrokerServices& services() const { return fServices; }
    ClassCache& classes() { return fClasses; }

    // Logs a provider's mistake the first time: providers repeat theirs for every instance. The memory of what was said
    // is bounded; beyond that, mistakes go unlogged.
    void warnOnce(const std::string& text);

    // Requires: the provider passed a broker that it was given, or a copy of it.
    // Throws: CMPI_RC_ERR_INVALID_HANDLE for null.
    static Broker& of(const CMPIBroker* broker);

  private:
    BrokerServices& fServices;
    ClassCache fClasses;
    std::mutex fMutex;
    std::unordered_set<std::string> fWarnings;
};

// The broker's four tables, one file each.
extern const CMPIBrokerFT kUpcallTable;
extern const CMPIBrokerEncFT kFactoryTable;
extern const CMPIBrokerExtFT kThreadTable;
extern const CMPIBrokerMemFT kMemoryTable;

} // namespace Pegasus::cmpi
