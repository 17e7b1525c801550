// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/ArrayImpl.h"
#include "pegasus/common/RepPointerImpl.h"

#include <Pegasus/Common/CIMObjectPath.h>

namespace Pegasus {

struct CIMKeyBindingRep : RefCounted
{
    CIMName fName;
    String fValue;
    CIMKeyBinding::Type fType = CIMKeyBinding::BOOLEAN;
};

struct CIMObjectPathRep : RefCounted
{
    String fHost;
    CIMNamespaceName fNameSpace;
    CIMName fClassName;
    Array<CIMKeyBinding> fKeys;
};

struct PathAccess
{
    // Returns: a local path whose keys stay in the order given, in which they are to be written.
    // Requires: nothing compares it, since comparing expects the keys sorted.
    static CIMObjectPath inOrder(const CIMName& className, const Array<CIMKeyBinding>& keys)
    {
        auto* rep = new CIMObjectPathRep();
        rep->fClassName = className;
        rep->fKeys = keys;
        CIMObjectPath path;
        path.fRep = RepPointer<CIMObjectPathRep>(rep);
        return path;
    }
};

} // namespace Pegasus
