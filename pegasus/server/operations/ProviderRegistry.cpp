// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/ProviderRegistry.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/server/operations/RegistrationChecks.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>
#include <map>

namespace Pegasus::server {

namespace {

std::string indexKey(const std::string& nameSpace, const std::string& className)
{
    return base::foldCase(nameSpace[0] == '/' ? nameSpace.substr(1) : nameSpace) + ":" + base::foldCase(className);
}

CIMNamespaceName interop()
{
    return CIMNamespaceName(kInteropNamespace);
}

// Returns: the stored instances of a class; empty while the class is missing.
std::vector<CIMInstance> storedInstances(const repository::Repository& repository, const char* className)
{
    std::vector<CIMInstance> instances;
    if (!repository.hasNamespace(interop()) || !repository.hasClass(interop(), CIMName(className))) {
        return instances;
    }
    repository.enumerateInstances(interop(), CIMName(className), {}, [&](const CIMInstance& instance) {
        instances.push_back(instance);
        return true;
    });
    return instances;
}

CIMObjectPath pathOf(const char* className, std::initializer_list<std::pair<const char*, std::string>> keys)
{
    Array<CIMKeyBinding> bindings;
    for (const auto& [name, value] : keys) {
        bindings.append(CIMKeyBinding(CIMName(name), String(value.c_str()), CIMKeyBinding::STRING));
    }
    return CIMObjectPath(String(), CIMNamespaceName(), CIMName(className), bindings);
}

bool isStored(const repository::Repository& repository, const CIMObjectPath& path)
{
    try {
        repository.getInstance(interop(), path, {});
        return true;
    } catch (const CIMException& error) {
        if (error.getCode() == CIM_ERR_NOT_FOUND || error.getCode() == CIM_ERR_INVALID_CLASS) {
            return false;
        }
        throw;
    }
}

[[noreturn]] void fail(const char* text)
{
    throw CIMException(CIM_ERR_FAILED, String(text));
}

// A module counts as running: the server adds the status, which registration files leave out.
void addOperationalStatus(CIMInstance& module)
{
    if (module.findProperty(CIMName("OperationalStatus")) != PEG_NOT_FOUND) {
        return;
    }
    Array<Uint16> status;
    status.append(2); // OK
    module.addProperty(CIMProperty(CIMName("OperationalStatus"), CIMValue(status)));
}

CIMObjectPath capabilitiesPath(const CIMInstance& capabilities)
{
    return pathOf(kCapabilitiesClass, {{"ProviderModuleName", stringProperty(capabilities, "ProviderModuleName")},
                                       {"ProviderName", stringProperty(capabilities, "ProviderName")},
                                       {"CapabilityID", stringProperty(capabilities, "CapabilityID")}});
}

} // namespace

bool ProviderRegistry::isRegistration(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    return nameSpace == interop() && (className == CIMName(kModuleClass) || className == CIMName(kProviderClass) ||
                                      className == CIMName(kCapabilitiesClass));
}

CIMObjectPath ProviderRegistry::registerInstance(const CIMInstance& instance)
{
    const std::lock_guard<std::mutex> one(fRegistration);
    CIMInstance registration = instance.clone();
    const CIMName className = registration.getClassName();
    if (className == CIMName(kModuleClass)) {
        checkModule(registration);
        addOperationalStatus(registration);
    } else if (className == CIMName(kProviderClass)) {
        checkProvider(registration);
        if (!isStored(fRepository,
                      pathOf(kModuleClass, {{"Name", stringProperty(registration, "ProviderModuleName")}})))
        {
            fail("PG_ProviderModule class needs to be registered before register the PG_Provider class");
        }
    } else {
        checkCapabilities(registration);
        if (!isStored(fRepository, pathOf(kProviderClass,
                                          {{"ProviderModuleName", stringProperty(registration, "ProviderModuleName")},
                                           {"Name", stringProperty(registration, "ProviderName")}})))
        {
            fail("PG_Provider class needs to be registered before register the Provider capabilities class");
        }
        if (!isStored(fRepository, capabilitiesPath(registration))) // else the repository says that it exists
        {
            checkNotTaken(registration);
        }
    }
    CIMObjectPath path = fRepository.createInstance(interop(), registration);
    const std::lock_guard<std::mutex> lock(fMutex);
    fLoaded = false;
    return path;
}

void ProviderRegistry::removeInstance(const CIMObjectPath& path)
{
    const std::lock_guard<std::mutex> one(fRegistration);
    const CIMInstance removed = fRepository.getInstance(interop(), path, {});
    const bool isModule = removed.getClassName() == CIMName(kModuleClass);
    const std::string name = stringProperty(removed, "Name");
    const std::string module = isModule ? name : stringProperty(removed, "ProviderModuleName");
    // The dependents first: what is left when the server dies in between is whole registrations.
    if (removed.getClassName() != CIMName(kCapabilitiesClass)) {
        for (const CIMInstance& capabilities : storedInstances(fRepository, kCapabilitiesClass)) {
            if (stringProperty(capabilities, "ProviderModuleName") == module &&
                (isModule || stringProperty(capabilities, "ProviderName") == name))
            {
                fRepository.deleteInstance(interop(), capabilities.getPath());
            }
        }
    }
    if (isModule) {
        for (const CIMInstance& provider : storedInstances(fRepository, kProviderClass)) {
            if (stringProperty(provider, "ProviderModuleName") == module) {
                fRepository.deleteInstance(interop(), provider.getPath());
            }
        }
    }
    fRepository.deleteInstance(interop(), path);
    const std::lock_guard<std::mutex> lock(fMutex);
    fLoaded = false;
}

// Throws: when another registration has one of the instance's class, namespace and type already.
void ProviderRegistry::checkNotTaken(const CIMInstance& capabilities)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    load();
    const std::vector<unsigned> types = numbersProperty(capabilities, "ProviderType");
    for (const std::string& nameSpace : stringsProperty(capabilities, "Namespaces")) {
        const auto found = fIndex.find(indexKey(nameSpace, stringProperty(capabilities, "ClassName")));
        if (found == fIndex.end()) {
            continue;
        }
        for (const Capability& taken : found->second) {
            if (std::find(types.begin(), types.end(), taken.type) != types.end()) {
                fail("A provider is already registered for the specified capability.");
            }
        }
    }
}

