// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/NamedValues.h"

#include <Pegasus/Common/CIMParamValue.h>

namespace Pegasus::cmpi {

// A CMPIArgs: a method's input or output parameters.
class ArgsObject final : public Owned, public CMPIArgs
{
  public:
    explicit ArgsObject(Broker& owner);
    // Takes the parameters as they came, repeated and wrongly typed ones included: the provider judges them. References
    // without a namespace get `nameSpace`.
    ArgsObject(Broker& owner, const Array<CIMParamValue>& parameters, const CIMNamespaceName& nameSpace);
    ArgsObject(const ArgsObject& other) : ArgsObject(other.broker) { values = other.values; }

    Array<CIMParamValue> parameters() const;

    Broker& broker;
    NamedValues values;
    Lifetime lifetime = Lifetime::kFrame;
};

extern const CMPIArgsFT kArgsTable;

} // namespace Pegasus::cmpi
