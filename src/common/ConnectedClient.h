#pragma once

#include <Pegasus/Client/CIMClient.h>

namespace NKOLVRX20 {

// Returns: the client of a namespace or a provider.
// Throws: Pegasus::NotConnectedException when it was never connected, so that a caller's handler for a failed call
// answers for this too.
template <typename TOwner> Pegasus::CIMClient& ConnectedClient(const TOwner& owner)
{
    if (!owner.isConnected()) {
        throw Pegasus::NotConnectedException();
    }
    return *owner.getPegClient();
}

} // namespace NKOLVRX20
