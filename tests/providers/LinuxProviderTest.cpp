// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "tests/pegasus/cmpi/MofServices.h"
#include "tests/providers/FixtureTree.h"

#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <set>

#include <dlfcn.h>

namespace Pegasus::cmpi {
namespace {

constexpr const char* kProvider = "LinuxInventory";

const char* const kClasses[] = {"LNX_ComputerSystem",    "LNX_OperatingSystem", "LNX_Processor", "LNX_Memory",
                                "LNX_NetworkPort",       "LNX_BlockDevice",     "LNX_PciDevice", "LNX_PhysicalMemory",
                                "LNX_TemperatureSensor", "LNX_SystemDevice"};
// Of which a machine may have none.
const std::set<std::string> kOptional = {"LNX_PciDevice", "LNX_PhysicalMemory", "LNX_TemperatureSensor"};

// The vendor's library in the broker, with the vendor's own MOF as schema.
class LinuxProvider : public testing::Test
{
  protected:
    LinuxProvider()
    {
        services.compileFile(PROVIDER_SOURCES "/linux.properties.mof");
        module = std::make_unique<ProviderModule>("linuxinventory", PROVIDER_LIBRARY, services);
        services.route(*module, kProvider);
    }

    std::vector<CIMInstance> all(const char* className, const CIMPropertyList& properties = CIMPropertyList())
    {
        std::vector<CIMInstance> found;
        module->enumerateInstances(MofServices::request(kProvider), CIMName(className), properties,
                                   [&](const CIMInstance& instance) { found.push_back(instance); });
        return found;
    }

