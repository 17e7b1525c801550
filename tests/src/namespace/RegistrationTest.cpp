// SPDX-License-Identifier: MIT
// From a provider on disk to one that the host is offered: compilation, collection, connection, enumeration.
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"
#include "tests/src/support/NamespaceRig.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMProperty.h>
#include <host/TConfig.h>
#include <host/TVRXException.h>

#include <boost/thread/exceptions.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <stdexcept>
#include <thread>

namespace NKOLVRX20 {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;

constexpr char kDontCollect[] = "<QUALIFIER NAME=\"DONTCOLLECT\" TYPE=\"boolean\"><VALUE>TRUE</VALUE></QUALIFIER>";
constexpr char kDoCollect[] = "<QUALIFIER NAME=\"DONTCOLLECT\" TYPE=\"boolean\"><VALUE>FALSE</VALUE></QUALIFIER>";
constexpr char kNullCollect[] = "<QUALIFIER NAME=\"DONTCOLLECT\" TYPE=\"boolean\"></QUALIFIER>";
constexpr char kDontCollectDeclaration[] =
    "<QUALIFIER.DECLARATION NAME=\"DONTCOLLECT\" TYPE=\"boolean\"><SCOPE CLASS=\"true\"/><VALUE>FALSE</VALUE>"
    "</QUALIFIER.DECLARATION>";

class RegistrationTest : public ::testing::Test
{
  protected:
    RegistrationTest() { fServer.Answer("GetQualifier DONTCOLLECT", kDontCollectDeclaration); }

    // Writes a provider's class file. Returns: its path.
    std::string AddProvider(const std::string& vendor, const std::vector<std::string>& entries) const
    {
        std::string text = "<vrx><nsp name='root/" + vendor + "'/><module name='" + vendor + "'/><timeout value='30'/>";
        for (const std::string& entry : entries) {
            text += "<class name='" + entry + "'/>";
        }
        return fRig.WriteProvider(vendor, "a.classes.xml", text + "</vrx>");
    }

    // Returns: the names that the provider offers.
    static std::vector<std::string> Offered(TPEGASUSProvider& provider)
    {
        std::vector<std::string> names;
        provider.EnumerateClassesProvided(
            [&names](boost::shared_ptr<ICIMClass> offered) {
                names.push_back(offered->GetName({}));
                return false; // does not count here
            },
            {});
        return names;
    }

