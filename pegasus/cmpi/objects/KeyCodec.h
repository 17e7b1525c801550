// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMValue.h>
#include <cmpi/cmpi.h>

// Keys of object paths. A path's text drops the width of an integer and shows a datetime or reference as a string, so
// a key's value is widened on the way to the provider, and takes its declared type on the way back.
namespace Pegasus::cmpi {

class Broker;

// Returns: the key for a provider: integers of every width as 64 bits (CMPI_keyInteger), state CMPI_keyValue.
// Ownership: objects in it belong to the current frame.
CMPIData encodeKey(Broker& broker, const CIMValue& value);

bool isInteger(CIMType type);

// Converts a key's value to `type`: between integers of any width and char16, and from a string to a datetime or a
// reference.
// Returns: a null of `type` when the conversion fails.
CIMValue convertKey(const CIMValue& value, CIMType type);

} // namespace Pegasus::cmpi
