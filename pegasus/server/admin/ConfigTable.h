// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

namespace Pegasus::server {

// One property of the server's configuration. Names are compared with regard to case.
struct ConfigProperty
{
    enum class Kind
    {
        kBoolean,
        kFalse,       // a facility that this server lacks: only "false" is accepted
        kPort,        // 1 to 65535
        kCount,       // 1 to 2^31-1
        kCountOrZero, // 0 to 2^31-1, 0 switches the facility off
        kConsumer,    // becomes a part of a file name
        kDirectory,
        kDirectoryList, // colon-separated, each below the home directory unless absolute, each readable
        kLogLevel,
        kCapabilities // as parseCapabilities() reads them
    };

    const char* name;
    const char* defaultValue;
    Kind kind;
    bool dynamic; // may be changed while the server runs
    const char* meaning;
};

// Every property, in the order in which they are listed.
const std::vector<ConfigProperty>& configTable();

// Returns: null for an unknown property.
const ConfigProperty* findConfigProperty(const std::string& name);

// Returns: whether a property may take a value; `home` is where relative directories start.
bool isValidConfigValue(const ConfigProperty& property, const std::string& value, const std::string& home);

// Returns: the entries of a directory list, relative ones below `home`; empty ones are left out.
std::vector<std::string> splitDirectoryList(const std::string& list, const std::string& home);

} // namespace Pegasus::server
