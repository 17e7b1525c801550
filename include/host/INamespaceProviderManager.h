#pragma once

#include <host/HostFwd.h>

namespace NKOLVRX20 {

// The host's list of namespace providers. A plug-in enters itself when the host calls its Initialize.
// Ownership: the manager shares the providers until they are removed.
// Thread: safe.
class INamespaceProviderManager
{
  public:
    virtual ~INamespaceProviderManager() = default;

    virtual void RegisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider) = 0;

    // Lets a plug-in go, so that its library can be unloaded. Nothing happens when it is not registered.
    virtual void UnregisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider) = 0;

    // Returns: the provider whose GetName gives the name; the latest registered if several; null when there is none.
    virtual boost::shared_ptr<INamespaceProvider> GetNamespaceProvider(const std::string& name) const = 0;
};

} // namespace NKOLVRX20
