// SPDX-License-Identifier: MIT
#include "host/core/TNamespaceProviderManager.h"

#include <host/INamespaceProvider.h>

#include <algorithm>

namespace NKOLVRX20 {

void TNamespaceProviderManager::RegisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider)
{
    if (!provider) {
        return;
    }
    const std::lock_guard<std::mutex> lock(fMutex);
    if (std::find(fProviders.begin(), fProviders.end(), provider) == fProviders.end()) {
        fProviders.push_back(provider);
    }
}

void TNamespaceProviderManager::UnregisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fProviders.erase(std::remove(fProviders.begin(), fProviders.end(), provider), fProviders.end());
}

boost::shared_ptr<INamespaceProvider> TNamespaceProviderManager::GetNamespaceProvider(const std::string& name) const
{
    const auto providers = Snapshot();
    // The latest registration of a name wins: a library that was loaded again replaces its earlier copy.
    for (auto provider = providers.rbegin(); provider != providers.rend(); ++provider) {
        if ((*provider)->GetName(TCIMContext()) == name) {
            return *provider;
        }
    }
    return boost::shared_ptr<INamespaceProvider>();
}

std::vector<boost::shared_ptr<INamespaceProvider>> TNamespaceProviderManager::Snapshot() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fProviders;
}

} // namespace NKOLVRX20
