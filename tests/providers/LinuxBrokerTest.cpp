// SPDX-License-Identifier: MIT
// The vendor's library under a broker that punishes what OpenPegasus punishes, with each of the broker's functions
// failing in turn.
#include "tests/providers/TestBroker.h"

#include <gtest/gtest.h>

#include <set>
#include <string>

#include <dlfcn.h>

namespace lnx {
namespace {

const char* const kClasses[] = {"LNX_ComputerSystem",    "LNX_OperatingSystem", "LNX_Processor", "LNX_Memory",
                                "LNX_NetworkPort",       "LNX_BlockDevice",     "LNX_PciDevice", "LNX_PhysicalMemory",
                                "LNX_TemperatureSensor", "LNX_SystemDevice"};

// Of which a machine may have none.
const std::set<std::string> kOptional = {"LNX_BlockDevice", "LNX_PciDevice", "LNX_PhysicalMemory",
                                         "LNX_TemperatureSensor"};

template <typename MI> using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);

// The library, loaded for one test.
class Library
{
  public:
    explicit Library(TestBroker& broker) : fBroker(broker), fHandle(::dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL))
    {
        if (fHandle == nullptr) {
            throw std::runtime_error(::dlerror());
        }
        instances = create<CMPIInstanceMI>("LinuxInventory_Create_InstanceMI");
        methods = create<CMPIMethodMI>("LinuxInventory_Create_MethodMI");
    }
    ~Library()
    {
        fBroker.run([&](const CMPIContext* context, const CMPIResult*, CMPIArgs*) {
            instances->ft->cleanup(instances, context, 1);
            return methods->ft->cleanup(methods, context, 1);
        });
        ::dlclose(fHandle);
        EXPECT_EQ(::dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_NOLOAD), nullptr) << "it stays loaded";
    }
    Library(const Library&) = delete;
    Library& operator=(const Library&) = delete;

    CMPIInstanceMI* instances = nullptr;
    CMPIMethodMI* methods = nullptr;

  private:
    template <typename MI> MI* create(const char* symbol)
    {
        MI* mi = nullptr;
        fBroker.run([&](const CMPIContext* context, const CMPIResult*, CMPIArgs*) {
            CMPIStatus status{CMPI_RC_OK, nullptr};
            mi = reinterpret_cast<Factory<MI>>(::dlsym(fHandle, symbol))(fBroker.face(), context, &status);
            return status;
        });
        return mi;
    }

    TestBroker& fBroker;
    void* fHandle;
};

std::string joined(const std::vector<std::string>& texts)
{
    std::string all;
    for (const std::string& text : texts) {
        all += text + "; ";
    }
    return all;
}

class LinuxBroker : public testing::Test
{
  protected:
    CallReport enumerate(const PathContent& path, const char** properties, unsigned failAt = 0)
    {
        return fBroker.run(
            [&](const CMPIContext* context, const CMPIResult* result, CMPIArgs*) {
                CMPIInstanceMI* mi = fLibrary.instances;
                return mi->ft->enumerateInstances(mi, context, result, fBroker.pathArgument(path), properties);
            },
            failAt);
    }
    CallReport names(const PathContent& path, unsigned failAt = 0)
    {
        return fBroker.run(
            [&](const CMPIContext* context, const CMPIResult* result, CMPIArgs*) {
                CMPIInstanceMI* mi = fLibrary.instances;
                return mi->ft->enumerateInstanceNames(mi, context, result, fBroker.pathArgument(path));
            },
            failAt);
    }
    CallReport get(const PathContent& path, const char** properties, unsigned failAt = 0)
    {
        return fBroker.run(
            [&](const CMPIContext* context, const CMPIResult* result, CMPIArgs*) {
                CMPIInstanceMI* mi = fLibrary.instances;
                return mi->ft->getInstance(mi, context, result, fBroker.pathArgument(path), properties);
            },
            failAt);
    }
    CallReport invoke(const PathContent& path, const char* method, const BrokerValues& in, unsigned failAt = 0)
    {
        return fBroker.run(
            [&](const CMPIContext* context, const CMPIResult* result, CMPIArgs* out) {
                CMPIMethodMI* mi = fLibrary.methods;
                return mi->ft->invokeMethod(mi, context, result, fBroker.pathArgument(path), method,
                                            fBroker.argsArgument(in), out);
            },
            failAt);
    }

    // Repeats a call with the broker's first function failing, then its second, and so on. A failure is passed on,
    // unless it was a getter's, and leaves no object.
    template <typename Call> static void failEach(const std::string& what, unsigned count, const Call& call)
    {
        for (unsigned i = 1; i <= count; ++i) {
            const CallReport report = call(i);
            EXPECT_EQ(joined(report.faults), "") << what << " with call " << i << " (" << report.failed << ") failing";
            const bool wasReached = !report.failed.empty(); // states of processes come and go, and with them calls
            EXPECT_TRUE(wasReached || i > count / 2) << what << " ended before call " << i;
            if (wasReached && report.failed != "a getter") {
                EXPECT_NE(report.code, CMPI_RC_OK) << what << ": " << report.failed << " failed";
            }
        }
    }

    TestBroker fBroker;
    Library fLibrary{fBroker};
};

PathContent classPath(const char* name)
{
    return {"root/cimv2", name, {}};
}