    TFakeCimServer fServer;
    TNamespaceRig fRig;
};

TEST_F(RegistrationTest, CompilesDefinitionsBeforeRegistrationsThenCollectsAndConnects)
{
    const std::string path = AddProvider("acme", {"ACME_One[300]", "ACME_Two"});
    fRig.WriteProvider("acme", "a.registration.mof", "");
    fRig.WriteProvider("acme", "a.properties.mof", "");
    fServer.AnswerClass("ACME_One", "");
    fServer.AnswerClass("ACME_Two", "");
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    ns->FindProviders();

    const std::string directory = "M/pegasus/provider/acme/";
    EXPECT_THAT(fRig.Abbreviate(fRig.fWorld.Trace()),
                ElementsAre("run cimmof -n root/acme -aE " + directory + "a.properties.mof",
                            "run cimmof -n root/PG_InterOp -aE " + directory + "a.registration.mof"));
    const std::string fetched = "3|TPEGASUSNamespace::GetClass from Pegasus for: ";
    const std::string asked = "3|TPEGASUSNamespace::GetClass  NSP=root/acme CLASSNAME = ";
    const std::string timeout = " From Pegasus CIMOM with ei timeout = ";
    const auto mirrored = [](const std::string& name) {
        return "3|TPEGASUSNamespace::GetClass " + name + " Now it is Found in TPEGASUSNamespace";
    };
    const std::string reported = "0|Performance Data RDD Parser line 1:Unrecognized identifier";
    EXPECT_THAT(fRig.fLog.Lines(),
                ElementsAre("3|TPEGASUSNamespace::Prefilter: 1 providers.",
                            "3|TPEGASUSNamespace::Postfilter: 1 providers.", "3|Loading... " + path, reported + ":vrx",
                            reported, reported, reported,
                            "3|TPEGASUSNamespace::parseClasses collected for Class info = ACME_One[300] , ACME_Two , \n"
                            "NSP = root/acme\nDefault timeout = 30\nModule name = acme",
                            "3|TPEGASUSNamespace created Provider " + path + "\n", "3|before reg...",
                            "3|Entering TPEGASUSNamespace::regProvider: " + path, "3|", "3|", "3|after reg...",
                            "3|Entering TPEGASUSNamespace::ffinishRegProvider: " + path, fetched + "ACME_One",
                            asked + "ACME_One" + timeout + "300", "3|AllocateClass  --> ACME_One  inherit from --> ",
                            mirrored("ACME_One"), "3|TPEGASUSNamespace::Getting class: ACME_One from Pegasus CIMOM",
                            fetched + "ACME_Two", asked + "ACME_Two" + timeout + "30",
                            "3|AllocateClass  --> ACME_Two  inherit from --> ", mirrored("ACME_Two"),
                            "3|TPEGASUSNamespace::Getting class: ACME_Two from Pegasus CIMOM",
                            "3|TPEGASUSProvider::connect enter", "3|TPEGASUSProvider::connect succeeded ",
                            "3|TPEGASUSNamespace finished adding Provider " + path));
    TPEGASUSProvider& provider = *ns->GetProvidersContainer().front();
    EXPECT_TRUE(provider.isConnected());
    EXPECT_NE(ns->getPegClient(), provider.getPegClient());
    EXPECT_THAT(Offered(provider), ElementsAre("ACME_One", "ACME_Two"));
    EXPECT_TRUE(provider.IsClassesProvided("ACME_One"));
    EXPECT_FALSE(provider.IsClassesProvided("acme_one"));
    const auto bound = boost::dynamic_pointer_cast<TPEGASUSClass>(ns->GetClass("acme_two", {}));
    EXPECT_EQ(&provider, bound->GetProvider().get());
}

TEST_F(RegistrationTest, AVendorsFilesOfOneKindAreCompiledByTheirNames)
{
    AddProvider("acme", {});
    std::vector<std::string> trace;
    for (const char* kind : {".properties.mof", ".registration.mof"}) {
        for (const char* name : {"c", "a", "d", "B", "10", "9"}) { // no directory has them in the order of their names
            fRig.WriteProvider("acme", std::string(name) + kind, "");
        }
        for (const char* name : {"10", "9", "B", "a", "c", "d"}) {
            trace.push_back(std::string("run cimmof -n ") + (*(kind + 1) == 'p' ? "root/acme" : "root/PG_InterOp") +
                            " -aE M/pegasus/provider/acme/" + name + kind);
        }
    }
    fRig.MakeConnectedNamespace(fServer)->FindProviders();
    auto traced = fRig.Abbreviate(fRig.fWorld.Trace());
    traced.resize(trace.size()); // without the end of the namespace
    EXPECT_EQ(trace, traced);
}

TEST_F(RegistrationTest, AFilesTimeoutsAndNamespaceHaveDefaultsAndOddTimeoutsANote)
{
    struct
    {
        const char* fName;
        const char* fElements;
        const char* fEntry;
        unsigned int fTimeoutMs;
        std::string fNamespace;
        const char* fOddText = nullptr;
    } const rows[] = {
        {"both given", "<nsp name='root/acme'/><timeout value='30'/>", "ACME_One", 30000, "root/acme"},
        {"neither", "", "ACME_One", 60000, "root/cimv2"},
        {"both empty", "<nsp name=''/><timeout value=''/>", "ACME_One", 60000, "root/cimv2"},
        {"an empty bracket", "<timeout value='30'/>", "ACME_One[]", 60000, "root/cimv2"},
        {"an explicit 0", "<timeout value='0'/>", "ACME_One", 0, "root/cimv2"},
        {"a bracket with 0", "<timeout value='30'/>", "ACME_One[0]", 0, "root/cimv2"},
        {"the longest", "", "ACME_One[4294967]", 4294967000, "root/cimv2"},
        {"one that wraps", "", "ACME_One[4294968]", 704, "root/cimv2", "4294968"},
        {"a negative one", "<timeout value='-1'/>", "ACME_One", 4294966296, "root/cimv2", "-1"},
        {"beyond all numbers", "", "ACME_One[99999999999999999999]", 4294966296, "root/cimv2", "99999999999999999999"},
        {"a unit", "", "ACME_One[5s]", 5000, "root/cimv2", "5s"},
        {"a word", "", "ACME_One[soon]", 0, "root/cimv2", "soon"},
    };
    fServer.AnswerClass("ACME_One", "");
    fServer.Answer("EnumerateInstances ACME_One", "");
    fRig.WriteProvider("acme", "a.properties.mof", "");
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        const std::string path = fRig.WriteProvider(
            "acme", "a.classes.xml", std::string("<vrx>") + row.fElements + "<class name='" + row.fEntry + "'/></vrx>");
        const auto ns = fRig.MakeConnectedNamespace(fServer);
        ns->FindProviders();
        std::vector<std::string> notes;
        if (row.fOddText) {
            notes.push_back("3|TPEGASUSNamespace::CollectClass: the timeout of class ACME_One in " + path +
                            " is not a number of seconds up to 4294967: \"" + row.fOddText + "\" becomes " +
                            std::to_string(row.fTimeoutMs) + " ms");
        }
        EXPECT_EQ(notes, fRig.fLog.LinesWith("3|TPEGASUSNamespace::CollectClass"));
        EXPECT_EQ("run cimmof -n " + row.fNamespace + " -aE M/pegasus/provider/acme/a.properties.mof",
                  fRig.Abbreviate(fRig.fWorld.Take().front()));
        const auto collected = boost::dynamic_pointer_cast<TPEGASUSClass>(ns->GetClass("ACME_One", {}));
        ASSERT_NE(nullptr, collected);
        EXPECT_EQ(row.fTimeoutMs, collected->GetDefaultTimeoutMs());
        EXPECT_EQ(row.fNamespace, collected->GetPegasusNSPStr());
        EXPECT_EQ(row.fNamespace, std::string(collected->GetProvider()->GetPegNamespace().getString().getCString()));
    }
}

