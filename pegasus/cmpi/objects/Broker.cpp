// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/Broker.h"

#include "pegasus/cmpi/objects/TableFunction.h"

namespace Pegasus::cmpi {
namespace {

constexpr std::size_t kMaxWarnings = 1000;

} // namespace

Broker::Broker(BrokerServices& services, const BrokerTables& tables)
    : CMPIBroker{this, &tables.upcalls, &tables.factories, &tables.threads, &tables.memory}, fServices(services),
      fClasses(services)
{
}

Broker& Broker::of(const CMPIBroker* broker)
{
    if (broker == nullptr || broker->hdl == nullptr) {
        throw CmpiError{CMPI_RC_ERR_INVALID_HANDLE, {}};
    }
    // By the handle: some providers keep a copy of the structure.
    return *static_cast<Broker*>(const_cast<void*>(broker->hdl));
}

void Broker::warnOnce(const std::string& text)
{
    {
        const std::lock_guard lock(fMutex);
        if (fWarnings.size() >= kMaxWarnings || !fWarnings.insert(text).second) {
            return;
        }
    }
    fServices.log(BrokerServices::Severity::kWarning, text);
}

} // namespace Pegasus::cmpi
