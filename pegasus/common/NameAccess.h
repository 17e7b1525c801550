// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/Exception.h>

namespace Pegasus {

// Returns: the name. Throws: UninitializedObjectException when it is null.
inline const CIMName& notNull(const CIMName& name)
{
    if (name.isNull()) {
        throw UninitializedObjectException();
    }
    return name;
}

} // namespace Pegasus
