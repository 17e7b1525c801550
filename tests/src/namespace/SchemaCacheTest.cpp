// SPDX-License-Identifier: MIT
// Names, and the classes that the namespace mirrors from its server.
#include "src/schema/TPEGASUSClass.h"
#include "src/schema/TPEGASUSQualifierDecl.h"
#include "tests/src/support/NamespaceRig.h"
#include "tests/support/PeerAnswers.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/ICIMClass.h>
#include <host/TCIMReference.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>

namespace NKOLVRX20 {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

TEST(NormalizeNameTest, LowersLegalNamesAndRefusesTheRest)
{
    struct
    {
        const char* fName;
        const char* fNormalized; // null: refused
    } const rows[] = {
        {"", ""},         {"CIM_Foo", "cim_foo"}, {"_x1", "_x1"},      {"A", "a"},
        {"z9_Z", "z9_z"}, {"1abc", nullptr},      {"a-b", nullptr},    {"a b", nullptr},
        {" a", nullptr},  {"a.b", nullptr},       {"<root>", nullptr}, {"a\xC3\xA9", nullptr},
        {"a/b", nullptr}, {"a:b", nullptr},       {"9", nullptr},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        TCapturedLog log;
        if (row.fNormalized) {
            EXPECT_EQ(row.fNormalized, TPEGASUSNamespace::NormalizeName(row.fName));
            EXPECT_THAT(log.Lines(), IsEmpty());
        } else {
            EXPECT_EQ(25U, StatusOf([&] { TPEGASUSNamespace::NormalizeName(row.fName); }));
            EXPECT_THAT(log.Lines(), ElementsAre(std::string("0|PEGASUS: CIM name '") + row.fName + "' is invalid"));
        }
    }
}

TEST(NormalizeNameTest, AcceptsLettersDigitsAndUnderscoresOnly)
{
    TCapturedLog log;
    for (int byte = 1; byte < 256; ++byte) {
        const std::string name = std::string("a") + static_cast<char>(byte);
        const bool legal = (byte < 128 && std::isalnum(byte)) || byte == '_';
        EXPECT_EQ(legal ? 0U : 25U, StatusOf([&] { TPEGASUSNamespace::NormalizeName(name); })) << byte;
    }
}

constexpr char kRefusedContext[] = "0|Invalid context pluginType datatype provided to "
                                   "TPluginManagerNamespace::EnumerateProviders(), must be of type kSint8.";

class SchemaCacheTest : public ::testing::Test
{
  protected:
    SchemaCacheTest() : fNamespace(fRig.MakeConnectedNamespace(fServer)) {}

    static std::vector<std::string> FetchLines(const std::string& name, const std::string& cimNamespace,
                                               const std::string& timeout)
    {
        return {"3|TPEGASUSNamespace::GetClass from Pegasus for: " + name,
                "3|TPEGASUSNamespace::GetClass  NSP=" + cimNamespace + " CLASSNAME = " + name +
                    " From Pegasus CIMOM with ei timeout = " + timeout};
    }
    static std::string NowFound(const std::string& name)
    {
        return "3|TPEGASUSNamespace::GetClass " + name + " Now it is Found in TPEGASUSNamespace";
    }

