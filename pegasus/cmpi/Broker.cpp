#include "pegasus/cmpi/Broker.h"

#include "pegasus/cmpi/Slot.h"

namespace Pegasus::cmpi {
namespace {

constexpr std::size_t kMaxWarnings = 1000;

} // namespace

Broker::Broker(BrokerServices& services)
    : CMPIBroker{this, &kUpcallTable, &kFactoryTable, &kThreadTable, &kMemoryTable}, fServices(services),
      fClasses(services)
{
}

Broker& Broker::of(const CMPIBroker* broker)
{
    if (broker == nullptr || broker->hdl == nullptr) {
        throw SlotError{CMPI_RC_ERR_INVALID_HANDLE, {}};
    }
    return *static_cast<Broker*>(
        const_cast<void*>(broker->hdl)); // by the handle: some providers keep a copy of the object
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