TEST_F(RegistrationTest, UnknownClassesAreLeftOutAndTheLastProviderOfAClassServesIt)
{
    AddProvider("acme", {"ACME_One", "ACME_None", "ACME_Two"});
    AddProvider("beta", {"ACME_Two"});
    fServer.AnswerClass("ACME_One", "");
    fServer.AnswerClass("ACME_Two", "");
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    ns->FindProviders();
    EXPECT_THAT(Offered(*ns->GetProvidersContainer().front()), ElementsAre("ACME_One", "ACME_Two"));
    EXPECT_THAT(fRig.fLog.LinesWith("3|TPEGASUSNamespace::Getting class: ACME_None"),
                ElementsAre("3|TPEGASUSNamespace::Getting class: ACME_None from Pegasus CIMOM"));
    const auto twice = boost::dynamic_pointer_cast<TPEGASUSClass>(ns->GetClass("ACME_Two", {}));
    EXPECT_EQ("beta", twice->GetProvider()->GetName({}));
}

TEST_F(RegistrationTest, ABadRequestedNameEndsTheRegistrationOfAllThatFollow)
{
    AddProvider("acme", {"1 bad"});
    AddProvider("beta", {"BETA_One"});
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    EXPECT_EQ(25U, StatusOf([&] { ns->FindProviders(); }));
    EXPECT_THAT(fRig.fLog.LinesWith("0|TPEGASUSNamespace::CollectClass"),
                ElementsAre("0|TPEGASUSNamespace::CollectClass failed: the class name \"1 bad\" in " +
                            ns->GetProvidersContainer().front()->GetPath() + " is invalid"));
    EXPECT_THAT(ns->GetProvidersContainer(), ::testing::SizeIs(2));
    EXPECT_EQ(nullptr, ns->GetProvidersContainer().back()->getPegClient());
    EXPECT_EQ(0, fServer.Count("GetClass BETA_One"));
}