    TFakeCimServer fServer;
    TNamespaceRig fRig;
    const boost::shared_ptr<TPEGASUSNamespace> fNamespace;
};

TEST_F(SchemaCacheTest, MirrorsAChainFromTheTopAndAsksOnlyOnce)
{
    fServer.AnswerClass("A_Top", "");
    fServer.AnswerClass("A_Middle", "A_Top");
    fServer.AnswerClass("A_Leaf", "A_Middle");
    const auto leaf = fNamespace->GetClass("A_Leaf", {{"timeout", "600"}});
    ASSERT_NE(nullptr, leaf);
    std::vector<std::string> log;
    for (const char* name : {"A_Leaf", "A_Middle", "A_Top"}) {
        const auto lines = FetchLines(name, "root/cimv2", "600");
        log.insert(log.end(), lines.begin(), lines.end());
    }
    log.insert(log.end(), {"3|AllocateClass  --> A_Top  inherit from --> ", NowFound("A_Top"),
                           "3|AllocateClass  --> A_Middle  inherit from --> A_Top", NowFound("A_Middle"),
                           "3|AllocateClass  --> A_Leaf  inherit from --> A_Middle", NowFound("A_Leaf")});
    EXPECT_EQ(log, fRig.fLog.Take());
    EXPECT_EQ(5000U, fNamespace->getPegClient()->getTimeout());

    const std::size_t requests = fServer.Requests().size();
    for (const char* name : {"A_Leaf", "a_leaf", "A_LEAF"}) {
        EXPECT_EQ(leaf, fNamespace->GetClass(name, {{"timeout", 5}})); // the context is not looked at
        EXPECT_THAT(fRig.fLog.Take(),
                    ElementsAre(std::string("3|TPEGASUSNamespace::GetClass ") + name + " Found in TPEGASUSNamespace"));
    }
    EXPECT_NE(nullptr, fNamespace->GetClass("A_Top", {}));
    EXPECT_EQ(requests, fServer.Requests().size());

    std::vector<std::string> visited;
    fNamespace->EnumerateRootClasses(
        [&visited](boost::shared_ptr<ICIMClass> below) {
            visited.push_back(below->GetName({}));
            return true;
        },
        {});
    EXPECT_THAT(visited, ElementsAre("A_Top", "A_Middle", "A_Leaf"));
}

TEST_F(SchemaCacheTest, AsksForAllPropertiesWithQualifiers)
{
    fServer.AnswerClass("A", "");
    fNamespace->GetClass("A", {{"nsp", "root/acme"}});
    const auto bodies = fServer.Bodies("GetClass A");
    EXPECT_EQ(2U, bodies.size()); // for the cache, and for the class itself
    for (const std::string& body : bodies) {
        EXPECT_NE(std::string::npos, body.find("<IPARAMVALUE NAME=\"LocalOnly\">\n<VALUE>FALSE</VALUE>")) << body;
        for (const char* byDefault : {"IncludeQualifiers", "IncludeClassOrigin", "PropertyList"}) // true, false, all
        {
            EXPECT_EQ(std::string::npos, body.find(byDefault)) << body;
        }
        EXPECT_NE(std::string::npos, body.find("<NAMESPACE NAME=\"acme\"/>")) << body;
    }
}

TEST_F(SchemaCacheTest, AnswersTheRootWordAndTheEmptyNameBeforeAnythingElse)
{
    EXPECT_EQ(fNamespace->GetRootClass(), fNamespace->GetClass("<root>", {{"nsp", 1}}));
    EXPECT_EQ(nullptr, fNamespace->GetClass("", {{"nsp", 1}}));
    EXPECT_THAT(fRig.fLog.Take(), ElementsAre("3|TPEGASUSNamespace::GetClass <root> : return <root>"));
    EXPECT_EQ(25U, StatusOf([&] { fNamespace->GetClass("<ROOT>", {}); }));
    EXPECT_THAT(fRig.fLog.Take(), ElementsAre("0|PEGASUS: CIM name '<ROOT>' is invalid"));
    EXPECT_THAT(fServer.Requests(), IsEmpty());
}

TEST_F(SchemaCacheTest, RefusesContextValuesThatAreNoStrings)
{
    const TCIMValue wrong[] = {1, TCIMValue(), TCIMValue(TCIMValue::TCIMType::kString, 0, {"x"})};
    for (const char* key : {"nsp", "timeout"}) {
        for (const TCIMValue& value : wrong) {
            SCOPED_TRACE(key);
            fRig.fLog.Take();
            EXPECT_EQ(14U, StatusOf([&] { fNamespace->GetClass("A", {{key, value}}); }));
            EXPECT_EQ(kRefusedContext, fRig.fLog.Lines().back());
        }
    }
    EXPECT_THAT(fServer.Requests(), IsEmpty());
}

TEST_F(SchemaCacheTest, AnErrorOfTheServerIsANullClass)
{
    auto lines = FetchLines("A_None", "root/cimv2", "60");
    lines.push_back("3|TPEGASUSNamespace::GetClass from Pegasus for: A_None returned exception: "
                    "CIM_ERR_NOT_FOUND: not in the script");
    fNamespace->getPegClient()->setTimeout(301000); // what a slow class before has left
    EXPECT_EQ(nullptr, fNamespace->GetClass("A_None", {}));
    EXPECT_EQ(5000U, fNamespace->getPegClient()->getTimeout());
    EXPECT_EQ(lines, fRig.fLog.Take());

    EXPECT_EQ(nullptr, fNamespace->GetClass("A", {{"nsp", "no//namespace"}}));
    EXPECT_EQ("3|TPEGASUSNamespace::GetClass from Pegasus for: A returned exception: "
              "invalid CIM namespace name: no//namespace",
              fRig.fLog.Take().back());
}

TEST_F(SchemaCacheTest, AnAnswerThatIsNoHttpLeavesAsTheLibrarysOwnException)
{
    fServer.AnswerWith("GetClass A", [](const test::PeerRequest&) { return test::closedConnection(); });
    EXPECT_THROW(fNamespace->GetClass("A", {}), Pegasus::UninitializedObjectException);
    EXPECT_EQ("3|Pegasus::CIMClientMalformedHTTPException -- Connection closed by CIM Server.",
              fRig.fLog.Take().back());
    fServer.AnswerClass("A", ""); // the connection is made again
    EXPECT_NE(nullptr, fNamespace->GetClass("A", {}));
}

TEST_F(SchemaCacheTest, WithoutItsSuperclassAClassStandsBelowTheRoot)
{
    fServer.AnswerClass("A_Leaf", "A_None");
    const auto leaf = boost::dynamic_pointer_cast<TPEGASUSClass>(fNamespace->GetClass("A_Leaf", {}));
    ASSERT_NE(nullptr, leaf);
    EXPECT_THAT(fNamespace->GetRootClass()->GetChildClasses(), ElementsAre(leaf));
}

TEST_F(SchemaCacheTest, AChainBreaksAtTheLinkThatFailsAndStandsAboveAndBelowIt)
{
    struct
    {
        const char* fFailing;
        int fQuestion; // which of the two questions about that class fails
        std::vector<std::string> fTree;
    } const rows[] = {
        {"Top", 1, {"Middle", "Leaf"}},
        {"Top", 2, {"Middle", "Leaf"}},
        {"Middle", 1, {"Leaf"}},
        {"Middle", 2, {"Top", "Leaf"}},
        {"Leaf", 1, {}},
        {"Leaf", 2, {"Top", "Middle"}},
    };
    const std::pair<const char*, const char*> chain[] = {{"Top", ""}, {"Middle", "Top"}, {"Leaf", "Middle"}};
    for (const auto& row : rows) {
        SCOPED_TRACE(std::string(row.fFailing) + ", question " + std::to_string(row.fQuestion));
        std::atomic<int> asked{0};
        for (const auto& [name, super] : chain) {
            const std::string attribute = *super ? std::string(" SUPERCLASS=\"") + super + "\"" : "";
            const std::string answer = std::string("<CLASS NAME=\"") + name + "\"" + attribute + "/>";
            const bool fails = row.fFailing == std::string(name);
            fServer.AnswerWith(std::string("GetClass ") + name, [=, &asked, &row](const test::PeerRequest& request) {
                return fails && ++asked == row.fQuestion ? test::errorAnswer(request, 1, "CIM_ERR_FAILED: link")
                                                         : test::httpAnswer(test::intrinsicBody(request, answer));
            });
        }
        const auto ns = fRig.MakeConnectedNamespace(fServer);
        ::testing::internal::CaptureStdout();
        const auto leaf = ns->GetClass("Leaf", {});
        ::testing::internal::GetCapturedStdout();
        EXPECT_EQ(row.fFailing == std::string("Leaf"), leaf == nullptr);
        std::vector<std::string> tree;
        ns->EnumerateRootClasses(
            [&tree](boost::shared_ptr<ICIMClass> below) {
                tree.push_back(below->GetName({}));
                return true;
            },
            {});
        EXPECT_EQ(row.fTree, tree);
        ASSERT_NE(nullptr, ns->GetClass("Leaf", {})); // nothing of the failure is kept
    }
}

TEST_F(SchemaCacheTest, AClassUnderAnotherNameIsNotFound)
{
    fServer.Answer("GetClass A", "<CLASS NAME=\"B\"></CLASS>");
    fServer.AnswerClass("B", "");
    EXPECT_EQ(nullptr, fNamespace->GetClass("A", {}));
    EXPECT_EQ("0|TPEGASUSNamespace::GetClass A Not Found - Something Wrong", fRig.fLog.Take().back());
}

TEST_F(SchemaCacheTest, AClassThatCannotBeEnteredIsANullClass)
{
    fServer.AnswerClass("B", "");
    ASSERT_NE(nullptr, fNamespace->GetClass("B", {}));
    fServer.Answer("GetClass A", "<CLASS NAME=\"B\"></CLASS>"); // B once more
    fRig.fLog.Take();
    ::testing::internal::CaptureStdout();
    EXPECT_EQ(nullptr, fNamespace->GetClass("A", {}));
    EXPECT_EQ("AllocateClass falied  --- B  \n", ::testing::internal::GetCapturedStdout());
    EXPECT_THAT(fRig.fLog.LinesWith("3|TPEGASUSNamespace: "),
                ElementsAre("3|TPEGASUSNamespace: class B already defined"));
    EXPECT_EQ("3|Catching exeption: AllocateClass  --- B  \twith reason: " + std::string(TVRXException(16).what()),
              fRig.fLog.Take().back());
    fServer.AnswerClass("C", ""); // an exception of another family costs the same
    fRig.fLog.FailOn("AllocateClass  --> C");
    ::testing::internal::CaptureStdout();
    EXPECT_EQ(nullptr, fNamespace->GetClass("C", {}));
    ::testing::internal::GetCapturedStdout();
    EXPECT_THAT(fRig.fLog.Take().back(),
                ::testing::StartsWith("3|Catching exeption: AllocateClass  --- C  \twith reason: "));
}

TEST_F(SchemaCacheTest, AServerWhoseClassesInheritInACircleIsAnsweredInTheEnd)
{
    fServer.AnswerClass("A", "B");
    fServer.AnswerClass("B", "A");
    ::testing::internal::CaptureStdout();
    fNamespace->GetClass("A", {});
    ::testing::internal::GetCapturedStdout();
    EXPECT_THAT(fRig.fLog.LinesWith("0|"),
                ElementsAre("0|TPEGASUSNamespace::GetClass failed for: A: more than 128 superclasses"));
    fServer.AnswerClass("C", "");
    EXPECT_NE(nullptr, fNamespace->GetClass("C", {})); // the count is down again
}

TEST_F(SchemaCacheTest, RedefinitionIsRefusedUnlessAllowedAndThenKeepsTheChildren)
{
    fServer.AnswerClass("A", "");
    fServer.AnswerClass("a", ""); // the server ignores case
    fServer.AnswerClass("A_Child", "A");
    const auto child = fNamespace->GetClass("A_Child", {});
    const auto first = boost::dynamic_pointer_cast<TPEGASUSClass>(fNamespace->GetClass("A", {}));
    TCIMContext context;
    const auto second = boost::dynamic_pointer_cast<TPEGASUSClass>(
        fNamespace->AllocateClass("a", "root/cimv2", "60", nullptr, context));
    EXPECT_EQ(first, fNamespace->GetClass("A", {})); // allocating does not enter
    fRig.fLog.Take();
    EXPECT_EQ(16U, StatusOf([&] { fNamespace->AddClass(second); }));
    EXPECT_THAT(fRig.fLog.Take(), ElementsAre("3|TPEGASUSNamespace: class a already defined"));
    EXPECT_EQ(16U, StatusOf([&] { fNamespace->AddClass(first); })); // stays where it is
    EXPECT_EQ(first, fNamespace->GetClass("A", {}));
    EXPECT_THAT(fNamespace->GetRootClass()->GetChildClasses(), ElementsAre(first));

    fNamespace->SetAllowRedefinition(true);
    fNamespace->AddClass(second);
    EXPECT_EQ(second, fNamespace->GetClass("A", {}));
    EXPECT_THAT(second->GetChildClasses(), ElementsAre(child));
    EXPECT_THAT(fNamespace->GetRootClass()->GetChildClasses(), ElementsAre(second));
    EXPECT_TRUE(child->IsSubclassOf(second, {}));
}

TEST_F(SchemaCacheTest, KeepsQualifierDeclarationsUnderTheirNormalisedNames)
{
    const auto allocate = [&](const char* name) {
        return boost::dynamic_pointer_cast<TPEGASUSQualifierDecl>(fNamespace->AllocateQualifierDecl(
            name, TCIMValue(true), ICIMQualifierDecl::kScopeClass, ICIMQualifierDecl::kFlavorOverridable, {}));
    };
    const auto key = allocate("Key");
    EXPECT_EQ(nullptr, fNamespace->FindQualifierDecl("KEY")); // allocated, not entered
    fNamespace->AddQualifierDecl(key);
    fNamespace->AddQualifierDecl(allocate("Abstract"));
    EXPECT_EQ(key, fNamespace->FindQualifierDecl("KEY"));
    fRig.fLog.Take();
    EXPECT_EQ(16U, StatusOf([&] { fNamespace->AddQualifierDecl(allocate("kEY")); }));
    EXPECT_THAT(fRig.fLog.Take(), ElementsAre("3|TPEGASUSNamespace: qualifier kEY already defined"));
    EXPECT_EQ(25U, StatusOf([&] { fNamespace->AddQualifierDecl(allocate("not a name")); }));

    for (const int stopAfter : {1, 9}) {
        std::vector<std::string> visited;
        fNamespace->EnumerateQualifierDecls(
            [&](boost::shared_ptr<ICIMQualifierDecl> declaration) {
                visited.push_back(declaration->GetName({}));
                return static_cast<int>(visited.size()) < stopAfter;
            },
            {});
        EXPECT_EQ(stopAfter == 1 ? std::vector<std::string>{"Abstract"} : (std::vector<std::string>{"Abstract", "Key"}),
                  visited);
    }
    fNamespace->SetAllowRedefinition(true);
    const auto other = allocate("KEY");
    fNamespace->AddQualifierDecl(other);
    EXPECT_EQ(other, fNamespace->FindQualifierDecl("key"));
}

} // namespace
} // namespace NKOLVRX20
