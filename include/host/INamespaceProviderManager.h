// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>

namespace NKOLVRX20 {

// The host's list of namespace providers. A plug-in enters itself when the host calls its Initialize, with the first
// operation, the only one that it uses.
// Ownership: the manager shares the providers until they are removed. A provider's code lies in the plug-in's library,
// so the host removes it before it unloads the library.
// Thread: safe.
class INamespaceProviderManager
{
  public:
    virtual ~INamespaceProviderManager() = default;

    // Enters the provider. One that is already there, and null, are ignored.
    virtual void RegisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider) = 0;

    // Removes the provider; an unknown one is ignored.
    virtual void UnregisterNamespaceProvider(boost::shared_ptr<INamespaceProvider> provider) = 0;

    // Returns: the provider whose GetName gives the name; the latest registered if several; null for an unknown name.
    virtual boost::shared_ptr<INamespaceProvider> GetNamespaceProvider(const std::string& name) const = 0;
};

} // namespace NKOLVRX20
