#include "pegasus/server/admin/Config.h"

#include <cstdlib>

namespace Pegasus::server {

Config::Config(const std::string& home) : fHome(home)
{
    for (const auto& [name, value] : readConfigFile(plannedConfigPath(home))) {
        const ConfigProperty* property = findConfigProperty(name);
        if (property != nullptr && isValidConfigValue(*property, value, fHome)) {
            fValues[name] = value;
        }
    }
}

const ConfigProperty& Config::require(const std::string& name, const std::string& value) const
{
    const ConfigProperty* property = findConfigProperty(name);
    if (property == nullptr) {
        throw ConfigError(ConfigError::Kind::kUnknownProperty, "Unrecognized config property: " + name);
    }
    if (!isValidConfigValue(*property, value, fHome)) {
        throw ConfigError(ConfigError::Kind::kInvalidValue, "Invalid property value: " + name + "=" + value);
    }
    return *property;
}

void Config::setFromCommandLine(const std::string& name, const std::string& value)
{
    require(name, value);
    const std::lock_guard<std::mutex> lock(fMutex);
    fValues[name] = value;
    ++fGeneration;
}

void Config::setCurrent(const std::string& name, const std::string& value)
{
    const ConfigProperty* property = findConfigProperty(name);
    if (property != nullptr && !property->dynamic) {
        throw ConfigError(ConfigError::Kind::kNotDynamic, "NonDynamic config property: " + name);
    }
    require(name, value);
    const std::lock_guard<std::mutex> lock(fMutex);
    fValues[name] = value;
    ++fGeneration;
    saveLocked();
}

void Config::resetCurrent(const std::string& name)
{
    const ConfigProperty* property = findConfigProperty(name);
    setCurrent(name, property != nullptr ? property->defaultValue : "");
}

void Config::setPlanned(const std::string& name, const std::string& value)
{
    require(name, value);
    const std::lock_guard<std::mutex> lock(fMutex);
    ConfigValues values = readConfigFile(plannedConfigPath(fHome));
    values[name] = value;
    writeConfigFile(plannedConfigPath(fHome), values);
}

void Config::resetPlanned(const std::string& name)
{
    if (findConfigProperty(name) == nullptr) {
        throw ConfigError(ConfigError::Kind::kUnknownProperty, "Unrecognized config property: " + name);
    }
    const std::lock_guard<std::mutex> lock(fMutex);
    ConfigValues values = readConfigFile(plannedConfigPath(fHome));
    if (values.erase(name) != 0) {
        writeConfigFile(plannedConfigPath(fHome), values);
    }
}

void Config::save() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    saveLocked();
}

void Config::saveLocked() const
{
    writeConfigFile(currentConfigPath(fHome), fValues);
}

std::string Config::text(const std::string& name) const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    const auto found = fValues.find(name);
    return found != fValues.end() ? found->second : findConfigProperty(name)->defaultValue;
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
    const ConfigValues values = readConfigFile(plannedConfigPath(fHome));
    const auto found = values.find(name);
    return found != values.end() ? found->second : findConfigProperty(name)->defaultValue;
}

} // namespace Pegasus::server
