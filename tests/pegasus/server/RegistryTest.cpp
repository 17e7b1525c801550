// SPDX-License-Identifier: MIT
// What a registration must be, and what is found by it.
#include "pegasus/server/operations/ProviderRegistry.h"
#include "pegasus/server/operations/RegistrationChecks.h"
#include "tests/support/TemporaryDirectory.h"

#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <utility>
#include <vector>

namespace Pegasus::server {
namespace {

using Properties = std::vector<std::pair<const char*, CIMValue>>;

CIMInstance makeInstance(const char* className, const Properties& properties)
{
    CIMInstance instance((CIMName(className)));
    for (const auto& [name, value] : properties) {
        if (!value.isNull()) {
            instance.addProperty(CIMProperty(CIMName(name), value));
        }
    }
    return instance;
}

CIMValue text(const char* value)
{
    return CIMValue(String(value));
}

CIMValue texts(const char* value)
{
    Array<String> values;
    values.append(String(value));
    return CIMValue(values);
}

CIMValue numbers(Uint16 value)
{
    Array<Uint16> values;
    values.append(value);
    return CIMValue(values);
}

CIMInstance module(const char* type = "CMPI", const char* version = "2.0.0", const CIMValue& location = text("x"),
                   const CIMValue& userContext = CIMValue())
{
    return makeInstance(kModuleClass, {{"Name", text("M")},
                                       {"Vendor", text("V")},
                                       {"Version", text("1")},
                                       {"InterfaceType", text(type)},
                                       {"InterfaceVersion", text(version)},
                                       {"Location", location},
                                       {"UserContext", userContext}});
}

CIMInstance provider(const char* moduleName, const char* name)
{
    return makeInstance(kProviderClass, {{"ProviderModuleName", text(moduleName)}, {"Name", text(name)}});
}

CIMInstance capabilities(const char* name, const char* id, const CIMValue& nameSpaces = texts("root/x"),
                         Uint16 type = 2)
{
    return makeInstance(kCapabilitiesClass, {{"ProviderModuleName", text("M")},
                                             {"ProviderName", text(name)},
                                             {"CapabilityID", text(id)},
                                             {"ClassName", text("C")},
                                             {"Namespaces", nameSpaces},
                                             {"ProviderType", numbers(type)}});
}

void addClass(repository::Repository& repository, const char* name, const std::vector<const char*>& keys,
              const Properties& others)
{
    CIMClass cimClass((CIMName(name)));
    for (const char* key : keys) {
        CIMProperty property(CIMName(key), CIMValue(CIMTYPE_STRING, false));
        property.addQualifier(CIMQualifier(CIMName("Key"), CIMValue(Boolean(true))));
        cimClass.addProperty(property);
    }
    for (const auto& [other, value] : others) {
        cimClass.addProperty(CIMProperty(CIMName(other), value));
    }
    repository.createClass(CIMNamespaceName(kInteropNamespace), cimClass);
}

class RegistryTest : public testing::Test
{
  protected:
    RegistryTest() : fRepository(fHome.path() + "/repository"), fRegistry(fRepository)
    {
        const CIMValue string(CIMTYPE_STRING, false);
        const CIMValue strings(CIMTYPE_STRING, true);
        const CIMValue codes(CIMTYPE_UINT16, true);
        fRepository.createNamespace(CIMNamespaceName(kInteropNamespace));
        fRepository.setQualifier(CIMNamespaceName(kInteropNamespace),
                                 CIMQualifierDecl(CIMName("Key"), CIMValue(Boolean(false)), CIMScope::PROPERTY));
        addClass(fRepository, kModuleClass, {"Name"},
                 {{"Vendor", string},
                  {"Version", string},
                  {"InterfaceType", string},
                  {"InterfaceVersion", string},
                  {"Location", string},
                  {"UserContext", CIMValue(CIMTYPE_UINT16, false)},
                  {"OperationalStatus", codes}});
        addClass(fRepository, kProviderClass, {"ProviderModuleName", "Name"}, {});
        addClass(fRepository, kCapabilitiesClass, {"ProviderModuleName", "ProviderName", "CapabilityID"},
                 {{"ClassName", string}, {"Namespaces", strings}, {"ProviderType", codes}});
    }

    std::string errorOf(const CIMInstance& instance)
    {
        try {
            fRegistry.registerInstance(instance);
            return "";
        } catch (const CIMException& error) {
            return std::to_string(error.getCode()) + " " + std::string(error.getMessage().getCString());
        }
    }

