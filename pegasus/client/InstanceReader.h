// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/instances/KnownInstances.h"

#include <Pegasus/Common/Array.h>
#include <Pegasus/Common/CIMInstance.h>

#include <string_view>

namespace Pegasus::client {

// Collects the instances of an answer, each a VALUE.NAMEDINSTANCE. What it learns of their tags stays in `known`, which
// must outlive it.
class InstanceReader
{
  public:
    explicit InstanceReader(wire::KnownInstances& known) : fKnown(known) { fKnown.beginAnswer(); }

    void read(const wire::XmlElement& element, wire::ElementDecoder& decoder)
    {
        const CIMInstance instance = decoder.decodeNamedInstance(element);
        fKnown.learn(element, instance);
        fInstances.append(instance);
    }

    wire::XmlOffer offer(std::string_view text, wire::ElementDecoder& decoder)
    {
        CIMInstance instance;
        const wire::XmlOffer offer = fKnown.take(text, instance);
        if (offer.result == wire::XmlOffer::Result::kTaken) {
            decoder.addDecodedBytes(fKnown.bytes());
            fInstances.append(instance);
        }
        return offer;
    }

    const Array<CIMInstance>& instances() const { return fInstances; }

  private:
    wire::KnownInstances& fKnown;
    Array<CIMInstance> fInstances;
};

} // namespace Pegasus::client
