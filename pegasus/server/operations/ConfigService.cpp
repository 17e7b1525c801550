// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/ConfigService.h"

#include "pegasus/base/Text.h"
#include "pegasus/server/admin/Log.h"

#include <system_error>

namespace Pegasus::server {

namespace {

const char* const kConfigNamespace = "root/PG_Internal";
const char* const kConfigClass = "PG_ConfigSetting";

CIMProperty stringPropertyOf(const char* name, const std::string& value)
{
    return CIMProperty(CIMName(name), CIMValue(String(value.c_str())));
}

CIMObjectPath settingPath(const char* name)
{
    Array<CIMKeyBinding> keys;
    keys.append(CIMKeyBinding(CIMName("PropertyName"), String(name), CIMKeyBinding::STRING));
    return CIMObjectPath(String(), CIMNamespaceName(), CIMName(kConfigClass), keys);
}

class ConfigInstances : public ServerInstances
{
  public:
    explicit ConfigInstances(const Config& config) : fConfig(config) {}

  private:
    std::vector<CIMInstance> make() const override
    {
        std::vector<CIMInstance> instances;
        for (const ConfigProperty& property : configTable()) {
            CIMInstance instance((CIMName(kConfigClass)));
            instance.addProperty(stringPropertyOf("PropertyName", property.name));
            instance.addProperty(stringPropertyOf("DefaultValue", property.defaultValue));
            instance.addProperty(stringPropertyOf("CurrentValue", fConfig.text(property.name)));
            instance.addProperty(stringPropertyOf("PlannedValue", fConfig.planned(property.name)));
            instance.addProperty(stringPropertyOf("Description", property.meaning));
            instance.addProperty(CIMProperty(CIMName("DynamicProperty"), CIMValue(Boolean(property.dynamic))));
            instance.setPath(settingPath(property.name));
            instances.push_back(instance);
        }
        return instances;
    }

    const Config& fConfig;
};

CIMValue argument(const CimRequest& request, const char* name)
{
    for (Uint32 i = 0; i < request.arguments.size(); ++i) {
        if (String::equalNoCase(request.arguments[i].getParameterName(), String(name))) {
            return request.arguments[i].getValue();
        }
    }
    return CIMValue();
}

// Booleans may come untyped, that is as a string.
bool flagArgument(const CimRequest& request, const char* name)
{
    const CIMValue value = argument(request, name);
    return !value.isNull() && !value.isArray() && String::equalNoCase(value.toString(), String("TRUE"));
}

std::string keyOf(const CIMObjectPath& path)
{
    const Array<CIMKeyBinding>& keys = path.getKeyBindings();
    for (Uint32 i = 0; i < keys.size(); ++i) {
        if (keys[i].getName() == CIMName("PropertyName")) {
            return base::utf8(keys[i].getValue());
        }
    }
    return {};
}

void update(Config& config, const CimRequest& request, const std::string& name)
{
    requireConfigProperty(name); // also when the call asks for no change
    const bool reset = flagArgument(request, "ResetValue");
    const std::string value = base::utf8(argument(request, "PropertyValue").toString());
    const bool current = flagArgument(request, "SetCurrentValue");
    const bool planned = flagArgument(request, "SetPlannedValue");
    const std::string before = config.text(name);
    if (current) {
        reset ? config.resetCurrent(name) : config.setCurrent(name, value);
    }
    try {
        if (planned) {
            reset ? config.resetPlanned(name) : config.setPlanned(name, value);
        }
    } catch (...) {
        if (current) { // a call that fails changes neither value
            config.setCurrent(name, before);
        }
        throw;
    }
}

[[noreturn]] void fail(CIMStatusCode code, const std::string& text)
{
    throw CIMException(code, String(text.c_str()));
}

} // namespace

bool isConfigClass(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    static const CIMName kClass(kConfigClass);
    static const CIMNamespaceName kNamespace(kConfigNamespace);
    return className == kClass && nameSpace == kNamespace;
}

std::unique_ptr<ServerInstances> makeConfigInstances(const ServerCore& core)
{
    return std::make_unique<ConfigInstances>(core.config);
}

CIMValue invokeConfigMethod(ServerCore& core, const CimRequest& request)
{
    if (CIMName(String(request.method.c_str())) != CIMName("UpdatePropertyValue")) {
        fail(CIM_ERR_METHOD_NOT_AVAILABLE, request.method);
    }
    const std::string name = keyOf(request.object);
    try {
        update(core.config, request, name);
    } catch (const ConfigError& error) {
        switch (error.kind()) {
        case ConfigError::Kind::kUnknownProperty:
            fail(CIM_ERR_NOT_FOUND, "Configuration property \"" + name + "\"");
        case ConfigError::Kind::kNotDynamic:
            fail(CIM_ERR_NOT_SUPPORTED, error.what());
        case ConfigError::Kind::kInvalidValue:
            fail(CIM_ERR_FAILED, error.what());
        }
    } catch (const std::system_error& error) {
        fail(CIM_ERR_FAILED, error.what());
    }
    Log::write(LogLevel::kInformation, "Configuration property " + name + " is now " + core.config.text(name) + ".");
    return CIMValue(Boolean(true));
}

} // namespace Pegasus::server
