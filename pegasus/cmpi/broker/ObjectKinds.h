// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>

// A provider may ask the broker what an untyped pointer leads to.
namespace Pegasus::cmpi {

// Returns: the name of the object's CMPI type, "CMPIInstance" for example.
// Requires: `object` is null or one of the broker's objects, or the broker itself.
// Throws: CMPI_RC_ERR_INVALID_HANDLE for a null pointer or handle; CMPI_RC_ERR_INVALID_PARAMETER for another kind.
std::string_view kindOf(const void* object);

// Returns: the object for a log line: its address, its kind, and its text where it has one.
// Requires, Throws: as kindOf.
std::string describe(const void* object);

} // namespace Pegasus::cmpi