// Reads the registrations when the index is out of date. Requires: fMutex held.
void ProviderRegistry::load()
{
    if (fLoaded) {
        return;
    }
    fIndex.clear();
    std::map<std::string, ProviderReference> modules;
    for (const CIMInstance& module : storedInstances(fRepository, kModuleClass)) {
        const std::string name = stringProperty(module, "Name");
        modules[name] = {name, "", stringProperty(module, "Location"), stringProperty(module, "InterfaceType")};
    }
    for (const CIMInstance& capabilities : storedInstances(fRepository, kCapabilitiesClass)) {
        const auto module = modules.find(stringProperty(capabilities, "ProviderModuleName"));
        if (module == modules.end()) {
            continue; // its module has been deleted since
        }
        ProviderReference provider = module->second;
        provider.provider = stringProperty(capabilities, "ProviderName");
        for (const std::string& nameSpace : stringsProperty(capabilities, "Namespaces")) {
            for (const unsigned type : numbersProperty(capabilities, "ProviderType")) {
                fIndex[indexKey(nameSpace, stringProperty(capabilities, "ClassName"))].push_back({type, provider});
            }
        }
    }
    fLoaded = true;
}

std::optional<ProviderReference> ProviderRegistry::find(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                        ProviderType type)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    load();
    const auto found = fIndex.find(indexKey(base::utf8(nameSpace), base::utf8(className)));
    if (found == fIndex.end()) {
        return std::nullopt;
    }
    for (const Capability& capability : found->second) {
        if (capability.type == static_cast<unsigned>(type)) {
            return capability.provider;
        }
    }
    return std::nullopt;
}

} // namespace Pegasus::server
