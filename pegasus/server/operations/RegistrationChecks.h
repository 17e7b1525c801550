// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMInstance.h>

#include <string>
#include <vector>

namespace Pegasus::server {

// The namespace and the classes of provider registrations.
extern const char* const kInteropNamespace;
extern const char* const kModuleClass;
extern const char* const kProviderClass;
extern const char* const kCapabilitiesClass;

// What every registration of a class must have and may hold, whatever else is registered. The sentences are
// OpenPegasus's. Throws: CIMException with CIM_ERR_INVALID_PARAMETER, CIM_ERR_NOT_SUPPORTED or CIM_ERR_FAILED.
void checkModule(const CIMInstance& module);
void checkProvider(const CIMInstance& provider);
void checkCapabilities(const CIMInstance& capabilities);

// Returns: the property's value; empty if it is absent, null or of another type.
std::string stringProperty(const CIMConstInstance& instance, const char* name);
std::vector<std::string> stringsProperty(const CIMConstInstance& instance, const char* name);
std::vector<unsigned> numbersProperty(const CIMConstInstance& instance, const char* name);

} // namespace Pegasus::server
