// SPDX-License-Identifier: MIT
// MOF files beside a path, and the providers that lie on disk.
#include "src/provider/TPEGASUSProvider.h"
#include "src/provider/TPEGASUSRequestedClassParser.h"
#include "tests/src/support/NamespaceRig.h"

#include <host/TVRXException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

namespace NKOLVRX20 {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;

constexpr char kAcmeClasses[] = "<vrx><timeout value='30'/><nsp name='root/acme'/><module name='acme'/>"
                                "<functionality diagnosticonly='YES'/><class name='B'/><class name='A[9]'/></vrx>";

class DiscoveryTest : public ::testing::Test
{
  protected:
    TNamespaceRig fRig;
};

TEST_F(DiscoveryTest, FindsMofFilesByAPartOfTheirName)
{
    const TTempTree& tree = fRig.fModule;
    tree.Write("vendor/a.registration.mof", "");
    tree.Write("vendor/a.registration.mof.bak", "");
    tree.Write("vendor/b.properties.mof", "");
    tree.Write("vendor/deeper/c.registration.mof", "");
    const std::string directory = tree.Path() + "/vendor";
    const auto ns = fRig.MakeNamespace();
    const auto expected =
        UnorderedElementsAre(directory + "/a.registration.mof", directory + "/a.registration.mof.bak");
    EXPECT_THAT(ns->FindMofFiles(directory, ".registration.mof"), expected);
    EXPECT_THAT(ns->BuildMofPath(directory + "/any.classes.xml", ".registration.mof"), expected);
    EXPECT_THAT(ns->FindMofFiles(directory + "/none", ".registration.mof"), IsEmpty());
    EXPECT_THAT(ns->FindMofFiles(directory, "."), ::testing::Contains(directory + "/.."));
    EXPECT_EQ(3U, StatusOf([&] { ns->BuildMofPath("bare.classes.xml", ".registration.mof"); }));
    EXPECT_THAT(fRig.fLog.Lines(),
                ElementsAre("0|TPEGASUSNamespace::BuildMofPath failed: no directory in \"bare.classes.xml\""));
}

TEST_F(DiscoveryTest, FindsClassFilesOneDirectoryDeepInByteOrder)
{
    const std::string mellanox = fRig.WriteProvider("mellanox", "a.classes.xml", "");
    const std::string upper = fRig.WriteProvider("Zeta", "z.classes.xml", "");
    const std::string backup = fRig.WriteProvider("broadcom", "a.classes.xml.bak", "");
    const std::string broadcom = fRig.WriteProvider("broadcom", "a.classes.xml", "");
    fRig.WriteProvider("broadcom", "a.properties.mof", "");
    fRig.WriteProvider("broadcom/deeper", "a.classes.xml", "");
    fRig.fModule.Write("pegasus/provider/stray.classes.xml", "");
    const std::string providers = fRig.M() + "/pegasus/provider";
    ASSERT_EQ(0, ::symlink("nowhere", (providers + "/dangling").c_str()));
    ASSERT_EQ(0, ::symlink("Zeta", (providers + "/linked").c_str()));
    const std::string directory = fRig.fModule.MakeDirectory("pegasus/provider/broadcom/dir.classes.xml");
    const auto ns = fRig.MakeNamespace();
    EXPECT_THAT(ns->FindXmlFiles(providers, ".classes.xml"),
                ElementsAre(upper, broadcom, backup, directory, providers + "/linked/z.classes.xml", mellanox));
    EXPECT_THAT(ns->FindSubDirs(providers), UnorderedElementsAre("mellanox", "broadcom", "Zeta", "linked"));
    EXPECT_EQ(11U, StatusOf([&] { ns->FindXmlFiles(fRig.M() + "/none", ".classes.xml"); }));
}

TEST_F(DiscoveryTest, OneUnreadableVendorDirectoryEndsTheSearch)
{
    fRig.WriteProvider("acme", "a.classes.xml", kAcmeClasses);
    const std::string locked = fRig.fModule.MakeDirectory("pegasus/provider/locked");
    fRig.fWorld.fUnreadableDirectory = locked;
    const auto ns = fRig.MakeNamespace();
    EXPECT_EQ(11U, StatusOf([&] { ns->FindProviders(); }));
    EXPECT_THAT(fRig.fLog.Lines(),
                ElementsAre("0|TPEGASUSNamespace::FindXmlFiles failed: " + locked + ": Permission denied"));
    EXPECT_THAT(ns->GetProvidersContainer(), IsEmpty());
}

TEST_F(DiscoveryTest, FillsAProviderFromItsFile)
{
    const std::string path = fRig.WriteProvider("acme", "a.classes.xml", kAcmeClasses);
    const auto ns = fRig.MakeNamespace();
    ns->prepareRegProvider(path);
    ns->prepareRegProvider(path); // once is enough
    ASSERT_EQ(1U, ns->GetProvidersContainer().size());
    const TPEGASUSProvider& provider = *ns->GetProvidersContainer().front();
    EXPECT_EQ("pegasus", provider.GetType());
    EXPECT_EQ(path, provider.GetPath());
    EXPECT_EQ("acme", provider.GetName({}));
    EXPECT_EQ("acme", provider.GetDescription({}));
    EXPECT_EQ("libacme", provider.GetModuleName({}));
    EXPECT_EQ("root/acme", provider.GetNameSpaceName({}));
    EXPECT_EQ("root/acme", std::string(provider.GetPegNamespace().getString().getCString()));
    EXPECT_EQ("30", provider.GetDefaultTimeoutVal());
    EXPECT_THAT(provider.GetClassVector(), ElementsAre("B", "A[9]"));
    EXPECT_TRUE(provider.GetDiagnosticOnly());
    EXPECT_THAT(fRig.fLog.LinesWith("3|"),
                ElementsAre("3|Loading... " + path,
                            "3|TPEGASUSNamespace::parseClasses collected for Class info = B , A[9] , \n"
                            "NSP = root/acme\nDefault timeout = 30\nModule name = acme",
                            "3|TPEGASUSNamespace created Provider " + path + "\n"));
}

TEST_F(DiscoveryTest, OnlyTheExactWordMakesAProviderDiagnosticOnly)
{
    const auto ns = fRig.MakeNamespace();
    for (const char* word : {"yes", "Yes", "NO", "", "YES "}) {
        SCOPED_TRACE(word);
        ns->prepareRegProvider(
            fRig.WriteProvider("acme", std::string("x") + word + ".classes.xml",
                               std::string("<vrx><functionality diagnosticonly='") + word + "'/></vrx>"));
        EXPECT_FALSE(ns->GetProvidersContainer().back()->GetDiagnosticOnly());
    }
}

TEST_F(DiscoveryTest, AFileThatCannotBeReadGivesAnEmptyProvider)
{
    const std::string pipe = fRig.fModule.MakeDirectory("pegasus/provider/acme") + "/pipe.classes.xml";
    ASSERT_EQ(0, ::mkfifo(pipe.c_str(), 0600)); // would block whoever opens it
    const std::string locked = fRig.WriteProvider("acme", "locked.classes.xml", kAcmeClasses);
    fRig.fWorld.fFiles[locked] = "";
    const std::string paths[] = {pipe, locked, fRig.fModule.MakeDirectory("pegasus/provider/acme/dir.classes.xml"),
                                 fRig.M() + "/pegasus/provider/acme/none.classes.xml"};
    const auto ns = fRig.MakeNamespace();
    for (const std::string& path : paths) {
        SCOPED_TRACE(path);
        fRig.fLog.Take();
        ns->prepareRegProvider(path);
        const TPEGASUSProvider& provider = *ns->GetProvidersContainer().back();
        EXPECT_EQ("lib", provider.GetModuleName({}));
        EXPECT_EQ("", provider.GetName({}));
        EXPECT_EQ("", provider.GetDefaultTimeoutVal());
        EXPECT_THAT(provider.GetClassVector(), IsEmpty());
        EXPECT_FALSE(provider.GetDiagnosticOnly());
        EXPECT_EQ("", provider.GetNameSpaceName({}));
        EXPECT_THAT(fRig.fLog.Lines(),
                    ElementsAre("3|Loading... " + path, "3|TPEGASUSNamespace created Provider " + path + "\n"));
    }
    std::vector<std::string> classes = {"kept"};
    std::map<std::string, std::string> information = {{"kept", "too"}};
    ns->parseProvider(pipe, classes, information);
    EXPECT_THAT(classes, ElementsAre("kept"));
    EXPECT_EQ("too", information["kept"]);
}

TEST_F(DiscoveryTest, ATooLargeFileCostsItsOwnProviderOnly)
{
    const std::string large = fRig.WriteProvider("acme", "a.classes.xml", "<vrx/>");
    ASSERT_EQ(0, ::truncate(large.c_str(), static_cast<off_t>(kMaxRequestedClassFileBytes) + 1));
    const std::string good = fRig.WriteProvider("acme", "b.classes.xml", "<vrx/>");
    const TFakeCimServer refusing;
    fRig.OfferPortOf(refusing);
    const auto ns = fRig.MakeNamespace();
    ns->Initialize(fRig.Context());
    fRig.fLog.Take();
    EXPECT_EQ(42U, StatusOf([&] { ns->FindProviders(); })); // nothing to connect the good one to
    ASSERT_EQ(1U, ns->GetProvidersContainer().size());
    EXPECT_EQ(good, ns->GetProvidersContainer().front()->GetPath());
    EXPECT_THAT(fRig.fLog.LinesWith("0|TP"), ElementsAre("0|TPEGASUSNamespace::parseProvider failed: " + large + ": " +
                                                         std::to_string(kMaxRequestedClassFileBytes + 1) +
                                                         " bytes are more than any such file may have"));
    EXPECT_THAT(
        fRig.fLog.LinesWith("3|TPEGASUSNamespace::P"),
        ElementsAre("3|TPEGASUSNamespace::Prefilter: 2 providers.", "3|TPEGASUSNamespace::Postfilter: 2 providers."));
    fRig.fLog.FailOn("Loading... "); // an exception of another family costs the whole search
    EXPECT_THROW(ns->FindProviders(), std::runtime_error);
    fRig.fLog.FailOn("");
}

TEST_F(DiscoveryTest, SplitsARequestedEntry)
{
    struct
    {
        const char* fEntry;
        const char* fClass;
        const char* fTimeOut; // "-": left as it was
        const char* fTag;     // null: none
    } const rows[] = {
        {"CIM_Foo", "CIM_Foo", "-", nullptr},
        {"CIM_Foo[120]", "CIM_Foo", "120", nullptr},
        {"CIM_Foo%^CDM^%", "CIM_Foo", "-", "CDM"},
        {"CIM_Foo[120]%^CDM^%", "CIM_Foo", "120", "CDM"},
        {"CIM_Foo%^CDM^%[120]", "CIM_Foo", "120", "CDM"},
        {"CIM_Foo%^other^%", "CIM_Foo", "-", "other"},
        {"CIM_Foo[120", "CIM_Foo", "-", nullptr},
        {"CIM_Foo120]", "CIM_Foo120]", "-", nullptr},
        {"CIM_Foo]120[", "CIM_Foo]120", "-", nullptr},
        {"CIM_Foo[]", "CIM_Foo", "", nullptr},
        {"CIM_Foo[1[2]3]", "CIM_Foo", "1[2", nullptr},
        {"CIM_Foo[1][2]", "CIM_Foo", "1", nullptr},
        {"CIM_Foo%^^%", "CIM_Foo", "-", nullptr},
        {"CIM_Foo%^a%^b^%c^%", "CIM_Foo", "-", "a%^b"},
        {"CIM_Foo%^%", "CIM_Foo", "-", nullptr},
        {"CIM_Foo^%CDM%^", "CIM_Foo^%CDM", "-", nullptr},
        {"CIM_Foo%^CDM", "CIM_Foo", "-", nullptr},
        {"CIM_Foo^%", "CIM_Foo^%", "-", nullptr},
        {"CIM_Foo[%^CDM^%]", "CIM_Foo", "%^CDM^%", "CDM"},
        {"CIM_Foo%^[5]^%", "CIM_Foo", "5", "[5]"},
        {"[5]", "", "5", nullptr},
        {"", "", "-", nullptr},
    };
    const auto ns = fRig.MakeNamespace();
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fEntry);
        fRig.fLog.Take();
        std::map<std::string, std::string> tags = {{"TimeOut", "-"}}, expected = {{"TimeOut", row.fTimeOut}};
        if (row.fTag) {
            expected["Tag"] = row.fTag;
        }
        EXPECT_EQ(row.fClass, ns->filterTag4classes(row.fEntry, tags));
        EXPECT_EQ(expected, tags);
        const bool isCdm = row.fTag && std::string(row.fTag) == "CDM";
        EXPECT_EQ(isCdm ? std::vector<std::string>{std::string("3|TPEGASUSNamespace::filterTag4classes find one CDM "
                                                               "class: ") +
                                                   row.fClass}
                        : std::vector<std::string>{},
                  fRig.fLog.Lines());
    }
}

} // namespace
} // namespace NKOLVRX20
