// SPDX-License-Identifier: MIT
// Which libraries and factories are taken, and what the others are refused with.
#include "pegasus/cmpi/module/ProviderLibrary.h"
#include "tests/pegasus/cmpi/ModuleFixture.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#define FAULT_LIBRARY(fault) FAULT_LIBRARY_PREFIX #fault ".so"

namespace Pegasus::cmpi {
namespace {

using testing::HasSubstr;

TEST_F(Module, RefusesLibrariesThatAreNone)
{
    struct Case
    {
        const char* name;
        const char* library;
        const char* provider;
        const char* expected;
    };
    const std::vector<Case> cases{
        {"no such file", "/nonexistent/libx.so", "Faulty",
         "ProviderLoadFailure: (/nonexistent/libx.so) Cannot load library, error: "},
        {"not a library", CONFORMANCE_SOURCES "/conformance.mof", "Faulty", "Cannot load library, error: "},
        {"other provider name", CONFORMANCE_LIBRARY, "conformance",
         ") Provider is not a CMPI style provider. Cannot find conformance_Create<mi-type>MI symbol."},
        {"misspelt", FAULT_LIBRARY(MISSPELT), "Faulty", "Cannot find Faulty_Create<mi-type>MI symbol."},
        {"both styles", FAULT_LIBRARY(BOTH_STYLES), "Faulty", "both generic and Faulty entry points"},
        {"no interface", FAULT_LIBRARY(NULL_OK), "Faulty", "ProviderInitFailure: "},
        {"no table", FAULT_LIBRARY(NO_TABLE), "Faulty",
         "provider Faulty, Faulty_Create_InstanceMI: the interface has no function table"},
    };
    for (const Case& row : cases) {
        const std::string error = errorOf([&] {
            load(row.library, row.provider);
            items();
        });
        EXPECT_THAT(error, testing::StartsWith("1: Provider")) << row.name;
        EXPECT_THAT(error, HasSubstr(row.expected)) << row.name;
    }
}

TEST_F(Module, TriesAFailedFactoryAgain)
{
    load(FAULT_LIBRARY(FAILS_ONCE), "Faulty");
    const std::string error = errorOf([&] { items(); });
    EXPECT_THAT(error, HasSubstr("Faulty_Create_InstanceMI: no device yet"));
    EXPECT_EQ(items().size(), 1U);
    EXPECT_EQ(errorOf([&] { invoke("Any", "X", CIMValue(Uint8{1})); }),
              "16: provider Faulty has no Method interface: " FAULT_LIBRARY(
                  FAILS_ONCE) " defines neither "
                              "Faulty_Create_MethodMI nor _Generic_Create_MethodMI");
}

TEST_F(Module, SurvivesWhatProvidersInCppThrow)
{
    load(FACTORY_LIBRARY, "Exact");
    EXPECT_EQ(items().size(), 0U);
    load(FACTORY_LIBRARY, "Throwing");
    EXPECT_THAT(errorOf([&] { items(); }), HasSubstr("Throwing_Create_InstanceMI: no device: the factory throws"));
    load(FACTORY_LIBRARY, "Late");
    EXPECT_EQ(errorOf([&] { items(); }), "1: Unknown error.");
}

TEST_F(Module, GenericFactoriesGetTheProvidersName)
{
    load(FAULT_LIBRARY(GENERIC), "AnyName");
    EXPECT_EQ(propertyText(items().at(0), "Id"), "AnyName");
}

TEST_F(Module, ReadsNothingBehindAnOldTable)
{
    load(FAULT_LIBRARY(OLD_TABLE), "Faulty");
    EXPECT_EQ(propertyText(items().at(0), "Id"), "static");
    EXPECT_EQ(
        errorOf([&] { module->getInstance(request(), CIMObjectPath(String("TST_Item.Id=\"1\"")), CIMPropertyList()); }),
        "7: provider Faulty does not implement getInstance");
}

TEST(ProviderLibrary, IsTheFirstInTheDirectories)
{
    const std::string directory = CONFORMANCE_SOURCES;
    EXPECT_EQ(findProviderLibrary({"/nonexistent", CONFORMANCE_DIRECTORY, directory}, "conformance", "M"),
              std::string(CONFORMANCE_DIRECTORY) + "/libconformance.so");
    EXPECT_EQ(errorOf([&] { findProviderLibrary({directory}, "NoSuchLibrary", "NoLibModule"); }),
              "1: File \"libNoSuchLibrary.so\" was not found for provider module \"NoLibModule\".");
}

} // namespace
} // namespace Pegasus::cmpi
