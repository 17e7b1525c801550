// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/Config.h"

#include <cstdlib>

namespace Pegasus::server {

Config::Config(const std::string& home) : fHome(home)
{
    for (const auto& [name, value] : readConfigFile(plannedConfigPath(home))) {
        const ConfigProperty* property = findConfigProperty(name);
        if (property != nullptr && isValidConfigValue(*property, value, fHome)) {
            fValues[name] = value;
        } else {
            fIgnored.push_back(name + "=" + value);
        }
    }
}

const ConfigProperty& requireConfigProperty(const std::string& name)
{
    const ConfigProperty* property = findConfigProperty(name);
    if (property == nullptr) {
        throw ConfigError(ConfigError::Kind::kUnknownProperty, "Unrecognized config property: " + name);
    }
    return *property;
}

void Config::requireValid(const std::string& name, const std::string& value) const
{
    if (!isValidConfigValue(requireConfigProperty(name), value, fHome)) {
        throw ConfigError(ConfigError::Kind::kInvalidValue, "Invalid property value: " + name + "=" + value);
    }
}

void Config::setFromCommandLine(const std::string& name, const std::string& value)
{
    requireValid(name, value);
    const std::lock_guard<std::mutex> lock(fMutex);
    fValues[name] = value;
    ++fGeneration;
}

void Config::setCurrent(const std::string& name, const std::string& value)
{
    if (!requireConfigProperty(name).dynamic) {
        throw ConfigError(ConfigError::Kind::kNotDynamic, "NonDynamic config property: " + name);
    }
    requireValid(name, value);
    const std::lock_guard<std::mutex> lock(fMutex);
    ConfigValues values = fValues;
    values[name] = value;
    writeConfigFile(currentConfigPath(fHome), values); // a value that cannot be written does not take effect
    fValues = std::move(values);
    ++fGeneration;
}

void Config::resetCurrent(const std::string& name)
{
    setCurrent(name, requireConfigProperty(name).defaultValue);
}

void Config::setPlanned(const std::string& name, const std::string& value)
{
    requireValid(name, value);
    const std::lock_guard<std::mutex> lock(fMutex);
    ConfigValues values = readConfigFile(plannedConfigPath(fHome));
    values[name] = value;
    writeConfigFile(plannedConfigPath(fHome), values);
}

void Config::resetPlanned(const std::string& name)
{
    requireConfigProperty(name);
    const std::lock_guard<std::mutex> lock(fMutex);
    ConfigValues values = readConfigFile(plannedConfigPath(fHome));
    if (values.erase(name) != 0) {
        writeConfigFile(plannedConfigPath(fHome), values);
    }
}

void Config::save() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    writeConfigFile(currentConfigPath(fHome), fValues);
}

std::string Config::text(const std::string& name) const
{
    const ConfigProperty& property = requireConfigProperty(name);
    const std::lock_guard<std::mutex> lock(fMutex);
    const auto found = fValues.find(name);
    return found != fValues.end() ? found->second : property.defaultValue;
}

std::size_t Config::number(const std::string& name) const
{
    return std::strtoul(text(name).c_str(), nullptr, 10); // checked when it was set
}

std::chrono::seconds Config::seconds(const std::string& name) const
{
    return std::chrono::seconds(number(name));
}

std::vector<std::string> Config::directories(const std::string& name) const
{
    return splitDirectoryList(text(name), fHome);
}

std::string Config::planned(const std::string& name) const
{
    const ConfigProperty& property = requireConfigProperty(name);
    const ConfigValues values = readConfigFile(plannedConfigPath(fHome));
    const auto found = values.find(name);
    return found != values.end() ? found->second : property.defaultValue;
}

} // namespace Pegasus::server
