#pragma once

#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// Returns: the type that a declaration with this default has: the scalar code, or the array code of an array.
inline TCIMValue::TCIMType DeclaredType(const TCIMValue& defaultValue)
{
    const auto offset = defaultValue.IsArray() ? TCIMValue::TCIMType::kArrayOffset : TCIMValue::TCIMType::kNone;
    return TCIMValue::TCIMType::ECIMType(defaultValue.GetType() + offset);
}

} // namespace NKOLVRX20
