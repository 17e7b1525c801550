// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/Broker.h"

namespace Pegasus::cmpi {

// A broker's four function tables, one source file each.
extern const CMPIBrokerFT kUpcallTable;     // the operations that providers call back, and attaching threads
extern const CMPIBrokerEncFT kFactoryTable; // objects, their kinds, messages and the log
extern const CMPIBrokerExtFT kThreadTable;  // threads, mutexes and conditions
extern const CMPIBrokerMemFT kMemoryTable;  // memory and objects that end with a frame

inline BrokerTables brokerTables()
{
    return {kUpcallTable, kFactoryTable, kThreadTable, kMemoryTable};
}

} // namespace Pegasus::cmpi
