// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

#include <new>

namespace Pegasus::base {

String fromUtf8(std::string_view text)
{
    if (text.empty()) {
        return String();
    }
    if (text.size() >= PEG_NOT_FOUND) {
        throw std::bad_alloc();
    }
    return String(text.data(), static_cast<Uint32>(text.size()));
}

String fromUtf8Repaired(std::string_view text)
{
    try {
        return fromUtf8(text);
    } catch (const Exception&) {
        return fromUtf8(repairedUtf8(text));
    }
}

} // namespace Pegasus::base
