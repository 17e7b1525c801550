#pragma once

#include <host/ICIMQualifierDecl.h>

#include <string>

namespace NKOLVRX20 {

// The host's bits for the words, separated by blanks, in which OpenPegasus writes flavors ("OVERRIDABLE TOSUBCLASS")
// and scopes ("CLASS ASSOCIATION"). Words that are not known do not count.
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