TEST_F(RegistrationTest, AProviderThatCannotConnectEndsTheRegistration)
{
    AddProvider("acme", {"ACME_One"});
    fServer.AnswerClass("ACME_One", "");
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    fRig.fLog.FailOn("TPEGASUSProvider::connect enter");
    EXPECT_THROW(ns->FindProviders(), std::runtime_error);
    EXPECT_THAT(Offered(*ns->GetProvidersContainer().front()), ElementsAre("ACME_One")); // it has its classes by then
    fRig.fLog.FailOn("");
    fServer.Refuse();
    EXPECT_EQ(42U, StatusOf([&] { ns->FindProviders(); }));
    EXPECT_EQ(3U, fRig.fLog.LinesWith("3|TPEGASUSProvider::connect failed: ").size());
}

TEST_F(RegistrationTest, OffersNeitherCdmClassesNorThoseNotToBeCollected)
{
    AddProvider("acme", {"ACME_Cdm%^CDM^%", "ACME_Other%^other^%", "ACME_Dont", "ACME_Do", "ACME_Null"});
    fServer.AnswerClass("ACME_Cdm", "");
    fServer.AnswerClass("ACME_Other", "");
    fServer.AnswerClass("ACME_Dont", "", kDontCollect);
    fServer.AnswerClass("ACME_Do", "", kDoCollect);
    fServer.AnswerClass("ACME_Null", "", kNullCollect);
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    ns->FindProviders();
    fRig.fLog.Take();
    TPEGASUSProvider& provider = *ns->GetProvidersContainer().front();
    EXPECT_THAT(Offered(provider), ElementsAre("ACME_Other", "ACME_Do", "ACME_Null"));
    const std::string asking = "3|TPEGASUSProvider::EnumerateClassesProvided Asking plugin acme for ";
    EXPECT_THAT(fRig.fLog.Lines(),
                ElementsAre("3|TPEGASUSProvider::EnumerateClassesProvided ignored one CDM class: ACME_Cdm",
                            asking + "ACME_Other", asking + "ACME_Do", asking + "ACME_Null"));
    EXPECT_TRUE(provider.IsClassesProvided("ACME_Cdm"));
}

TEST_F(RegistrationTest, AHostExceptionCostsOnlyItsClass)
{
    AddProvider("acme", {"ACME_One", "ACME_Two"});
    fServer.AnswerClass("ACME_One", "");
    fServer.AnswerClass("ACME_Two", "");
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    ns->FindProviders();
    fRig.fLog.Take();
    TPEGASUSProvider& provider = *ns->GetProvidersContainer().front();
    int visits = 0;
    const auto throwing = [&visits](boost::shared_ptr<ICIMClass>) -> bool {
        ++visits;
        throw TVRXException(15);
    };
    provider.EnumerateClassesProvided(throwing, {});
    EXPECT_EQ(2, visits);
    const std::string caught =
        "0|TPEGASUSProvider::EnumerateClassesProvided catch exection : " + std::string(TVRXException(15).what());
    EXPECT_THAT(fRig.fLog.LinesWith("0|"), ElementsAre(caught, caught));
    const auto foreign = [](boost::shared_ptr<ICIMClass>) -> bool { throw std::runtime_error("foreign"); };
    EXPECT_THROW(provider.EnumerateClassesProvided(foreign, {}), std::runtime_error);
}

// --- threads ---

constexpr std::chrono::seconds kDeadline(20);

class ThreadedRegistrationTest : public RegistrationTest
{
  protected:
    ThreadedRegistrationTest()
    {
        for (const std::string vendor : {"acme", "beta", "delta", "gamma"}) {
            const std::string name = vendor + "_Disk";
            AddProvider(vendor, {name});
            fRig.WriteProvider(vendor, "a.properties.mof", "");
            fServer.AnswerClass(name, "");
            fServer.Answer("EnumerateInstances " + name, "<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"" + name +
                                                             "\"/><INSTANCE CLASSNAME=\"" + name +
                                                             "\"/></VALUE.NAMEDINSTANCE>");
        }
    }

