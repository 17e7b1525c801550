// SPDX-License-Identifier: MIT
#include "pegasus/mof/MemoryHandler.h"
#include "tests/pegasus/mof/Describe.h"
#include "tests/pegasus/repository/RepositoryHandler.h"
#include "tests/support/TemporaryDirectory.h"
#include "tools/mofcompare/ClassComparison.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <iterator>
#include <set>
#include <sstream>

using namespace Pegasus;
using namespace Pegasus::repository;
using mof_test::utf8;
using repository_test::compileFile;
using test::TemporaryDirectory;

namespace {

const CIMNamespaceName kNamespace("root/test");

mof::MemoryHandler parse(const std::string& file)
{
    mof::MemoryHandler source;
    mof::CompileOptions options;
    options.nameSpace = kNamespace;
    options.allowExperimental = true;
    mof::compileFile(file, options, source);
    EXPECT_TRUE(source.warnings().empty()) << source.warnings()[0]; // OpenPegasus compiles the schema too
    return source;
}

// Compiles the file into a repository, opens that again and compares every definition with its source.
std::vector<std::string> readBackDifferences(const std::string& file, mof::MemoryHandler& source)
{
    const TemporaryDirectory directory;
    {
        Repository repository(directory.path());
        compileFile(repository, "root/test", file);
    }
    const Repository repository(directory.path());
    const auto lookup = [&source](const CIMName& name, CIMQualifierDecl& found) {
        return source.findQualifier(name, found);
    };
    std::vector<std::string> all;
    const auto add = [&all](const std::vector<std::string>& lines) {
        all.insert(all.end(), lines.begin(), lines.end());
    };
    for (const auto& [key, declaration] : source.qualifiers()) {
        add(mofcompare::differences(declaration, repository.getQualifier(kNamespace, declaration.getName())));
    }
    for (const CIMClass& declared : source.classes()) {
        add(mofcompare::differences(declared, repository.getClass(kNamespace, declared.getClassName(), {}), lookup));
    }
    return all;
}

struct SchemaRow
{
    const char* nameSpace;
    const char* className;
    const char* keys;
    std::string properties;
    const char* methods;
};

void expectMembers(const CIMConstClass& found, const SchemaRow& row)
{
    std::set<std::string> properties;
    for (Uint32 i = 0; i < found.getPropertyCount(); ++i) {
        const CIMConstProperty property = found.getProperty(i);
        properties.insert(std::string(cimTypeToString(property.getType())) + (property.isArray() ? "[] " : " ") +
                          utf8(property.getName().getString()));
    }
    std::istringstream wanted(row.properties);
    for (std::string property; std::getline(wanted, property, ',');) {
        EXPECT_EQ(properties.count(property), 1u) << row.className << ": " << property;
    }
    Array<CIMName> keys;
    found.getKeyNames(keys);
    std::multiset<std::string> keyNames;
    for (Uint32 i = 0; i < keys.size(); ++i) {
        keyNames.insert(utf8(keys[i].getString()));
    }
    std::istringstream keyWords(row.keys);
    EXPECT_EQ(keyNames, std::multiset<std::string>(std::istream_iterator<std::string>(keyWords), {})) << row.className;
    std::istringstream methodWords(row.methods);
    for (std::string method; methodWords >> method;) {
        EXPECT_NE(found.findMethod(CIMName(method.c_str())), PEG_NOT_FOUND) << row.className << "." << method;
    }
    EXPECT_FALSE(found.isAbstract()) << row.className;
}

} // namespace

// What servers, programs and vendors' registrations rely on.
TEST(BaseSchemas, HoldWhatAServerNeeds)
{
    const TemporaryDirectory directory;
    Repository repository(directory.path());
    compileFile(repository, "root/PG_Internal", SCHEMA_DIR "/PG_Internal/PG_Internal.mof");
    compileFile(repository, "root/PG_InterOp", SCHEMA_DIR "/PG_InterOp/PG_InterOp.mof");
    const char* const kElement = "string Caption,string Description,string ElementName,";
    const std::string module =
        std::string(kElement) +
        "string Name,string Vendor,string Version,string InterfaceType,string InterfaceVersion,"
        "string Location,uint16[] OperationalStatus,uint16 UserContext,"
        "string DesignatedUserContext,string ModuleGroupName,uint16 Bitness,datetime InstallDate,"
        "string[] StatusDescriptions,string Status,uint16 HealthState";
    const std::string capabilities = std::string(kElement) + "string ProviderModuleName,string ProviderName,"
                                                             "string CapabilityID,uint16[] ProviderType,";
    const SchemaRow rows[] = {
        {"root/PG_Internal", "PG_ConfigSetting", "PropertyName",
         "string PropertyName,string DefaultValue,string CurrentValue,string PlannedValue,string Description,"
         "boolean DynamicProperty",
         "UpdatePropertyValue"},
        {"root/PG_Internal", "PG_ShutdownService", "", "", "shutdown"},
        {"root/PG_Internal", "PG_Authorization", "Username Namespace",
         "string Username,string Namespace,string Authorization", ""},
        {"root/PG_InterOp", "PG_ProviderModule", "Name", module, "Start Stop"},
        {"root/PG_InterOp", "PG_Provider", "Name ProviderModuleName",
         std::string(kElement) + "string ProviderModuleName,string Name", ""},
        {"root/PG_InterOp", "PG_ProviderCapabilities", "ProviderModuleName ProviderName CapabilityID",
         capabilities + "string ClassName,string[] Namespaces,string[] SupportedProperties,string[] SupportedMethods",
         ""},
        {"root/PG_InterOp", "PG_ConsumerCapabilities", "ProviderModuleName ProviderName CapabilityID",
         capabilities + "string[] Destinations", ""},
    };
    for (const SchemaRow& row : rows) {
        const CIMConstClass found =
            repository.getClass(CIMNamespaceName(row.nameSpace), CIMName(row.className), {false, true, false, {}});
        expectMembers(found, row);
    }
}

TEST(BaseSchemas, ReadBackAsWritten)
{
    for (const char* file : {SCHEMA_DIR "/PG_Internal/PG_Internal.mof", SCHEMA_DIR "/PG_InterOp/PG_InterOp.mof"}) {
        mof::MemoryHandler source = parse(file);
        EXPECT_THAT(readBackDifferences(file, source), testing::IsEmpty()) << file;
    }
}

TEST(DmtfSchema, ReadsBackAsWritten)
{
    const std::string file = DMTF_SCHEMA_FILE;
    if (file.empty()) {
        GTEST_SKIP() << "no DMTF schema: set VRX_DMTF_SCHEMA";
    }
    mof::MemoryHandler source = parse(file);
    EXPECT_THAT(source.warnings(), testing::IsEmpty());
    EXPECT_EQ(source.qualifiers().size(), 70u);
    EXPECT_EQ(source.classes().size(), 1631u);
    EXPECT_THAT(readBackDifferences(file, source), testing::IsEmpty());
}
