// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>

PEGASUS_NAMESPACE_BEGIN

// One UTF-16 code unit. A stream shows its decimal code.
class PEGASUS_COMMON_LINKAGE Char16
{
  public:
    Char16() : fCode(0) {}
    Char16(Uint16 code) : fCode(code) {}
    Char16(const Char16& other) = default;

    Char16& operator=(Uint16 code)
    {
        fCode = code;
        return *this;
    }
    Char16& operator=(const Char16& other) = default;
    operator Uint16() const { return fCode; }

  private:
    Uint16 fCode;
};

inline Boolean operator==(const Char16& left, const Char16& right)
{
    return Uint16(left) == Uint16(right);
}
inline Boolean operator==(const Char16& left, char right)
{
    return Uint16(left) == static_cast<unsigned char>(right);
}
inline Boolean operator==(char left, const Char16& right)
{
    return right == left;
}
inline Boolean operator!=(const Char16& left, const Char16& right)
{
    return !(left == right);
}
inline Boolean operator!=(const Char16& left, char right)
{
    return !(left == right);
}
inline Boolean operator!=(char left, const Char16& right)
{
    return !(right == left);
}

PEGASUS_NAMESPACE_END
