// SPDX-License-Identifier: MIT
// The attributes of a declaration: its type, and the flavors and scopes of qualifiers.
#pragma once

#include <host/ICIMQualifierDecl.h>
#include <host/TCIMValue.h>

#include <string>

namespace NKOLVRX20 {

// Returns: the type of a declaration with this default value: the scalar code, or the array code of an array.
inline TCIMValue::TCIMType DeclaredType(const TCIMValue& defaultValue)
{
    const auto offset = defaultValue.IsArray() ? TCIMValue::TCIMType::kArrayOffset : TCIMValue::TCIMType::kNone;
    return TCIMValue::TCIMType::ECIMType(defaultValue.GetType() + offset);
}

// Return the host's bits for the words, separated by blanks, in which OpenPegasus writes flavors
// ("OVERRIDABLE TOSUBCLASS") and scopes ("CLASS ASSOCIATION"). Unknown words are skipped.
ICIMQualifierDecl::EFlavor FlavorFromText(const std::string& text);
ICIMQualifierDecl::EScope ScopeFromText(const std::string& text);

template <typename TBits> TBits WithBits(TBits bits, TBits added)
{
    return static_cast<TBits>(static_cast<unsigned int>(bits) | static_cast<unsigned int>(added));
}

template <typename TBits> TBits WithoutBits(TBits bits, TBits removed)
{
    return static_cast<TBits>(static_cast<unsigned int>(bits) & ~static_cast<unsigned int>(removed));
}

} // namespace NKOLVRX20
