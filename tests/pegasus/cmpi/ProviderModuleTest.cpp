// SPDX-License-Identifier: MIT
#include "pegasus/wire/ElementEncoder.h"
#include "tests/pegasus/cmpi/ModuleFixture.h"

#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/Exception.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <memory>
#include <thread>

#include <dlfcn.h>

namespace Pegasus::cmpi {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

// Returns: the names of all checks, or of those that hold on every server.
std::vector<std::string> checkNames(bool isStandardOnly)
{
    MofServices services;
    services.compileFile(CONFORMANCE_SOURCES "/conformance.mof");
    ProviderModule module("tests", CONFORMANCE_LIBRARY, services);
    Array<CIMParamValue> out;
    module.invokeMethod(MofServices::request(kProvider), CIMObjectPath(String("TST_Check")), CIMName("List"),
                        Array<CIMParamValue>(), out);
    Array<String> names;
    out[isStandardOnly ? 1 : 0].getValue().get(names);
    std::vector<std::string> result;
    for (Uint32 i = 0; i < names.size(); ++i) {
        result.push_back(text(names[i]));
    }
    return result;
}

// Runs the checks that the provider makes on its side, each in a module of its own: all of them, and those that hold
// everywhere also where nothing is tolerated that OpenPegasus refuses.
TEST_F(Module, PassesTheProvidersChecks)
{
    EXPECT_GE(checkNames(false).size(), 65U);
    EXPECT_GE(checkNames(true).size(), 35U);
    for (const bool strict : {false, true}) {
        services.strict = strict;
        for (const std::string& check : checkNames(strict)) {
            load();
            String failed;
            invoke("Run", "Name", CIMValue(String(check.c_str()))).get(failed);
            EXPECT_EQ(text(failed), "") << check << (strict ? ", strict" : "");
            module.reset();
        }
    }
    EXPECT_THAT(services.logged(), testing::Contains(HasSubstr("works here"))) << "of the other checks";
}

TEST_F(Module, DeliversAsManyAsTheProviderReturns)
{
    load();
    for (const std::size_t count : {0U, 1U, 5000U}) {
        setMode("count " + std::to_string(count)); // without returnDone
        EXPECT_EQ(items().size(), count);
    }
    setMode("after done");
    EXPECT_EQ(items().size(), 1U);
    setMode("changed");
    const std::vector<CIMInstance> two = items();
    ASSERT_EQ(two.size(), 2U);
    EXPECT_EQ(propertyText(two[0], "Text"), "item 0");
    EXPECT_EQ(propertyText(two[1], "Text"), "changed");
}

TEST_F(Module, InstancesHaveWhatWasSetAndTheirKeys)
{
    load();
    const CIMInstance item = items().at(1);
    EXPECT_EQ(text(item.getPath().toString()), "TST_Item.Id=\"1\"");
    EXPECT_EQ(propertyText(item, "Id"), "1");
    EXPECT_EQ(propertyText(item, "Number"), "1");
    EXPECT_EQ(propertyText(item, "Unset"), "<null>");
}

TEST_F(Module, PropertyListReachesProviderAndResult)
{
    struct Case
    {
        const char* name;
        CIMPropertyList list;
        const char* seen; // by the provider
        Uint32 delivered;
    };
    Array<CIMName> one;
    one.append(CIMName("text"));
    const std::vector<Case> cases{{"all", CIMPropertyList(), "1: all", 4},
                                  {"none", CIMPropertyList(Array<CIMName>()), "1: ", 0},
                                  {"one", CIMPropertyList(one), "1: text;", 1}};
    load();
    for (const Case& row : cases) {
        setMode("properties");
        EXPECT_EQ(errorOf([&] { items(row.list); }), row.seen) << row.name;
        setMode("");
        const CIMInstance item = items(row.list).at(2);
        EXPECT_EQ(item.getPropertyCount(), row.delivered) << row.name;
        EXPECT_EQ(text(item.getPath().toString()), "TST_Item.Id=\"2\"") << row.name;
    }
}

// A shallow enumeration passes the properties of the class that was asked for: what a provider delivers of a subclass
// is cut to them, and of a class that nobody declared nothing is left.
TEST_F(Module, InstancesOfOtherClassesAreCutToTheList)
{
    struct Case
    {
        const char* mode;
        bool isListed;
        std::vector<const char*> properties;
    };
    const std::vector<Case> cases{{"class TST_Leaf", false, {"OfLeaf", "Id", "Text", "WithDefault"}},
                                  {"class TST_Leaf", true, {"Text", "Id"}},
                                  {"class TST_Unknown", false, {"OfLeaf", "Text", "Id"}},
                                  {"class TST_Unknown", true, {}}};
    Array<CIMName> names;
    names.append(CIMName("Text"));
    names.append(CIMName("Number"));
    names.append(CIMName("Id"));
    load();
    for (const Case& row : cases) {
        setMode(row.mode);
        const CIMInstance item = items(row.isListed ? CIMPropertyList(names) : CIMPropertyList()).at(0);
        EXPECT_EQ(text(item.getPath().toString()), std::string(row.mode + 6) + ".Id=\"other\"");
        ASSERT_EQ(item.getPropertyCount(), row.properties.size()) << row.mode;
        for (Uint32 i = 0; i < item.getPropertyCount(); ++i) {
            EXPECT_EQ(text(item.getProperty(i).getName().getString()), row.properties[i]) << row.mode;
        }
    }
    EXPECT_THAT(services.logged(), testing::Contains(HasSubstr("class TST_Unknown is not declared in namespace")));
}

TEST_F(Module, StatusDecidesAndKeepsItsCode)
{
    load();
    for (const int code : {1, 2, 16, 17, 18, 50, 61, 100, 200}) { // those that CIM lacks, too
        setMode("fail " + std::to_string(code));
        EXPECT_EQ(errorOf([&] { items(); }), std::to_string(code) + ": the reason");
    }
    setMode("fail without text");
    EXPECT_EQ(errorOf([&] { items(); }), "2: ");
}

TEST_F(Module, WrongKindsOfResultAreRefused)
{
    load();
    setMode("wrong kinds");
    EXPECT_EQ(errorOf([&] { items(); }), "1: path 7, data 7, null 60");
}

TEST_F(Module, GetInstanceWantsExactlyOne)
{
    load();
    const CIMObjectPath path(String("TST_Item.Id=\"7\""));
    EXPECT_EQ(propertyText(module->getInstance(request(), path, CIMPropertyList()), "Text"), "item 7");
    setMode("nothing");
    EXPECT_EQ(errorOf([&] { module->getInstance(request(), path, CIMPropertyList()); }), "6: TST_Item.Id=\"7\"");
    setMode("two");
    EXPECT_EQ(errorOf([&] { module->getInstance(request(), path, CIMPropertyList()); }),
              "1: getInstance returns one instance");
}

// Objects and elements are made by different code; a client must not see which one served it.
TEST_F(Module, WrittenInstancesAreThoseDelivered)
{
    load();
    Array<CIMName> names;
    names.append(CIMName("Number"));
    names.append(CIMName("Missing"));
    for (const std::string mode : {"", "class TST_Leaf", "class TST_Unknown", "class TST_Everything"}) {
        setMode(mode);
        for (const CIMPropertyList& properties : {CIMPropertyList(), CIMPropertyList(names)}) {
            std::string delivered;
            for (const CIMInstance& item : items(properties)) {
                wire::appendNamedInstance(delivered, item, wire::Blanks::kRaw);
            }
            std::string written;
            module->writeInstances(request(), CIMName("TST_Item"), properties,
                                   [&](std::string_view element) { written += element; });
            EXPECT_NE(delivered, "");
            EXPECT_EQ(written, delivered) << mode;
        }
    }
}

TEST_F(Module, SinkMayEndTheEnumeration)
{
    load();
    setMode("count 5000");
    int delivered = 0;
    const auto sink = [&](const CIMInstance&) {
        if (++delivered == 2) {
            throw std::runtime_error("the client is gone");
        }
    };
    EXPECT_THROW(module->enumerateInstances(request(), CIMName("TST_Item"), CIMPropertyList(), sink),
                 std::runtime_error);
    EXPECT_EQ(delivered, 2);
}

CIMInstance embedded()
{
    CIMInstance instance(CIMName("TST_Root"));
    instance.addProperty(CIMProperty(CIMName("Text"), CIMValue(String("inner"))));
    return instance;
}

TEST_F(Module, MethodsEchoEveryType)
{
    Array<String> strings;
    strings.append(String("a"));
    strings.append(String("b"));
    Array<CIMObjectPath> paths;
    paths.append(CIMObjectPath(String("root/cimv2:TST_Root.Id=\"a\"")));
    struct Case
    {
        const char* name;
        CIMValue value;
    };
    const std::vector<Case> cases{
        {"boolean", CIMValue(Boolean{true})},
        {"uint8", CIMValue(Uint8{255})},
        {"sint64", CIMValue(Sint64{-1})},
        {"real32", CIMValue(Real32{0.5F})},
        {"char16", CIMValue(Char16(65))},
        {"string", CIMValue(String("\xC3\xA9"))},
        {"datetime", CIMValue(CIMDateTime(String("20231114221320.123456+060")))},
        {"reference", CIMValue(CIMObjectPath(String("root/cimv2:TST_Everything.Id=\"a\",Number=3")))},
        {"instance", CIMValue(embedded())},
        {"strings", CIMValue(strings)},
        {"no strings", CIMValue(Array<String>())},
        {"references", CIMValue(paths)},
    };
    load();
    for (const Case& row : cases) {
        Array<CIMParamValue> in;
        Array<CIMParamValue> out;
        in.append(CIMParamValue(String("P"), row.value));
        in.append(CIMParamValue(String("Null"), CIMValue(row.value.getType(), row.value.isArray())));
        out.append(CIMParamValue(String("Old"), CIMValue(Uint8{1})));
        const CIMValue result = invoke("Echo", in, out);
        ASSERT_EQ(out.size(), 2U) << row.name;
        EXPECT_EQ(out[1].getValue(), in[1].getValue()) << row.name;
        if (row.value.getType() == CIMTYPE_INSTANCE) {
            CIMInstance instance;
            result.get(instance);
            EXPECT_EQ(propertyText(instance, "Text"), "inner");
            continue;
        }
        EXPECT_EQ(text(result.toString()), text(row.value.toString())) << row.name;
        EXPECT_EQ(out[0].getValue(), row.value) << row.name;
    }
}

TEST_F(Module, MethodWithoutReturnValueSucceeds)
{
    load();
    Array<CIMParamValue> in;
    Array<CIMParamValue> out;
    in.append(CIMParamValue(String("Null"), CIMValue(CIMTYPE_UINT8, false)));
    EXPECT_TRUE(invoke("Echo", in, out).isNull());
    EXPECT_EQ(out.size(), 1U) << "outputs arrive";
    EXPECT_EQ(errorOf([&] { invoke("Nope", "X", CIMValue(Uint8{1})); }), "17: Nope");
}

// What a provider passes and the class lacks is logged once.
TEST_F(Module, NamesThatTheClassLacksAreLoggedOnce)
{
    const std::pair<const char*, const char*> rows[] = {
        {"unknown and mistyped properties", "setProperty: class TST_Everything has no property Nope"},
        {"missing keys", "addKey: Text is not a key of class TST_Root"},
        {"missing keys", "addKey: Nope is not a key of class TST_Root"},
        {"keys have types and values", "addKey: key Number of TST_Everything has another type"},
    };
    load();
    for (const auto& [check, line] : rows) {
        for (int i = 0; i < 2; ++i) {
            invoke("Run", "Name", CIMValue(String(check)));
        }
        const std::vector<std::string> lines = services.logged();
        EXPECT_EQ(std::count(lines.begin(), lines.end(), line), 1) << line;
    }
}

// The checks do what OpenPegasus refuses: the log says so once for each kind, and strict providers are refused too.
TEST_F(Module, ReportsWhatFailsOnOpenPegasus)
{
    const std::pair<const char*, const char*> rows[] = {
        {"arrays of strings take chars", "a CMPI_chars element in an array of CMPI_string is refused"},
        {"elements without value are null", "setElementAt without a value is refused"},
        {"untyped nulls are taken", "a null value of type CMPI_null is refused"},
        {"text is repaired", "text that is not UTF-8 is sent as it is"},
        {"upcalls nest", "upcalls into the own module, nested three deep"},
    };
    load();
    const auto run = [&](const char* check) {
        String failed;
        invoke("Run", "Name", CIMValue(String(check))).get(failed);
        return text(failed);
    };
    for (const auto& [check, habit] : rows) {
        const std::string line = std::string("provider Conformance: works here, fails on OpenPegasus 2.14: ") + habit;
        for (const bool strict : {false, true, false}) {
            services.strict = strict;
            EXPECT_EQ(run(check).empty(), !strict) << check;
        }
        const std::vector<std::string> lines = services.logged();
        EXPECT_EQ(std::count_if(lines.begin(), lines.end(), [&](const auto& at) { return at.rfind(line, 0) == 0; }), 1)
            << check;
    }
    services.strict = true;
    EXPECT_THAT(errorOf([&] { setMode("no done"); }), HasSubstr("1: a method that ends without returnDone"));
}

TEST_F(Module, AsksForAClassOnce)
{
    load();
    setMode("count 1000");
    items();
    items();
    EXPECT_EQ(services.classCount(), 2U); // TST_Item and the method's TST_Check
}

TEST_F(Module, CleanupAnswers)
{
    struct Case
    {
        const char* mode;
        ProviderModule::Cleanup first;
        ProviderModule::Cleanup second;
        std::size_t lines;
    };
    using Cleanup = ProviderModule::Cleanup;
    const std::vector<Case> cases{{"cleanup 0", Cleanup::kReleased, Cleanup::kReleased, 2},
                                  {"cleanup 50", Cleanup::kStayLoaded, Cleanup::kStayLoaded, 4},
                                  {"cleanup 51", Cleanup::kNeverUnload, Cleanup::kNeverUnload, 2}};
    for (const Case& row : cases) {
        load();
        items();
        setMode(row.mode);
        const std::size_t before = services.logged().size();
        EXPECT_EQ(module->cleanupWhenIdle(), row.first) << row.mode;
        EXPECT_EQ(module->cleanupWhenIdle(), row.second) << row.mode;
        EXPECT_EQ(services.logged().size() - before, row.lines) << row.mode;
        EXPECT_EQ(items().size(), 3U) << "usable again after " << row.mode;
        module.reset();
        EXPECT_THAT(services.logged().back(), HasSubstr("terminating 1")) << row.mode;
    }
}

TEST_F(Module, EndsInterfacesInOrderAndUnloads)
{
    load();
    invoke("Tell", "X", CIMValue(Uint8{1}));
    items();
    module.reset();
    EXPECT_THAT(services.logged(), ElementsAre("cleanup instance terminating 1", "cleanup method terminating 1"));
    EXPECT_EQ(::dlopen(CONFORMANCE_LIBRARY, RTLD_LAZY | RTLD_NOLOAD), nullptr);
    load();
    EXPECT_EQ(invoke("Tell", "X", CIMValue(Uint8{1})), CIMValue(Uint32{1})) << "statics are fresh";
}

TEST_F(Module, ServesSixteenClientsAndNeverCleansUpMeanwhile)
{
    load();
    setMode("count 20");
    std::atomic<int> wrong{0};
    std::atomic<int> running{16};
    std::vector<std::thread> clients;
    for (int i = 0; i < 16; ++i) {
        clients.emplace_back([&] {
            for (int round = 0; round < 20; ++round) {
                wrong += items().size() != 20;
            }
            --running;
        });
    }
    std::thread cleaner([&] {
        while (running > 0) {
            module->cleanupWhenIdle();
        }
    });
    for (std::thread& client : clients) {
        client.join();
    }
    cleaner.join();
    EXPECT_EQ(wrong, 0);
    Array<CIMParamValue> out;
    invoke("Tell", Array<CIMParamValue>(), out);
    EXPECT_EQ(out[0].getValue(), CIMValue(Sint32{0}));
}

} // namespace
} // namespace Pegasus::cmpi
