// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/common/StringRep.h"

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

// Returns: x.equal(y). Lists of members compare every pair of their names, and most differ at once.
inline bool sameName(const CIMName& x, const CIMName& y)
{
    const StringRep* const rep1 = StringAccess::rep(x.getString());
    const StringRep* const rep2 = StringAccess::rep(y.getString());
    const Uint32 size = rep1 != nullptr ? rep1->fSize : 0;
    if (rep1 == rep2) {
        return true; // equal names of one message share their text
    }
    if (size != (rep2 != nullptr ? rep2->fSize : 0)) {
        return false;
    }
    // From the end: the names in one class begin alike more often than they end alike.
    for (Uint32 i = size; i > 0; --i) {
        if (base::lowerAscii(rep1->units()[i - 1]) != base::lowerAscii(rep2->units()[i - 1])) {
            return false;
        }
    }
    return true;
}

} // namespace Pegasus
