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
    if (broker == nullptr)
        throw SlotError{CMPI_RC_ERR_INVALID_HANDLE, {}};
    return const_cast<Broker&>(static_cast<const Broker&>(*broker));
}

void Broker::warnOnce(const std::string& text)
{
    {
        const std::lock_guard lock(fMutex);
        if (fWarnings.size() >= kMaxWarnings || !fWarnings.insert(text).second)
            return;
    }
    fServices.log(BrokerServices::Severity::kWarning, text);
}

} // namespace Pegasus::cmpi
