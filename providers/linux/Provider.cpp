// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/CmpiRecord.h"

#include <cmpi/cmpi.h>

#include <atomic>
#include <exception>
#include <functional>

#include <strings.h>

// The library's two interfaces, instances and methods, both under the name LinuxInventory. Every request reads the
// machine again and keeps its data to itself, so any number may run at once.
namespace lnx {
namespace {

// The same for all of the library's interfaces. Each factory sets it, possibly while the other's interface works.
std::atomic<const CMPIBroker*> gBroker{nullptr};

constexpr CMPIStatus kOk{CMPI_RC_OK, nullptr};

CMPIStatus failure(CMPIrc code, const std::string& text)
{
    const CMPIBroker* broker = gBroker;
    return {code, broker->eft->newString(broker, text.c_str(), nullptr)};
}

// The broker is C: an exception becomes a status here.
CMPIStatus guarded(const std::function<CMPIStatus()>& body)
{
    try {
        return body();
    } catch (const std::exception& error) {
        return failure(CMPI_RC_ERR_FAILED, error.what());
    }
}

std::string classOf(const CMPIObjectPath* path)
{
    return textOf(path->ft->getClassName(path, nullptr));
}

std::string nameSpaceOf(const CMPIObjectPath* path)
{
    return textOf(path->ft->getNameSpace(path, nullptr));
}

// Calls `deliver` with each record of the path's class until it fails.
CMPIStatus forEach(const CMPIObjectPath* path, const std::function<CMPIStatus(const Record&)>& deliver)
{
    const std::string name = classOf(path);
    const ClassEntry* entry = findClass(name);
    if (entry == nullptr) {
        return failure(CMPI_RC_ERR_INVALID_CLASS, name + " is not a class of this provider");
    }
    for (const Record& record : entry->collect(SystemTree())) {
        const CMPIStatus status = deliver(record);
        if (status.rc != CMPI_RC_OK) {
            return status;
        }
    }
    return kOk;
}

CMPIStatus returnPath(const CMPIResult* result, const CmpiRecord& maker, const Record& record)
{
    CMPIStatus status = kOk;
    CMPIObjectPath* path = maker.path(record, status);
    if (path != nullptr) {
        status = result->ft->returnObjectPath(result, path);
        path->ft->release(path);
    }
    return status;
}

CMPIStatus returnInstance(const CMPIResult* result, const CmpiRecord& maker, const Record& record)
{
    CMPIStatus status = kOk;
    CMPIInstance* instance = maker.instance(record, status);
    if (instance != nullptr) {
        status = result->ft->returnInstance(result, instance);
        instance->ft->release(instance);
    }
    return status;
}

CMPIStatus done(const CMPIStatus& status, const CMPIResult* result)
{
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path)
{
    return guarded([&] {
        const std::string nameSpace = nameSpaceOf(path);
        const CmpiRecord maker(*gBroker, nameSpace);
        return done(forEach(path, [&](const Record& record) { return returnPath(result, maker, record); }), result);
    });
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                              const char**)
{
    return guarded([&] {
        const std::string nameSpace = nameSpaceOf(path);
        const CmpiRecord maker(*gBroker, nameSpace);
        return done(forEach(path, [&](const Record& record) { return returnInstance(result, maker, record); }), result);
    });
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char**)
{
    return guarded([&] {
        const std::string nameSpace = nameSpaceOf(path);
        const CmpiRecord maker(*gBroker, nameSpace);
        bool isFound = false;
        const CMPIStatus status = forEach(path, [&](const Record& record) {
            if (isFound || !CmpiRecord::matches(record, *path)) {
                return kOk;
            }
            isFound = true;
            return returnInstance(result, maker, record);
        });
        if (status.rc == CMPI_RC_OK && !isFound) {
            return failure(CMPI_RC_ERR_NOT_FOUND, textOf(path->ft->toString(path, nullptr)));
        }
        return done(status, result);
    });
}

CMPIStatus notSupported()
{
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIStatus createInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                          const CMPIInstance*)
{
    return notSupported();
}

CMPIStatus modifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                          const CMPIInstance*, const char**)
{
    return notSupported();
}

CMPIStatus deleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*)
{
    return notSupported();
}

CMPIStatus execQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                     const char*)
{
    return notSupported();
}

CMPIStatus cleanupInstances(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean)
{
    return kOk;
}

// CountProcesses(in string Name, out uint32 Count): a null Name counts all processes. Returns 0.
CMPIStatus countProcesses(const CMPIResult* result, const CMPIArgs* in, CMPIArgs* out)
{
    const CMPIData name = in->ft->getArg(in, "Name", nullptr);
    const bool isGiven = (name.state & CMPI_nullValue) == 0;
    if (isGiven && name.type != CMPI_string) {
        return failure(CMPI_RC_ERR_INVALID_PARAMETER, "CountProcesses: Name is not a string");
    }
    const std::optional<std::string> wanted =
        isGiven ? std::optional<std::string>(textOf(name.value.string)) : std::nullopt;

    CMPIValue value{};
    value.uint32 = lnx::countProcesses(SystemTree(), wanted);
    CMPIStatus status = out->ft->addArg(out, "Count", &value, CMPI_uint32);
    value.uint32 = 0;
    if (status.rc == CMPI_RC_OK) {
        status = result->ft->returnData(result, &value, CMPI_uint32);
    }
    return done(status, result);
}

CMPIStatus invokeMethod(CMPIMethodMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                        const char* method, const CMPIArgs* in, CMPIArgs* out)
{
    return guarded([&] {
        const ClassEntry* entry = findClass(classOf(path));
        const bool isKnown =
            entry != nullptr && entry->collect == operatingSystems && ::strcasecmp(method, "CountProcesses") == 0;
        return isKnown ? countProcesses(result, in, out) : failure(CMPI_RC_ERR_METHOD_NOT_FOUND, method);
    });
}

CMPIStatus cleanupMethods(CMPIMethodMI*, const CMPIContext*, CMPIBoolean)
{
    return kOk;
}

const CMPIInstanceMIFT kInstanceTable{
    CMPIVersion200,     CMPIVersion200, "instanceLinuxInventory", cleanupInstances, enumerateInstanceNames,
    enumerateInstances, getInstance,    createInstance,           modifyInstance,   deleteInstance,
    execQuery,          nullptr};
const CMPIMethodMIFT kMethodTable{CMPIVersion200, CMPIVersion200, "methodLinuxInventory", cleanupMethods, invokeMethod};

CMPIInstanceMI gInstanceMI{nullptr, &kInstanceTable};
CMPIMethodMI gMethodMI{nullptr, &kMethodTable};

} // namespace
} // namespace lnx

extern "C" CMPIInstanceMI* LinuxInventory_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext*, CMPIStatus*)
{
    lnx::gBroker = broker;
    return &lnx::gInstanceMI;
}

extern "C" CMPIMethodMI* LinuxInventory_Create_MethodMI(const CMPIBroker* broker, const CMPIContext*, CMPIStatus*)
{
    lnx::gBroker = broker;
    return &lnx::gMethodMI;
}
