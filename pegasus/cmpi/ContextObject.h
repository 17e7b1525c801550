#pragma once

#include "pegasus/cmpi/NamedValues.h"

#include <memory>
#include <string>

namespace Pegasus::cmpi {

struct ProviderRequest;

// A CMPIContext: what a call is about, for the provider to read and to hand on to upcalls.
class ContextObject final : public Owned, public CMPIContext
{
  public:
    // An empty context, as factories and clean-ups get it.
    explicit ContextObject(Broker& owner);
    ContextObject(Broker& owner, const ProviderRequest& request);
    ContextObject(const ContextObject& other) : ContextObject(other.broker) { values = other.values; }

    // Returns: the text of a string entry, or "".
    std::string text(const char* name) const;

    Broker& broker;
    NamedValues values;
    Lifetime lifetime = Lifetime::kFrame;
    // Of a context that was prepared for another thread: that thread's frame, while it is attached.
    std::unique_ptr<Frame> threadFrame;
};

extern const CMPIContextFT kContextTable;

} // namespace Pegasus::cmpi
