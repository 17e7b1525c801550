// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/PathState.h"
#include "pegasus/cmpi/objects/TableFunction.h"

#include <Pegasus/Common/CIMObjectPath.h>

namespace Pegasus::cmpi {

// A CMPIObjectPath.
class ObjectPathObject final : public Owned, public CMPIObjectPath
{
  public:
    ObjectPathObject(Broker& owner, PathState path);
    ObjectPathObject(Broker& owner, const CIMObjectPath& path) : ObjectPathObject(owner, PathState(owner, path)) {}
    ObjectPathObject(const ObjectPathObject& other) : ObjectPathObject(other.broker, other.state) {}

    CIMObjectPath value() const { return state.withNameSpace(); }

    Broker& broker;
    PathState state;
    Lifetime lifetime = Lifetime::kFrame;
};

extern const CMPIObjectPathFT kObjectPathTable;

} // namespace Pegasus::cmpi