    static void SetThreads(const char* setting) { TConfig::GetInstance()->setValue("pegasus_multi_thread", setting); }

    std::string PathOf(const std::string& vendor) const
    {
        return fRig.M() + "/pegasus/provider/" + vendor + "/a.classes.xml";
    }
};

TEST_F(ThreadedRegistrationTest, OnlyTheExactSettingStartsThreadsOnWhichVisitorsCollect)
{
    struct
    {
        const char* fSetting;
        bool fThreaded;
    } const rows[] = {{"on", true}, {"off", false}, {"On", false}, {"ON", false}, {"on ", false}, {"1", false}};
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fSetting);
        SetThreads(row.fSetting);
        const auto ns = fRig.MakeConnectedNamespace(fServer);
        std::mutex mutex;
        std::condition_variable arrival;
        int foreignThreads = 0;
        // Waits until as many threads are here; so they run at the same time, and a race of theirs shows.
        const auto meet = [&, self = std::this_thread::get_id()](int count) {
            std::unique_lock<std::mutex> lock(mutex);
            foreignThreads += std::this_thread::get_id() != self;
            arrival.notify_all();
            const auto allAreHere = [&] { return foreignThreads == count; };
            EXPECT_TRUE(!row.fThreaded || arrival.wait_for(lock, kDeadline, allAreHere)) << "not at the same time";
        };
        fRig.fWorld.fRun = [&](const TSpawnCall&, std::string&) { meet(4); };
        ns->FindProviders();
        EXPECT_EQ(row.fThreaded ? 4 : 0, foreignThreads);
        EXPECT_EQ(4U, fRig.fLog.LinesWith("3|Entering TPEGASUSNamespace::regProvider: ").size());
        std::vector<boost::shared_ptr<IProvider>> collected;
        ns->EnumerateProviders(
            [&](const boost::shared_ptr<IProvider>& provider) {
                meet(8);
                const std::lock_guard<std::mutex> lock(mutex);
                collected.push_back(provider);
                return collected.size() != 2;
            },
            {});
        EXPECT_EQ(row.fThreaded ? 8 : 0, foreignThreads);
        // The classes and instances of what was collected are asked for on this one thread.
        std::vector<std::string> served;
        for (const auto& provider : collected) {
            const auto note = [&](const auto& instance) {
                return served.push_back(instance->GetClass({})->GetName({})), true;
            };
            const auto ofClass = [&](const auto& offered) { return offered->EnumerateInstances(note, true, {}), true; };
            provider->EnumerateClassesProvided(ofClass, {});
        }
        if (row.fThreaded) {
            EXPECT_THAT(served, UnorderedElementsAre("acme_Disk", "beta_Disk", "delta_Disk", "gamma_Disk"));
        } else {
            EXPECT_THAT(served, ElementsAre("acme_Disk", "beta_Disk")); // a false counts on the calling thread only
        }
        EXPECT_EQ(1U, fRig.fLog.LinesWith("3|after inventory pegasus NSP").size());
        fRig.fWorld.fRun = nullptr;
    }
}

TEST_F(ThreadedRegistrationTest, AThreadThatThrowsCostsOneLineAndTheSequenceGoesOn)
{
    SetThreads("on");
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    fRig.fWorld.fRun = [](const TSpawnCall& call, std::string&) {
        if (call.fArguments[1] == "root/beta") {
            throw TVRXException(12);
        }
        if (call.fArguments[1] == "root/gamma") {
            throw 42;
        }
    };
    ns->FindProviders();
    fRig.fWorld.fRun = nullptr;
    EXPECT_THAT(fRig.fLog.LinesWith("0|TPEGASUS"),
                UnorderedElementsAre("0|TPEGASUSNamespace::regProvider failed for provider " + PathOf("beta") + ": " +
                                         TVRXException(12).what(),
                                     "0|TPEGASUSNamespace::regProvider failed for provider " + PathOf("gamma") +
                                         ": an exception of unknown type"));
    EXPECT_EQ(4U, fRig.fLog.LinesWith("3|TPEGASUSNamespace finished adding Provider ").size());
}

