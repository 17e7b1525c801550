// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

#include <string_view>

namespace Pegasus::repository {

// Throws: CIMException with the status code and the UTF-8 text as its message.
[[noreturn]] inline void fail(CIMStatusCode code, std::string_view text)
{
    throw CIMException(code, base::fromUtf8(text));
}

} // namespace Pegasus::repository
