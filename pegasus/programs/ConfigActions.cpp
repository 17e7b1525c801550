// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/programs/ConfigCommand.h"
#include "pegasus/server/admin/Config.h"

#include <Pegasus/Client/CIMClient.h>

#include <iostream>
#include <optional>

namespace Pegasus::programs {

namespace {

const char* const kNamespace = "root/PG_Internal";
const char* const kClass = "PG_ConfigSetting";
constexpr Uint32 kTimeoutMs = 60'000;

CIMObjectPath pathOf(const std::string& name)
{
    Array<CIMKeyBinding> keys;
    keys.append(CIMKeyBinding(CIMName("PropertyName"), String(name.c_str()), CIMKeyBinding::STRING));
    return CIMObjectPath(String(), CIMNamespaceName(), CIMName(kClass), keys);
}

std::string textOf(const CIMInstance& instance, const char* property)
{
    const Uint32 position = instance.findProperty(CIMName(property));
    return position == PEG_NOT_FOUND ? "" : base::utf8(instance.getProperty(position).getValue().toString());
}

bool connect(CIMClient& client)
try {
    client.setTimeout(kTimeoutMs);
    client.connectLocal();
    return true;
} catch (const CannotConnectException&) {
    return false;
}

void addBoolean(Array<CIMParamValue>& arguments, const char* name, bool value)
{
    arguments.append(CIMParamValue(String(name), CIMValue(Boolean(value))));
}

void updateOnServer(CIMClient& client, const ConfigCommand& command)
{
    Array<CIMParamValue> in;
    Array<CIMParamValue> out;
    in.append(CIMParamValue(String("PropertyValue"), CIMValue(String(command.value.c_str()))));
    addBoolean(in, "ResetValue", command.action == ConfigCommand::Action::kReset);
    addBoolean(in, "SetPlannedValue", command.planned);
    addBoolean(in, "SetCurrentValue", command.current);
    in.append(CIMParamValue(String("TimeoutPeriod"), CIMValue(Uint32(20))));
    client.invokeMethod(CIMNamespaceName(kNamespace), pathOf(command.name), CIMName("UpdatePropertyValue"), in, out);
}

int reportServerError(const CIMException& error, bool whileSetting)
{
    const std::string text = base::utf8(error.getMessage());
    switch (error.getCode()) {
    case CIM_ERR_NOT_FOUND:
        std::cout << "Specified property name was not found.\n";
        break;
    case CIM_ERR_NOT_SUPPORTED:
        std::cout << "Specified property can not be modified.\n";
        break;
    case CIM_ERR_INVALID_NAMESPACE:
        if (!whileSetting) {
            std::cout << "Failed to get the config property." << text << "\n";
            return 1;
        }
        break;
    default:
        std::cout << (whileSetting ? "Failed to set the config property." : "Failed to get the config property.")
                  << text << "\n";
        return 1;
    }
    std::cerr << text << "\n";
    return 1;
}

void printOutcome(const char* kind, const ConfigCommand& command, const std::string& value)
{
    std::cout << kind << " value for the property " << command.name << " is set to \"" << value << "\" in CIMServer.\n";
}

std::string newValue(const ConfigCommand& command)
{
    const server::ConfigProperty* property = server::findConfigProperty(command.name);
    return command.action == ConfigCommand::Action::kReset && property != nullptr ? property->defaultValue
                                                                                  : command.value;
}

int setCurrent(const ConfigCommand& command)
{
    CIMClient client;
    if (!connect(client)) {
        std::cout << "Current value for the property '" << command.name
                  << "' can not be set because the CIM server is not running.\n";
        return 1;
    }
    try {
        updateOnServer(client, command);
    } catch (const CIMException& error) {
        return reportServerError(error, true);
    }
    printOutcome("Current", command, newValue(command));
    return 0;
}

int setPlanned(const ConfigCommand& command, const std::string& home)
try {
    server::Config config(home);
    if (command.action == ConfigCommand::Action::kReset) {
        config.resetPlanned(command.name);
    } else {
        config.setPlanned(command.name, command.value);
    }
    printOutcome("Planned", command, newValue(command));
    return 0;
} catch (const server::ConfigError& error) {
    if (error.kind() == server::ConfigError::Kind::kUnknownProperty) {
        std::cout << "Specified property name was not found.\n";
        std::cerr << "CIM_ERR_NOT_FOUND: Configuration property \"" << command.name << "\"\n";
    } else {
        std::cout << "Failed to set the config property.\n" << error.what() << "\n";
    }
    return 1;
}

// Returns: the running server's values; empty if the server is stopped.
std::optional<Array<CIMInstance>> serverSettings()
{
    CIMClient client;
    if (!connect(client)) {
        return std::nullopt;
    }
    return client.enumerateInstances(CIMNamespaceName(kNamespace), CIMName(kClass));
}

int printCurrent(const std::string& name)
{
    CIMClient client;
    if (!connect(client)) {
        std::cout << "Current value can not be determined because the CIM server is not running.\n";
        return 1;
    }
    try {
        const CIMInstance setting = client.getInstance(CIMNamespaceName(kNamespace), pathOf(name), false);
        std::cout << "Current value: " << textOf(setting, "CurrentValue") << "\n";
        return 0;
    } catch (const CIMException& error) {
        return reportServerError(error, false);
    }
}

int listCurrent()
try {
    const std::optional<Array<CIMInstance>> settings = serverSettings();
    if (!settings) {
        std::cout << "Current values can not be listed because the CIM server is not running.\n";
        return 1;
    }
    for (Uint32 i = 0; i < settings->size(); ++i) {
        std::cout << textOf((*settings)[i], "PropertyName") << "=" << textOf((*settings)[i], "CurrentValue") << "\n";
    }
    return 0;
} catch (const CIMException& error) {
    std::cout << "Failed to list the config properties. \n";
    std::cerr << base::utf8(error.getMessage()) << "\n";
    return 1;
}

int listPlanned(const std::string& home)
{
    const server::ConfigValues values = server::readConfigFile(server::plannedConfigPath(home));
    if (values.empty()) {
        std::cout << "No configuration properties found in the configuration file.\n";
    }
    for (const auto& [name, value] : values) {
        std::cout << name << "=" << value << "\n";
    }
    return 0;
}

int listMeanings()
{
    for (const server::ConfigProperty& property : server::configTable()) {
        std::cout << property.name << " (default " << property.defaultValue << ") " << property.meaning
                  << (property.dynamic ? "" : "; at start only") << "\n";
    }
    return 0;
}

} // namespace

int setProperty(const ConfigCommand& command, const std::string& home)
{
    int status = 0;
    if (command.planned) {
        status = setPlanned(command, home);
    }
    if (status == 0 && (command.current || !command.planned)) {
        ConfigCommand onServer = command;
        onServer.current = true;
        onServer.planned = false;
        status = setCurrent(onServer);
    }
    return status;
}

int getProperty(const ConfigCommand& command, const std::string& home)
{
    const server::ConfigProperty* property = server::findConfigProperty(command.name);
    if (property == nullptr) {
        std::cout << "Specified property name was not found.\n";
        std::cerr << "CIM_ERR_NOT_FOUND: Configuration property \"" << command.name << "\"\n";
        return 1;
    }
    int status = 0;
    if (command.current || (!command.planned && !command.defaults)) {
        status = printCurrent(command.name);
    }
    if (command.planned) {
        std::cout << "Planned value: " << server::Config(home).planned(command.name) << "\n";
    }
    if (command.defaults) {
        std::cout << "Default value: " << property->defaultValue << "\n";
    }
    return status;
}

int listProperties(const ConfigCommand& command, const std::string& home)
{
    if (command.planned) {
        return listPlanned(home);
    }
    return command.current ? listCurrent() : listMeanings();
}

} // namespace Pegasus::programs
