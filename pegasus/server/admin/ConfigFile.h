#pragma once

#include <map>
#include <string>

namespace Pegasus::server {

using ConfigValues = std::map<std::string, std::string>;

// The two files that keep the configuration under the home directory: "name=value" lines, `#` begins a comment line.
// The planned file holds what the next server takes over; the current one what the running server has.
inline std::string plannedConfigPath(const std::string& home)
{
    return home + "/cimserver_planned.conf";
}
inline std::string currentConfigPath(const std::string& home)
{
    return home + "/cimserver_current.conf";
}

// Lines that are no "name=value", and everything beyond 64 KB, are left out; a missing file is empty.
ConfigValues readConfigFile(const std::string& path);

// Throws: std::system_error.
void writeConfigFile(const std::string& path, const ConfigValues& values);

// PEGASUS_HOME, else the folder above that of the running program.
std::string defaultHome();

} // namespace Pegasus::server
