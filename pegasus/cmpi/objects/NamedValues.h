// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/ValueCodec.h"

#include <cstddef>
#include <string_view>
#include <vector>

namespace Pegasus::cmpi {

// An ordered list of named values, as contexts and arguments are. Names are found in any case.
class NamedValues
{
  public:
    // Appends; a value of the same name goes.
    // Throws: CMPI_RC_ERR_INVALID_PARAMETER for an illegal name; also as decodeValue.
    void set(const char* name, const CMPIValue* value, CMPIType type);
    // Makes room for so many values.
    void reserve(std::size_t count) { fValues.reserve(count); }
    // Appends, even when the name is there already; find() then returns the first one.
    void append(const CIMName& name, const CIMValue& value) { fValues.push_back({name, value}); }

    // Returns: the value of that name, or null.
    const CIMValue* find(std::string_view name) const;
    const std::vector<NamedValue>& all() const { return fValues; }

    // Throws: CMPI_RC_ERR_NO_SUCH_PROPERTY.
    CMPIData get(Broker& broker, const char* name) const;
    // `name` may be null.
    CMPIData getAt(Broker& broker, CMPICount index, CMPIString** name) const;

  private:
    std::vector<NamedValue> fValues;
};

// Returns: a string for the name argument of the "get ... at" functions.
// Ownership: the current frame's.
CMPIString* makeName(const CIMName& name);

} // namespace Pegasus::cmpi
