// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/operations/ServerInstances.h"

namespace Pegasus::server {

// PG_ConfigSetting in root/PG_Internal: the server's configuration as instances, and the method that changes it.
bool isConfigClass(const CIMNamespaceName& nameSpace, const CIMName& className);

// Properties PropertyName, DefaultValue, CurrentValue, PlannedValue, Description, DynamicProperty.
std::unique_ptr<ServerInstances> makeConfigInstances(const ServerCore& core);

// UpdatePropertyValue(PropertyValue, ResetValue, SetCurrentValue, SetPlannedValue).
// Throws: CIMException: CIM_ERR_NOT_FOUND (unknown property), CIM_ERR_NOT_SUPPORTED (fixed while the server runs),
// CIM_ERR_FAILED (illegal value, or writing the file failed), CIM_ERR_METHOD_NOT_AVAILABLE.
CIMValue invokeConfigMethod(ServerCore& core, const CimRequest& request);

} // namespace Pegasus::server
