// SPDX-License-Identifier: MIT
#pragma once

#include <cmpi/cmpi.h>

// Carries out a method that is about the agent's process: what it may use, what it prints and starts, how it ends.
// Returns: the method's status; CMPI_RC_ERR_METHOD_NOT_FOUND for another method.
CMPIStatus doInProcess(const CMPIBroker* broker, const CMPIResult* result, const char* method);