    test::TemporaryDirectory fHome;
    repository::Repository fRepository;
    ProviderRegistry fRegistry;
};

struct RegistrationRow
{
    const char* name;
    CIMInstance instance;
    const char* error; // code and text; empty: accepted
};

TEST_F(RegistryTest, registrationsAreCheckedInOrder)
{
    const RegistrationRow rows[] = {
        {"provider first", provider("M", "P"),
         "1 PG_ProviderModule class needs to be registered before register the PG_Provider class"},
        {"no location", module("CMPI", "2.0.0", CIMValue()),
         "4 Missing Location which is required property in PG_ProviderModule class."},
        {"type", module("Nonsense"), "7 Unsupported InterfaceType value: \"Nonsense\""},
        {"version", module("CMPI", "9.9.9"), "7 Unsupported InterfaceVersion value: \"9.9.9\""},
        {"no version", module("CMPI", ""), ""},
        {"user context", module("CMPI", "2.0.0", text("x"), CIMValue(Uint16(9))),
         "7 Unsupported UserContext value: \"9\"."},
        {"module again", module(), "11 PG_ProviderModule.Name=\"M\""},
        {"capabilities first", capabilities("P", "1"),
         "1 PG_Provider class needs to be registered before register the Provider capabilities class"},
        {"provider", provider("M", "P"), ""},
        {"other provider", provider("M", "Q"), ""},
        {"no namespaces", capabilities("P", "1", CIMValue()),
         "4 Missing Namespaces which is required property in PG_ProviderCapabilities class."},
        {"wildcard", capabilities("P", "1", texts("root/cim*")), "1 invalid CIM namespace name: root/cim*"},
        {"provider type", capabilities("P", "1", texts("root/x"), 9),
         "7 Unsupported ProviderType value \"9\" in PG_ProviderCapabilities instance."},
        {"capabilities", capabilities("P", "1"), ""},
        {"capabilities again", capabilities("P", "1"),
         "11 PG_ProviderCapabilities.CapabilityID=\"1\",ProviderModuleName=\"M\",ProviderName=\"P\""},
        {"taken", capabilities("Q", "1"), "1 A provider is already registered for the specified capability."},
        {"another type of it", capabilities("Q", "2", texts("root/x"), 5), ""},
        {"another namespace", capabilities("Q", "3", texts("root/y")), ""},
    };
    for (const RegistrationRow& row : rows) {
        EXPECT_EQ(errorOf(row.instance), row.error) << row.name;
    }

    const auto found = fRegistry.find(CIMNamespaceName("ROOT/X"), CIMName("c"), ProviderType::kInstance);
    ASSERT_TRUE(found);
    EXPECT_EQ(found->module, "M");
    EXPECT_EQ(found->provider, "P");
    EXPECT_EQ(found->location, "x");
    EXPECT_EQ(fRegistry.find(CIMNamespaceName("root/x"), CIMName("C"), ProviderType::kMethod)->provider, "Q");
    EXPECT_FALSE(fRegistry.find(CIMNamespaceName("root/y"), CIMName("C"), ProviderType::kMethod));
    const std::tuple<const char*, int, int> removals[] = {
        // and how many providers and capabilities are left
        {"PG_ProviderCapabilities.CapabilityID=\"3\",ProviderModuleName=\"M\",ProviderName=\"Q\"", 2, 2},
        {"PG_Provider.ProviderModuleName=\"M\",Name=\"P\"", 1, 1},
        {"PG_ProviderModule.Name=\"M\"", 0, 0},
    };
    for (const auto& [path, providers, entries] : removals) {
        SCOPED_TRACE(path);
        fRegistry.removeInstance(CIMObjectPath(path));
        const auto count = [&](const char* name) {
            return static_cast<int>(
                fRepository.enumerateInstanceNames(CIMNamespaceName(kInteropNamespace), CIMName(name)).size());
        };
        EXPECT_EQ(count(kProviderClass), providers);
        EXPECT_EQ(count(kCapabilitiesClass), entries);
        EXPECT_FALSE(fRegistry.find(CIMNamespaceName("root/y"), CIMName("C"), ProviderType::kInstance));
        EXPECT_THROW(fRegistry.removeInstance(CIMObjectPath(path)), CIMException);
    }
    EXPECT_EQ(errorOf(module()), "") << "it can be registered again";
}

} // namespace
} // namespace Pegasus::server
