// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/SchemaCache.h"

#include <Pegasus/Common/CIMName.h>

#include <list>
#include <mutex>
#include <string>

namespace Pegasus::cmpi {

// How deep the calls into a module are nested in upcalls of its own. An upcall leaves through the server and comes
// back as a request like any other, so a call counts as nested in the upcalls that wait for its class.
// Thread: all members may be called on any thread at any time.
class UpcallNesting
{
  public:
    // OpenPegasus 2.14 hangs from here on.
    static constexpr unsigned kHangs = 3;

    struct Pending
    {
        std::string nameSpace;
        std::string className;
        unsigned depth;
    };
    using Place = std::list<Pending>::iterator;

    // An upcall to a class begins in a call of depth `depth`, and ends.
    Place begin(const CIMNamespaceName& nameSpace, const CIMName& className, unsigned depth);
    void end(Place place);

    // Returns: the depth of a call for the class: 0 when no upcall waits for the class or a superclass.
    unsigned depthOf(SchemaCache& classes, const CIMNamespaceName& nameSpace, const CIMName& className) const;

  private:
    mutable std::mutex fMutex;
    std::list<Pending> fPending;
};

} // namespace Pegasus::cmpi
