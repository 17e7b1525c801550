// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace NKOLVRX20 {

// A CIM datetime (DSP0004, 5.2.4), kept as its 25 characters, asterisk fields included:
//   yyyymmddhhmmss.mmmmmmsutc   a time stamp; s is + or -, utc the offset from UTC in minutes
//   ddddddddhhmmss.mmmmmm:000   an interval
// The fields may exceed the calendar (month 13).
class TCIMDateTime
{
  public:
    // The zero interval.
    TCIMDateTime();

    // Throws: TVRXException 14 when the text does not have the shape of a CIM datetime.
    explicit TCIMDateTime(const std::string& text);

    // Makes it an interval.
    // Throws: TVRXException 14 for more than 99999999 days, 23 hours, 59 minutes, 59 seconds or 999999 microseconds.
    void Set(unsigned int days, unsigned short hours, unsigned short minutes, unsigned short seconds,
             unsigned int microseconds);

    // Returns: whether it is an interval, recognised by the colon.
    bool IsInterval() const;

    // Returns: the 25 characters.
    const std::string& ToString() const { return fText; }

    // Returns: the text for a person: "2026-11-21 04:15:00 +01:00" or "3 days 04:05:06"; the fraction of a second is
    // left out.
    std::string ToUIString() const;

    // By the characters. The order is that of time only between values of one kind and one offset.
    bool operator==(const TCIMDateTime& other) const { return fText == other.fText; }
    bool operator<(const TCIMDateTime& other) const { return fText < other.fText; }

  private:
    std::string fText;
};

} // namespace NKOLVRX20
