// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Array.h>
#include <Pegasus/Common/RepPointer.h>
#include <Pegasus/Common/String.h>

PEGASUS_NAMESPACE_BEGIN

struct CIMDateTimeRep;
extern template class RepPointer<CIMDateTimeRep>;

// A CIM time stamp or interval in its 25-character form (DSP0004), with `*` for insignificant digits.
class PEGASUS_COMMON_LINKAGE CIMDateTime
{
  public:
    // The interval 00000000000000.000000:000.
    CIMDateTime() noexcept = default;
    // Throws: InvalidDateTimeFormatException (shape), DateTimeOutOfRangeException (a number).
    CIMDateTime(const String& str);
    // A time stamp counts from the beginning of year 0, in UTC. Throws: DateTimeOutOfRangeException.
    CIMDateTime(Uint64 microSec, Boolean isInterval);

    String toString() const;
    void set(const String& str);
    // Back to the default interval.
    void clear();

    static CIMDateTime getCurrentDateTime();
    // Returns: finish - start in microseconds. Throws: InvalidDateTimeFormatException when the kinds differ.
    static Sint64 getDifference(CIMDateTime startTime, CIMDateTime finishTime);

    Boolean isInterval() const;
    Boolean equal(const CIMDateTime& x) const;
    Uint64 toMicroSeconds() const;

    CIMDateTime operator+(const CIMDateTime& cdt) const;
    CIMDateTime& operator+=(const CIMDateTime& cdt);
    CIMDateTime operator-(const CIMDateTime& cdt) const;
    CIMDateTime& operator-=(const CIMDateTime& cdt);
    CIMDateTime operator*(Uint64 num) const;
    CIMDateTime& operator*=(Uint64 num);
    CIMDateTime operator/(Uint64 num) const;
    CIMDateTime& operator/=(Uint64 num);
    Uint64 operator/(const CIMDateTime& cdt) const;

    // Instants are compared in UTC. Throws: TypeMismatchException for an interval and a time stamp.
    Boolean operator<(const CIMDateTime& cdt) const;
    Boolean operator<=(const CIMDateTime& cdt) const;
    Boolean operator>(const CIMDateTime& cdt) const;
    Boolean operator>=(const CIMDateTime& cdt) const;
    Boolean operator!=(const CIMDateTime& cdt) const;

  private:
    RepPointer<CIMDateTimeRep> fRep;
};

PEGASUS_COMMON_LINKAGE Boolean operator==(const CIMDateTime& x, const CIMDateTime& y);

PEGASUS_NAMESPACE_END
