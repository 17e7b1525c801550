// SPDX-License-Identifier: MIT
#pragma once

#include <map>
#include <string>

namespace Pegasus::server {

using ConfigValues = std::map<std::string, std::string>;

// The two files that keep the configuration under the home directory: "name=value" lines, `#` begins a comment line.
// The planned file holds what the next server will use, the current one what the running server uses.
// Thread: any.
inline std::string plannedConfigPath(const std::string& home)
{
    return home + "/cimserver_planned.conf";
}
inline std::string currentConfigPath(const std::string& home)
{
    return home + "/cimserver_current.conf";
}

// Returns: the values. Only "name=value" lines within the first 64 KB count. Empty when the file is missing, or when
// readOwnFile() refuses it.
ConfigValues readConfigFile(const std::string& path);

// Replaces the file. Throws: std::system_error.
void writeConfigFile(const std::string& path, const ConfigValues& values);

// Returns: PEGASUS_HOME, else the folder above that of the running program.
std::string defaultHome();

} // namespace Pegasus::server
