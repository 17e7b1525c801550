// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace NKOLVRX20 {

// One UTF-16 code unit, the CIM type char16. It may be half of a surrogate pair.
class TCIMChar16
{
  public:
    // The code unit 0.
    TCIMChar16() noexcept : fCode(0) {}
    explicit TCIMChar16(unsigned short code) noexcept : fCode(code) {}

    // Takes the code unit as unsigned decimal text ("65" is the letter A).
    // Here: values arrive in this way, as decimal text.
    // Throws: TVRXException 14 when the text is not a decimal number or exceeds 65535.
    explicit TCIMChar16(const std::string& decimalText);

    unsigned short GetCode() const noexcept { return fCode; }

    bool operator==(const TCIMChar16& other) const noexcept { return fCode == other.fCode; }
    bool operator<(const TCIMChar16& other) const noexcept { return fCode < other.fCode; }

  private:
    unsigned short fCode;
};

} // namespace NKOLVRX20
