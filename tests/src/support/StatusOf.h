// SPDX-License-Identifier: MIT
#pragma once

#include <host/TVRXException.h>

namespace NKOLVRX20 {

// Returns: the status code that the call throws; 0 when it returns.
template <typename TCall> unsigned int StatusOf(TCall call)
{
    try {
        call();
        return 0;
    } catch (const TVRXException& exception) {
        return exception.GetStatusCode();
    }
}

} // namespace NKOLVRX20