    MofServices services;
    std::unique_ptr<ProviderModule> module;
};

std::string firstLine(const std::filesystem::path& path)
{
    std::string line;
    std::ifstream file(path);
    std::getline(file, line);
    return line;
}

TEST_F(LinuxProvider, ShowsEveryAddressAsTheKernelDoes)
{
    std::map<std::string, std::string> expected;
    for (const auto& entry : std::filesystem::directory_iterator("/sys/class/net")) {
        if (std::filesystem::exists(entry.path() / "address")) {
            expected[entry.path().filename()] = firstLine(entry.path() / "address");
        }
    }

    std::map<std::string, std::string> shown;
    for (const CIMInstance& port : all("LNX_NetworkPort")) {
        shown[propertyText(port, "DeviceID")] = propertyText(port, "MACAddress");
        if (propertyText(port, "DeviceID") == "lo") {
            EXPECT_EQ(propertyText(port, "PermanentAddress").front(), '<') << "loopback got an address";
        }
    }
    EXPECT_EQ(shown, expected);
}

TEST_F(LinuxProvider, ShowsAsManyProcessorsAsTheKernelLists)
{
    std::size_t listed = 0;
    std::ifstream info("/proc/cpuinfo");
    for (std::string line; std::getline(info, line);) {
        listed += line.rfind("processor", 0) == 0 ? 1 : 0;
    }
    EXPECT_EQ(all("LNX_Processor").size(), listed);
}

// Paths are complete, unique, name the class and lead back to their instance; every property that is set is
// declared and has its declared type.
TEST_F(LinuxProvider, EveryInstanceIsFoundByItsPath)
{
    for (const char* name : kClasses) {
        std::set<std::string> paths;
        for (const CIMInstance& instance : all(name)) {
            const CIMObjectPath& path = instance.getPath();
            EXPECT_TRUE(paths.insert(text(path.toString())).second) << text(path.toString());
            const CIMInstance found = module->getInstance(MofServices::request(kProvider), path, CIMPropertyList());
            EXPECT_EQ(text(found.getPath().toString()), text(path.toString()));
        }
        EXPECT_TRUE(!paths.empty() || kOptional.count(name) > 0) << name;

        std::set<std::string> names;
        module->enumerateInstanceNames(MofServices::request(kProvider), CIMName(name),
                                       [&](const CIMObjectPath& path) { names.insert(text(path.toString())); });
        EXPECT_EQ(names, paths) << name;
    }
    EXPECT_TRUE(services.logged().empty()) << services.logged().front();
}

struct TypeOf
{
    CIMType operator()(std::uint16_t) const { return CIMTYPE_UINT16; }
    CIMType operator()(std::uint32_t) const { return CIMTYPE_UINT32; }
    CIMType operator()(std::int32_t) const { return CIMTYPE_SINT32; }
    CIMType operator()(std::uint64_t) const { return CIMTYPE_UINT64; }
    CIMType operator()(const std::string&) const { return CIMTYPE_STRING; }
    template <typename T> CIMType operator()(const std::vector<T>& values) const { return (*this)(values.front()); }
    template <typename T> CIMType operator()(const T&) const { return CIMTYPE_OBJECT; } // used by no class below
};

// Virtual machines have neither of the two; here they do.
TEST_F(LinuxProvider, DeclaresWhatHardwareAloneDelivers)
{
    lnx::FixtureTree fixture;
    std::string memory("\x11\x22\1\0\x10\0\xfe\xff\x48\0\x40\0\1\1\x09\0\1\1\x22\0\0\xc0\x12\1\1\1\1", 27);
    memory += std::string("\2\0\0\0\0\xc0\x12", 7) + std::string("text\0\0", 6);
    fixture.file("/sys/firmware/dmi/tables/DMI", memory);
    for (const char* file : {"input", "min", "max", "lcrit", "crit", "emergency"}) {
        fixture.file(std::string("/sys/class/hwmon/hwmon0/temp1_") + file, "1000\n");
    }
    for (const std::string& name : kOptional) {
        const CIMClass declared = services.getClass(CIMNamespaceName(MofServices::kNameSpace), CIMName(name.c_str()));
        for (const lnx::Record& record : lnx::findClass(name)->collect(fixture.tree())) {
            EXPECT_GT(record.properties().size(), 15U);
            for (const lnx::Property& each : record.properties()) {
                const Uint32 at = declared.findProperty(CIMName(each.name.c_str()));
                ASSERT_NE(at, PEG_NOT_FOUND) << each.name;
                EXPECT_EQ(declared.getProperty(at).getType(), std::visit(TypeOf(), each.value)) << each.name;
            }
        }
    }
}

TEST_F(LinuxProvider, DeclaresAndDeliversEveryCimType)
{
    std::set<std::pair<int, bool>> delivered;
    for (const char* name : kClasses) {
        for (const CIMInstance& instance : all(name)) {
            for (Uint32 i = 0; i < instance.getPropertyCount(); ++i) {
                if (!instance.getProperty(i).getValue().isNull()) {
                    delivered.insert({instance.getProperty(i).getType(), instance.getProperty(i).isArray()});
                }
            }
        }
    }

    for (int type = CIMTYPE_BOOLEAN; type <= CIMTYPE_REFERENCE; ++type) {
        EXPECT_TRUE(delivered.count({type, false})) << cimTypeToString(static_cast<CIMType>(type));
    }
    for (const CIMType type : {CIMTYPE_UINT8, CIMTYPE_UINT16, CIMTYPE_REAL32, CIMTYPE_CHAR16, CIMTYPE_STRING}) {
        EXPECT_TRUE(delivered.count({type, true})) << cimTypeToString(type) << "[]";
    }
}

TEST_F(LinuxProvider, CountsProcesses)
{
    const CIMObjectPath path = all("LNX_OperatingSystem").at(0).getPath();
    const std::string own = firstLine("/proc/self/comm");
    struct Case
    {
        const char* name;
        CIMValue argument;
        Uint32 atLeast;
    };
    const std::vector<Case> cases{{"all", CIMValue(CIMTYPE_STRING, false), 2},
                                  {"this one", CIMValue(String(own.c_str())), 1}};
    for (const Case& row : cases) {
        Array<CIMParamValue> in;
        Array<CIMParamValue> out;
        in.append(CIMParamValue(String("Name"), row.argument));
        const CIMValue result =
            module->invokeMethod(MofServices::request(kProvider), path, CIMName("CountProcesses"), in, out);
        EXPECT_EQ(result, CIMValue(Uint32{0})) << row.name;
        ASSERT_EQ(out.size(), 1U) << row.name;
        Uint32 count = 0;
        out[0].getValue().get(count);
        EXPECT_GE(count, row.atLeast) << row.name;
    }
}

template <typename Call> CIMStatusCode codeOf(Call&& call)
{
    try {
        call();
    } catch (const CIMException& error) {
        return error.getCode();
    }
    return CIM_ERR_SUCCESS;
}

TEST_F(LinuxProvider, RefusesWhatItDoesNotServe)
{
    const ProviderRequest request = MofServices::request(kProvider);
    CIMObjectPath path = all("LNX_Processor").at(0).getPath();
    Array<CIMParamValue> none;
    EXPECT_EQ(codeOf([&] { module->invokeMethod(request, path, CIMName("CountProcesses"), none, none); }),
              CIM_ERR_METHOD_NOT_FOUND);
    EXPECT_EQ(codeOf([&] { all("CIM_Processor"); }), CIM_ERR_INVALID_CLASS);

    Array<CIMKeyBinding> keys = path.getKeyBindings();
    for (Uint32 i = 0; i < keys.size(); ++i) {
        if (keys[i].getName().equal(CIMName("DeviceID"))) {
            keys[i].setValue(String("CPU99999"));
        }
    }
    path.setKeyBindings(keys);
    EXPECT_EQ(codeOf([&] { module->getInstance(request, path, CIMPropertyList()); }), CIM_ERR_NOT_FOUND);
}

TEST(LinuxLibrary, ResolvesEverythingAtOnce)
{
    void* library = ::dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(library, nullptr) << ::dlerror();
    EXPECT_NE(::dlsym(library, "LinuxInventory_Create_InstanceMI"), nullptr);
    ::dlclose(library);
    EXPECT_EQ(::dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_NOLOAD), nullptr) << "it stays loaded";
}

TEST(LinuxFiles, RegistrationNamesTheClassesOfTheClassFile)
{
    const auto contentOf = [](const char* name) {
        std::ifstream file(std::string(PROVIDER_SOURCES "/") + name);
        return std::string(std::istreambuf_iterator<char>(file), {});
    };
    const std::string classes = contentOf("linux.classes.xml");
    const std::string registration = contentOf("linux.registration.mof");
    for (const char* name : kClasses) {
        EXPECT_NE(classes.find("<class name=\"" + std::string(name) + "\"/>"), std::string::npos) << name;
        EXPECT_NE(registration.find("ClassName = \"" + std::string(name) + "\""), std::string::npos) << name;
    }
}

} // namespace
} // namespace Pegasus::cmpi
