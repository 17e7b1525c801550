// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/NamedValues.h"
#include "pegasus/cmpi/services/ProviderRequest.h"

#include <memory>
#include <string>

namespace Pegasus::cmpi {

// A CMPIContext: named facts about a call, which the provider reads and passes on to upcalls.
class ContextObject final : public Owned, public CMPIContext
{
  public:
    // An empty context, for factories and cleanup functions.
    explicit ContextObject(Broker& owner);
    // `depth`: of the call, as UpcallNesting counts.
    ContextObject(Broker& owner, const ProviderRequest& request, unsigned depth);
    ContextObject(const ContextObject& other) : ContextObject(other.broker)
    {
        values = other.values;
        origin = other.origin;
    }

    // Returns: the text of a string entry, or "".
    std::string text(const char* name) const;

    Broker& broker;
    NamedValues values;
    Lifetime lifetime = Lifetime::kFrame;
    std::shared_ptr<const CallOrigin> origin; // of the request; null in an empty context
    // Set in a context that was prepared for another thread: that thread's frame, while it is attached.
    std::unique_ptr<Frame> threadFrame;
};

extern const CMPIContextFT kContextTable;

} // namespace Pegasus::cmpi
