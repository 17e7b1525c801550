#pragma once

#include <string>

namespace NKOLVRX20 {

// A CIM datetime: a time stamp "yyyymmddhhmmss.mmmmmmsutc" or an interval "ddddddddhhmmss.mmmmmm:000"
// (DSP0004, 5.2.4), kept as its 25 characters, asterisk fields included.
class TCIMDateTime
{
  public:
    // The zero interval.
    TCIMDateTime();

    // Throws: TVRXException 14 when the text has not the shape of a CIM datetime.
    explicit TCIMDateTime(const std::string& text);

    // Makes it an interval.
    // Throws: TVRXException 14 for more than 99999999 days, 23 hours, 59 minutes, 59 seconds or 999999 microseconds.
    void Set(unsigned int days, unsigned short hours, unsigned short minutes, unsigned short seconds,
             unsigned int microseconds);

    bool IsInterval() const;

    // Returns: the 25 characters.
    const std::string& ToString() const { return fText; }

    // Returns: the text for a person: "2026-11-21 04:15:00 +01:00" or "3 days 04:05:06".
    std::string ToUIString() const;

    bool operator==(const TCIMDateTime& other) const { return fText == other.fText; }
    bool operator<(const TCIMDateTime& other) const { return fText < other.fText; }

  private:
    std::string fText;
};

} // namespace NKOLVRX20
