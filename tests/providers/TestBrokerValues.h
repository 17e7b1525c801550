// SPDX-License-Identifier: MIT
#pragma once

#include "tests/providers/TestBroker.h"

#include <cmpi/cmpi.h>

namespace lnx {

// Returns: a value as the provider passes it. An unknown type leaves it null, with that type.
BrokerValue read(const CMPIValue* value, CMPIType type);

CMPIStatus setValue(BrokerValues& values, const char* name, const CMPIValue* value, CMPIType type);

// Returns: the value as data; its text or path is an object of the frame.
CMPIData dataOf(TestBroker& owner, const BrokerValues& values, const char* name, CMPIStatus* rc, CMPIrc missing);

} // namespace lnx
