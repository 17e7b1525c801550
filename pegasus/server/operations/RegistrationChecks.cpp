// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/RegistrationChecks.h"

#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>

namespace Pegasus::server {

const char* const kInteropNamespace = "root/PG_InterOp";
const char* const kModuleClass = "PG_ProviderModule";
const char* const kProviderClass = "PG_Provider";
const char* const kCapabilitiesClass = "PG_ProviderCapabilities";

namespace {

// Returns: the null value if the property is absent.
CIMValue valueOf(const CIMConstInstance& instance, const char* name)
{
    const Uint32 position = instance.findProperty(CIMName(name));
    return position == PEG_NOT_FOUND ? CIMValue() : instance.getProperty(position).getValue();
}

[[noreturn]] void refuse(CIMStatusCode code, const std::string& text)
{
    throw CIMException(code, String(text.c_str()));
}

void requireProperties(const CIMInstance& instance, std::initializer_list<const char*> names, const char* className)
{
    for (const char* name : names) {
        if (valueOf(instance, name).isNull()) {
            refuse(CIM_ERR_INVALID_PARAMETER,
                   std::string("Missing ") + name + " which is required property in " + className + " class.");
        }
    }
}

bool isOneOf(const std::string& value, std::initializer_list<const char*> values)
{
    return std::any_of(values.begin(), values.end(), [&](const char* candidate) { return value == candidate; });
}

void checkInterface(const std::string& type, const std::string& version)
{
    const bool known = isOneOf(type, {"C++Default", "CMPI"});
    if (!known) {
        refuse(CIM_ERR_NOT_SUPPORTED, "Unsupported InterfaceType value: \"" + type + "\"");
    }
    const bool supported = type == "CMPI"
                               ? isOneOf(version, {"", "2.0.0"})
                               : isOneOf(version, {"", "2.1.0", "2.2.0", "2.3.0", "2.5.0", "2.6.0", "2.9.0"});
    if (!supported) {
        refuse(CIM_ERR_NOT_SUPPORTED, "Unsupported InterfaceVersion value: \"" + version + "\"");
    }
}

void checkUserContext(const CIMInstance& module)
{
    const CIMValue value = valueOf(module, "UserContext");
    if (value.isNull()) {
        return;
    }
    Uint16 context = 0;
    value.get(context);
    if (context < 2 || context > 5) {
        refuse(CIM_ERR_NOT_SUPPORTED, "Unsupported UserContext value: \"" + std::to_string(context) + "\".");
    }
}

} // namespace

std::string stringProperty(const CIMConstInstance& instance, const char* name)
{
    const CIMValue value = valueOf(instance, name);
    String text;
    if (value.getType() == CIMTYPE_STRING && !value.isArray() && !value.isNull()) {
        value.get(text);
    }
    return base::utf8(text);
}

std::vector<std::string> stringsProperty(const CIMConstInstance& instance, const char* name)
{
    const CIMValue value = valueOf(instance, name);
    Array<String> texts;
    if (value.getType() == CIMTYPE_STRING && value.isArray() && !value.isNull()) {
        value.get(texts);
    }
    std::vector<std::string> result;
    for (Uint32 i = 0; i < texts.size(); ++i) {
        result.push_back(base::utf8(texts[i]));
    }
    return result;
}

std::vector<unsigned> numbersProperty(const CIMConstInstance& instance, const char* name)
{
    const CIMValue value = valueOf(instance, name);
    Array<Uint16> numbers;
    if (value.getType() == CIMTYPE_UINT16 && value.isArray() && !value.isNull()) {
        value.get(numbers);
    }
    return std::vector<unsigned>(numbers.getData(), numbers.getData() + numbers.size());
}

void checkModule(const CIMInstance& module)
{
    requireProperties(module, {"Name", "Vendor", "Version", "InterfaceType", "InterfaceVersion", "Location"},
                      kModuleClass);
    checkInterface(stringProperty(module, "InterfaceType"), stringProperty(module, "InterfaceVersion"));
    checkUserContext(module);
}

void checkProvider(const CIMInstance& provider)
{
    for (const char* name : {"ProviderModuleName", "Name"}) {
        if (valueOf(provider, name).isNull()) {
            refuse(CIM_ERR_INVALID_PARAMETER,
                   std::string("Missing the required ") + name + " property in PG_Provider class.");
        }
    }
}

void checkCapabilities(const CIMInstance& capabilities)
{
    requireProperties(capabilities,
                      {"ProviderModuleName", "ProviderName", "CapabilityID", "ClassName", "Namespaces", "ProviderType"},
                      kCapabilitiesClass);
    for (const unsigned type : numbersProperty(capabilities, "ProviderType")) {
        if (type < 2 || type > 7) {
            refuse(CIM_ERR_NOT_SUPPORTED, "Unsupported ProviderType value \"" + std::to_string(type) +
                                              "\" in PG_ProviderCapabilities instance.");
        }
    }
    for (const std::string& nameSpace : stringsProperty(capabilities, "Namespaces")) {
        if (!CIMNamespaceName::legal(String(nameSpace.c_str()))) {
            refuse(CIM_ERR_FAILED, "invalid CIM namespace name: " + nameSpace);
        }
    }
}

} // namespace Pegasus::server