TEST_F(ThreadedRegistrationTest, AnExceptionOnTheCallingThreadLeaves)
{
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    fRig.fWorld.fRun = [](const TSpawnCall&, std::string&) { throw TVRXException(12); };
    EXPECT_EQ(12U, StatusOf([&] { ns->FindProviders(); }));
    fRig.fWorld.fRun = nullptr;
    EXPECT_THAT(fRig.fLog.LinesWith("3|after reg..."), IsEmpty());
    EXPECT_EQ(15U, StatusOf([&] {
                  ns->EnumerateProviders([](boost::shared_ptr<IProvider>) -> bool { throw TVRXException(15); }, {});
              }));
}

TEST_F(ThreadedRegistrationTest, AVisitorThatThrowsOnAThreadCostsOneLine)
{
    SetThreads("on");
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    ns->FindProviders();
    fRig.fLog.Take();
    ns->EnumerateProviders(
        [](boost::shared_ptr<IProvider> provider) -> bool {
            if (provider->GetName({}) == "beta") {
                throw std::runtime_error("no beta");
            }
            return true;
        },
        {});
    EXPECT_THAT(
        fRig.fLog.Lines(),
        ElementsAre("3|TPEGASUSNamespace::EnumerateProviders: fProviders.size() = 4", "3|before inventory pegasus NSP",
                    "0|TPEGASUSNamespace::EnumerateProviders failed for provider " + PathOf("beta") + ": no beta",
                    "3|after inventory pegasus NSP"));
}

TEST_F(ThreadedRegistrationTest, AThreadThatCannotBeMadeLeavesAfterTheOthersHaveEnded)
{
    SetThreads("on");
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    for (int made = 0; made < 4; ++made) {
        SCOPED_TRACE(made);
        fRig.fWorld.Take();
        fRig.fWorld.fThreadsUntilFailure = made;
        EXPECT_THROW(ns->FindProviders(), boost::thread_resource_error);
        fRig.fWorld.fThreadsUntilFailure = -1;
        EXPECT_EQ(static_cast<std::size_t>(made), fRig.fWorld.Traced("run").size());
    }
}

TEST_F(ThreadedRegistrationTest, ListsProvidersForTheirOwnPluginTypeOnly)
{
    const auto ns = fRig.MakeConnectedNamespace(fServer);
    ns->FindProviders();
    const auto visits = [&](const TCIMContext& context) {
        int count = 0;
        ns->EnumerateProviders([&count](boost::shared_ptr<IProvider>) { return ++count, true; }, context);
        return count;
    };
    EXPECT_EQ(4, visits({}));
    EXPECT_EQ(4, visits({{"pluginType", static_cast<signed char>(7)}}));
    fRig.fLog.Take();
    EXPECT_EQ(0, visits({{"pluginType", static_cast<signed char>(3)}}));
    EXPECT_EQ(0, visits({{"pluginType", TCIMValue(TCIMValue::TCIMType::kSint8, 0)}})); // a null is another type
    EXPECT_THAT(fRig.fLog.Lines(), IsEmpty());
    const TCIMValue wrong[] = {"7", 7, static_cast<unsigned char>(7), TCIMValue(),
                               TCIMValue(TCIMValue::TCIMType::kSint8, 0, {static_cast<signed char>(7)})};
    for (const TCIMValue& value : wrong) {
        fRig.fLog.Take();
        EXPECT_EQ(14U, StatusOf([&] { visits({{"pluginType", value}}); }));
        EXPECT_THAT(fRig.fLog.Lines(),
                    ElementsAre("0|Invalid context pluginType datatype provided to "
                                "TPluginManagerNamespace::EnumerateProviders(), must be of type kSint8."));
    }
}

} // namespace
} // namespace NKOLVRX20
