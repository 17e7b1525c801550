// SPDX-License-Identifier: MIT
#pragma once

#include <cmpi/cmpi.h>

// Does, to an instance of Probe_Trap, what works on this project's broker and fails on OpenPegasus 2.14.
// Returns: the status of the call in question; CMPI_RC_ERR_NOT_FOUND for a kind that does not exist.
CMPIStatus doTrap(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path, const char* kind);