TEST_F(LinuxBroker, EveryClassIsDeliveredAndNothingIsLeft)
{
    const char* none[] = {nullptr};
    const char* odd[] = {"", "No Such Name", "DeviceID", "deviceid", nullptr};
    const char** const lists[] = {nullptr, none, odd};
    for (const char* name : kClasses) {
        for (const char** list : lists) {
            const CallReport report = enumerate(classPath(name), list);
            EXPECT_EQ(report.code, CMPI_RC_OK) << name << ": " << report.text;
            EXPECT_TRUE(report.isDone) << name;
            EXPECT_FALSE(report.results.empty() && kOptional.count(name) == 0) << name;
            EXPECT_EQ(joined(report.faults), "") << name;
        }
        const CallReport paths = names(classPath(name));
        EXPECT_EQ(joined(paths.faults), "") << name;
        for (const InstanceContent& each : paths.results) {
            for (const char** list : lists) {
                const CallReport found = get(each.path, list);
                EXPECT_EQ(found.results.size(), 1U) << name << ": " << found.text;
                EXPECT_EQ(joined(found.faults), "") << name;
            }
        }
    }
}

TEST_F(LinuxBroker, EveryFailureOfTheBrokerIsPassedOn)
{
    constexpr unsigned kMost = 150; // beyond the first instances' calls, the same ones repeat
    for (const char* name : kClasses) {
        const PathContent path = classPath(name);
        failEach(std::string("enumerateInstances ") + name, std::min(enumerate(path, nullptr).calls, kMost),
                 [&](unsigned at) { return enumerate(path, nullptr, at); });
        const CallReport paths = names(path);
        failEach(std::string("enumerateInstanceNames ") + name, std::min(paths.calls, kMost),
                 [&](unsigned at) { return names(path, at); });
        if (!paths.results.empty()) {
            const PathContent& first = paths.results[0].path;
            failEach(std::string("getInstance ") + name, std::min(get(first, nullptr).calls, kMost),
                     [&](unsigned at) { return get(first, nullptr, at); });
        }
    }
    const BrokerValues in{{"Name", {CMPI_string, false, "init", nullptr}}};
    const PathContent system = classPath("LNX_OperatingSystem");
    failEach("invokeMethod", invoke(system, "CountProcesses", in).calls,
             [&](unsigned at) { return invoke(system, "CountProcesses", in, at); });
}

TEST_F(LinuxBroker, BadPathsAndArgumentsAreRefused)
{
    const BrokerValue text{CMPI_string, false, "x", nullptr};
    const BrokerValue null{CMPI_string, true, "", nullptr};
    const BrokerValue link{CMPI_ref, false, "", std::make_shared<PathContent>(classPath("LNX_Memory"))};
    const PathContent paths[] = {
        {"", "", {}},
        {"root/cimv2", "LNX_Memory", {}},
        {"root/cimv2", "LNX_Memory", {{"DeviceID", text}}},
        {"root/cimv2", "LNX_Memory", {{"SystemCreationClassName", null}}},
        {"root/cimv2", "LNX_Memory", {{"SystemCreationClassName", link}}},
        {"root/cimv2", "LNX_SystemDevice", {{"GroupComponent", text}}},
        {"root/cimv2", "LNX_SystemDevice", {{"GroupComponent", link}, {"PartComponent", link}}},
        {"root/cimv2", "CIM_Other", {{"DeviceID", text}}},
    };
    for (const PathContent& path : paths) {
        const CallReport report = get(path, nullptr);
        EXPECT_TRUE(report.code == CMPI_RC_ERR_NOT_FOUND || report.code == CMPI_RC_ERR_INVALID_CLASS) << report.code;
        EXPECT_EQ(joined(report.faults), "");
        EXPECT_NE(invoke(path, "Other", {}).code, CMPI_RC_OK);
    }
    const PathContent system = classPath("lnx_operatingsystem");
    for (const auto& [value, code] :
         {std::pair(null, CMPI_RC_OK), std::pair(text, CMPI_RC_OK), std::pair(link, CMPI_RC_ERR_INVALID_PARAMETER)})
    {
        const CallReport report = invoke(system, "countprocesses", {{"Name", value}});
        EXPECT_EQ(report.code, code);
        EXPECT_EQ(report.outputs.count("Count"), code == CMPI_RC_OK ? 1U : 0U);
        EXPECT_EQ(joined(report.faults), "");
    }
    EXPECT_EQ(invoke(system, "CountProcesses", {}).returned.text, "00000000");
    const CallReport refused = fBroker.run([&](const CMPIContext* context, const CMPIResult* result, CMPIArgs*) {
        CMPIInstanceMI* mi = fLibrary.instances;
        const CMPIObjectPath* path = fBroker.pathArgument(classPath("LNX_Memory"));
        EXPECT_EQ(mi->ft->createInstance(mi, context, result, path, nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
        EXPECT_EQ(mi->ft->modifyInstance(mi, context, result, path, nullptr, nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
        EXPECT_EQ(mi->ft->execQuery(mi, context, result, path, "q", "WQL").rc, CMPI_RC_ERR_NOT_SUPPORTED);
        return mi->ft->deleteInstance(mi, context, result, path);
    });
    EXPECT_EQ(refused.code, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST(LinuxBrokerLibrary, MayBeLoadedAgainAndAgain)
{
    for (int i = 0; i < 5; ++i) {
        TestBroker broker; // each time another one
        const Library library(broker);
        const CallReport report = broker.run([&](const CMPIContext* context, const CMPIResult* result, CMPIArgs*) {
            CMPIInstanceMI* mi = library.instances;
            return mi->ft->enumerateInstances(mi, context, result, broker.pathArgument(classPath("LNX_Memory")),
                                              nullptr);
        });
        EXPECT_EQ(report.results.size(), 1U);
    }
}

} // namespace
} // namespace lnx
