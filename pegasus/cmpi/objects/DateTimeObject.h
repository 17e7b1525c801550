// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/TableFunction.h"

#include <Pegasus/Common/CIMDateTime.h>

#include <memory>

namespace Pegasus::cmpi {

// A CMPIDateTime. Its binary form is in microseconds: since 1970, or the length of an interval.
class DateTimeObject final : public Owned, public CMPIDateTime
{
  public:
    explicit DateTimeObject(const CIMDateTime& value);
    DateTimeObject(const DateTimeObject& other) : DateTimeObject(other.fValue) {}

    const CIMDateTime& value() const { return fValue; }

    Lifetime lifetime = Lifetime::kFrame;
    std::shared_ptr<const bool> holder; // true while an array that was not used yet holds this; may be null

  private:
    CIMDateTime fValue;
};

extern const CMPIDateTimeFT kDateTimeTable;

// Throws: CMPI_RC_ERR_INVALID_PARAMETER for a time beyond CIM's range.
CIMDateTime dateTimeFromBinary(CMPIUint64 microseconds, bool isInterval);

// Throws: CMPI_RC_ERR_INVALID_PARAMETER for a malformed CIM datetime.
CIMDateTime dateTimeFromText(const char* text);

} // namespace Pegasus::cmpi
