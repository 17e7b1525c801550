// SPDX-License-Identifier: MIT
#pragma once

#include <host/INamespaceProviderManager.h>

#include <mutex>
#include <vector>

namespace NKOLVRX20 {

// The process's one namespace-provider manager.
// Thread: safe. Operations of a provider are called after the lock is released, so they may call the manager.
class TNamespaceProviderManager : public INamespaceProviderManager
{
  public:
    void RegisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider) override;
    void UnregisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider) override;
    boost::shared_ptr<INamespaceProvider> GetNamespaceProvider(const std::string& name) const override;

  private:
    std::vector<boost::shared_ptr<INamespaceProvider>> Snapshot() const;

    mutable std::mutex fMutex;
    std::vector<boost::shared_ptr<INamespaceProvider>> fProviders; // in the order of registration
};

} // namespace NKOLVRX20
