// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/module/ProviderInterfaces.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/module/ProviderLibrary.h"
#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/ContextObject.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>

namespace Pegasus::cmpi {
namespace {

CIMException noInterface(const ProviderLibrary& library, const std::string& provider, const char* kind,
                         CIMStatusCode code)
{
    return {code, base::fromUtf8Repaired("provider " + provider + " has no " + kind +
                                         " interface: " + library.missingFactories(kind, provider))};
}

template <typename Interface> CMPIrc end(Interface*& mi, const CMPIContext& context, bool terminating)
{
    if (mi == nullptr) {
        return CMPI_RC_OK;
    }
    const CMPIStatus status = mi->ft->cleanup != nullptr ? mi->ft->cleanup(mi, &context, terminating ? 1 : 0)
                                                         : CMPIStatus{CMPI_RC_OK, nullptr};
    const bool mayStay = !terminating && (status.rc == CMPI_RC_DO_NOT_UNLOAD || status.rc == CMPI_RC_NEVER_UNLOAD);
    if (mayStay) {
        return status.rc;
    }
    mi = nullptr;
    return CMPI_RC_OK;
}

} // namespace

ProviderInterfaces::Use::Use(ProviderInterfaces& interfaces) : fInterfaces(interfaces)
{
    std::unique_lock lock(interfaces.fUseMutex);
    interfaces.fCleaned.wait(lock, [&] { return !interfaces.fIsCleaning; });
    ++interfaces.fUses;
}

ProviderInterfaces::Use::~Use()
{
    const std::lock_guard lock(fInterfaces.fUseMutex);
    --fInterfaces.fUses;
}

ProviderInterfaces::~ProviderInterfaces()
{
    for (auto& [name, provider] : fProviders) {
        cleanup(provider, true);
    }
}

template <typename Interface> Interface* ProviderInterfaces::make(const char* kind, const std::string& provider) const
{
    fLibrary.requireProvider(provider);
    const Frame frame;
    ContextObject context(fBroker);
    context.lifetime = Lifetime::kArgument;
    return fLibrary.create<Interface>(kind, provider, fBroker, context);
}

// Looks twice: while this thread waited for the factory's turn, another one may have made the interface.
// Returns: null when the library lacks a factory of that kind.
template <typename Interface>
Interface* ProviderInterfaces::obtain(Interface* Provider::*kept, const char* kind, const std::string& provider)
{
    const auto madeBefore = [&] {
        const std::lock_guard lock(fMakeMutex);
        return fProviders[provider].*kept;
    };
    if (Interface* mi = madeBefore()) {
        return mi;
    }
    const std::lock_guard factoryLock(fFactoryMutex);
    if (Interface* mi = madeBefore()) {
        return mi;
    }
    Interface* mi = make<Interface>(kind, provider);
    const std::lock_guard lock(fMakeMutex);
    fProviders[provider].*kept = mi;
    return mi;
}

CMPIInstanceMI& ProviderInterfaces::instance(const std::string& provider)
{
    CMPIInstanceMI* mi = obtain(&Provider::instance, "Instance", provider);
    if (mi == nullptr) {
        throw noInterface(fLibrary, provider, "Instance", CIM_ERR_NOT_SUPPORTED);
    }
    return *mi;
}

CMPIMethodMI& ProviderInterfaces::method(const std::string& provider)
{
    CMPIMethodMI* mi = obtain(&Provider::method, "Method", provider);
    if (mi == nullptr) {
        throw noInterface(fLibrary, provider, "Method", CIM_ERR_METHOD_NOT_AVAILABLE);
    }
    return *mi;
}

CMPIrc ProviderInterfaces::cleanup(Provider& provider, bool terminating)
{
    const Frame frame(std::make_shared<const CallOrigin>(CallOrigin{&fBroker, {}, {}}));
    ContextObject context(fBroker);
    context.lifetime = Lifetime::kArgument;
    const CMPIrc instance = end(provider.instance, context, terminating);
    const CMPIrc method = end(provider.method, context, terminating);
    return std::max(instance, method);
}

// Three steps: make new requests wait, clean up, let them go on. The requests' lock is held in the first and last only.
// A provider that wants to stay for ever is asked once.
ProviderModule::Cleanup ProviderInterfaces::cleanupWhenIdle()
{
    {
        const std::lock_guard lock(fUseMutex);
        if (fUses != 0 || fIsCleaning) {
            return ProviderModule::Cleanup::kBusy;
        }
        fIsCleaning = true;
    }
    CMPIrc worst = CMPI_RC_OK;
    {
        const std::lock_guard lock(fMakeMutex);
        if (!fNeverUnload) {
            for (auto& [name, provider] : fProviders) {
                worst = std::max(worst, cleanup(provider, false));
            }
        }
        fNeverUnload = fNeverUnload || worst == CMPI_RC_NEVER_UNLOAD;
        worst = fNeverUnload ? CMPI_RC_NEVER_UNLOAD : worst;
    }
    {
        const std::lock_guard lock(fUseMutex);
        fIsCleaning = false;
    }
    fCleaned.notify_all();
    return worst == CMPI_RC_NEVER_UNLOAD    ? ProviderModule::Cleanup::kNeverUnload
           : worst == CMPI_RC_DO_NOT_UNLOAD ? ProviderModule::Cleanup::kStayLoaded
                                            : ProviderModule::Cleanup::kReleased;
}

} // namespace Pegasus::cmpi
