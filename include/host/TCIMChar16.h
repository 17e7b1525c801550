#pragma once

#include <string>

namespace NKOLVRX20 {

// One UTF-16 code unit.
class TCIMChar16
{
  public:
    TCIMChar16() noexcept : fCode(0) {}
    explicit TCIMChar16(unsigned short code) noexcept : fCode(code) {}

    // Takes the code unit as unsigned decimal text ("65" is the letter A).
    // Throws: TVRXException 14 when the text is no decimal number or exceeds 65535.
    explicit TCIMChar16(const std::string& decimalText);

    unsigned short GetCode() const noexcept { return fCode; }

    bool operator==(const TCIMChar16& other) const noexcept { return fCode == other.fCode; }
    bool operator<(const TCIMChar16& other) const noexcept { return fCode < other.fCode; }

  private:
    unsigned short fCode;
};

} // namespace NKOLVRX20
