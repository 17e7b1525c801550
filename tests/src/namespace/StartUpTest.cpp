// SPDX-License-Identifier: MIT
// Start-up with the server absent: context, refusals, attempts, vendor preparation, and the whole life's traces.
#include "src/plugin/TPEGASUSNamespaceProvider.h"
#include "tests/src/support/NamespaceRig.h"

#include <host/TCIMReference.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <functional>

#include <sys/stat.h>
#include <unistd.h>

namespace NKOLVRX20 {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class StartUpTest : public ::testing::Test
{
  protected:
    // Every bind is simulated, and the port that is chosen refuses connections.
    StartUpTest()
    {
        fRig.fWorld.fBindForReal = false;
        fRig.fWorld.fIsPortFree = [](unsigned short port) { return port == 1024; };
    }

    std::vector<std::string> AbbreviatedLog() const { return fRig.Abbreviate(fRig.fLog.Lines()); }

    TNamespaceRig fRig;
};

TEST_F(StartUpTest, ReadsTheConsumerFromTheContext)
{
    struct
    {
        const char* fName;
        TCIMContext fContext;
        const char* fLine;
    } const rows[] = {
        {"none", {}, "3|PEGASUS NSP with the consumer: quvex"},
        {"a string", {{"consumer", "acme"}}, "3|PEGASUS NSP with the consumer: acme"},
        {"a number becomes text", {{"consumer", 42}}, "3|PEGASUS NSP with the consumer: 42"},
        {"UTF-8 and what a shell leaves alone", {{"consumer", "é+,:@%="}}, "3|PEGASUS NSP with the consumer: é+,:@%="},
    };
    fRig.fWorld.fSocketFails = true;
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        fRig.fLog.Take();
        fRig.MakeNamespace()->Initialize(row.fContext);
        EXPECT_EQ(row.fLine, fRig.fLog.Lines().front());
    }
}

TEST_F(StartUpTest, RefusesAConsumerThatAShellWouldMisread)
{
    std::vector<std::string> consumers = {"a b", "a/b", "a\nb", "a\tb", std::string(1, '\x7F'), "../x"};
    for (const char character : std::string("\"'\\`$&|;<>()*?[]{}!#~")) {
        consumers.push_back(std::string("a") + character);
    }
    for (const std::string& consumer : consumers) {
        SCOPED_TRACE(consumer);
        fRig.fLog.Take();
        EXPECT_EQ(3U, StatusOf([&] { fRig.MakeNamespace()->Initialize({{"consumer", consumer}}); }));
        EXPECT_THAT(fRig.fLog.Lines(),
                    ElementsAre("3|PEGASUS NSP with the consumer: " + consumer,
                                "0|TPEGASUSNamespace::Initialize failed: unsafe consumer name: \"" + consumer + "\""));
        EXPECT_THAT(fRig.fWorld.Trace(), IsEmpty()); // the destructor included
    }
}

TEST_F(StartUpTest, RefusesARootDirectoryThatAShellWouldMisread)
{
    for (const char* name : {"a b", "a*", "$HOME", "x;y"}) {
        SCOPED_TRACE(name);
        const std::string root = fRig.fRoot.MakeDirectory(name);
        ASSERT_EQ(0, ::chdir(root.c_str()));
        fRig.fLog.Take();
        EXPECT_EQ(3U, StatusOf([&] { fRig.MakeNamespace()->Initialize(fRig.Context()); }));
        EXPECT_EQ("0|TPEGASUSNamespace::Initialize failed: unsafe root directory: \"" + root + "\"",
                  fRig.fLog.Lines().back());
        EXPECT_THAT(fRig.fWorld.Trace(), IsEmpty());
    }
}

TEST_F(StartUpTest, RefusesARootDirectoryThatCannotBeTold)
{
    const std::string gone = fRig.fRoot.MakeDirectory("gone");
    ASSERT_EQ(0, ::chdir(gone.c_str()));
    ASSERT_EQ(0, ::rmdir(gone.c_str()));
    EXPECT_EQ("", TPEGASUSNamespace::GetVRXRootPath());
    EXPECT_EQ(3U, StatusOf([&] { fRig.MakeNamespace()->Initialize(fRig.Context()); }));
    EXPECT_EQ("0|TPEGASUSNamespace::Initialize failed: unsafe root directory: \"\"", fRig.fLog.Lines().back());
    EXPECT_THAT(fRig.fWorld.Trace(), IsEmpty());
}

TEST_F(StartUpTest, GoesOnUnconnectedAfterSixAttemptsOfThreeTries)
{
    {
        const auto ns = fRig.MakeNamespace();
        ns->Initialize(fRig.Context());
        EXPECT_FALSE(ns->isConnected());
    }
    const std::string refused = "Cannot connect to 127.0.0.1:1024. Connection failed.";
    std::vector<std::string> log = {"3|PEGASUS NSP with the consumer: " + fRig.fConsumer}, trace;
    for (int attempt = 1; attempt <= 6; ++attempt) {
        log.insert(log.end(), {"3|Error opening START", "3|Can not bind to port 5988, try others", "3|",
                               "3|TPEGASUSNamespace::connect enter"});
        for (int failed = 1; failed <= 3; ++failed) {
            log.push_back("3|TPEGASUSNamespace::connect failed: " + refused + " try to reconnect " +
                          std::to_string(failed));
        }
        log.push_back("0|TPEGASUSNamespace::connect failed: " + std::string(TVRXException(42).what()) +
                      " try to restart cimserver " + std::to_string(attempt) + "\n");
        trace.insert(trace.end(),
                     {"system " + RemovalOf("R/pegasus/repository"),
                      "system " + RemovalOf("R/pegasus/provider/lsi_mir/repository.xml"), "sleep 3",
                      "system " + RemovalOf("START", "-f"), "run cimserver httpPort=1024 enableHttpsConnection=false",
                      "sleep 1", "sleep 1", "sleep 1", "sleep 1", "sleep 1"});
    }
    log.insert(log.end(), {"3|", "3|", "3|"}); // two compilations and the configuration
    trace.insert(trace.end(), {"run cimmof -n root/PG_Internal -aE M/pegasus/pegSchema/PG_Internal/PG_Internal.mof",
                               "run cimmof -n root/PG_InterOp -aE M/pegasus/pegSchema/PG_InterOp/PG_InterOp.mof",
                               "run cimconfig -s providerDir=", "system " + RemovalOf("/lsi_mr.conf"), "run bcu -v",
                               "system " + RemovalOf("R/pegasus/provider/brocade/libdbfaj.so")});
    log.insert(log.end(), {"3|", "3|Error opening START"}); // the destructor
    trace.insert(trace.end(), {"run cimserver -s", "sleep 3", "system " + RemovalOf("START", "-f"),
                               "system " + RemovalOf("R/pegasus/repository"),
                               "system " + RemovalOf("R/pegasus/provider/lsi_mir/repository.xml")});
    EXPECT_EQ(log, AbbreviatedLog());
    EXPECT_EQ(trace, fRig.Abbreviate(fRig.fWorld.Trace()));
}

TEST_F(StartUpTest, AnUnconnectedNamespaceAnswersEveryQuestion)
{
    const auto ns = fRig.MakeNamespaceWithConsumer();
    for (const char* name : {"CIM_Any", "", "<root>", "1 bad name"}) {
        EXPECT_EQ(nullptr, ns->GetClass(name, {})) << name;
    }
    const auto visit = [](auto&&...) {
        ADD_FAILURE() << "nothing to visit";
        return true;
    };
    ns->EnumerateRootClasses(visit, {});
    ns->EnumerateProviders(visit, {});
    ns->EnumerateQualifierDecls(visit, {});
    EXPECT_EQ(14U, StatusOf([&] { ns->EnumerateProviders(visit, {{"pluginType", "7"}}); }));
    TCIMReference reference;
    reference.SetPath("CIM_Any.Key=1");
    EXPECT_EQ(nullptr, ns->GetInstance(reference, {}));
    ns->ClearInstances();
    std::string language, query = "select";
    fRig.fLog.Take();
    EXPECT_EQ(31U, StatusOf([&] { ns->DeleteInstance(reference, {}); }));
    EXPECT_EQ(31U, StatusOf([&] { ns->ModifyInstance(reference, {}, {}); }));
    EXPECT_EQ(31U, StatusOf([&] { ns->ExecuteQuery(visit, language, query, {}); }));
    EXPECT_EQ(31U, StatusOf([&] { ns->AddUnderlyingNamespace(nullptr, {}); }));
    EXPECT_EQ(1U, StatusOf([&] { ns->Subscribe(nullptr, visit, {}); }));
    const std::string failed = "0|TPEGASUSNamespace::", noRepository = ": the host gave no repository namespace";
    EXPECT_THAT(fRig.fLog.Take(), ElementsAre(failed + "DeleteInstance failed: CIM_Any.Key=1" + noRepository,
                                              failed + "ModifyInstance failed: CIM_Any.Key=1" + noRepository,
                                              failed + "ExecuteQuery failed: select" + noRepository,
                                              failed + "AddUnderlyingNamespace failed: root/cimv2: not supported",
                                              failed + "Subscribe failed: root/cimv2: indications are not supported"));
    EXPECT_EQ(nullptr, ns->AllocateClass("CIM_Any", boost::shared_ptr<ICIMClass>(), {}));
    EXPECT_THROW(ns->GetQualifierDecl("Key", {}), boost::bad_weak_ptr);
    EXPECT_EQ(TPEGASUSNamespaceProvider::GetInstance(), ns->GetNamespaceProvider({}));
    const ICIMNamespace& same = *ns; // copies nothing
    EXPECT_EQ(ns.get(), &(*ns = same));
    EXPECT_EQ("root/cimv2", ns->GetName());
}

TEST_F(StartUpTest, ExceptionsOfOtherFamiliesLeaveAtOnce)
{
    fRig.fWorld.fRun = [](const TSpawnCall& call, std::string&) {
        if (call.fName == "cimserver" && call.fArguments.size() == 2) {
            throw std::runtime_error("not of the host's family");
        }
    };
    const auto ns = fRig.MakeNamespace();
    EXPECT_THROW(ns->Initialize(fRig.Context()), std::runtime_error);
    EXPECT_THAT(fRig.fLog.LinesWith("0|"), IsEmpty());
    fRig.fWorld.fRun = nullptr;
}

TEST_F(StartUpTest, NoServerProgramMeansSixAttemptsAnExceptionAndAQuietEnd)
{
    fRig.fWorld.fRun = [](const TSpawnCall& call, std::string&) {
        if (!call.fProgramPath.empty()) {
            throw TVRXException(12);
        }
    };
    EXPECT_EQ(12U, StatusOf([&] {
                  TPEGASUSNamespaceProvider::GetInstance()->AllocateNamespace(fRig.Context(), true, "root/other");
              }));
    const std::string failure = std::string("0|TPEGASUSNamespace::connect failed: ") + TVRXException(12).what();
    EXPECT_EQ(6U, fRig.fLog.LinesWith(failure + " try to restart cimserver ").size());
    EXPECT_NE(nullptr, TPEGASUSNamespaceProvider::GetNamespace());
    fRig.fWorld.Take();
    fRig.fLog.Take();
    TPEGASUSNamespaceProvider::ClearNamespace();
    EXPECT_EQ(nullptr, TPEGASUSNamespaceProvider::GetNamespace());
    EXPECT_THAT(fRig.Abbreviate(fRig.fWorld.Trace()),
                ElementsAre("run cimserver -s", "sleep 3", "system " + RemovalOf("START", "-f"),
                            "system " + RemovalOf("R/pegasus/repository"),
                            "system " + RemovalOf("R/pegasus/provider/lsi_mir/repository.xml")));
    EXPECT_THAT(AbbreviatedLog(), ElementsAre("0|TPEGASUSNamespace::~TPEGASUSNamespace failed at stop command: " +
                                                  std::string(TVRXException(12).what()),
                                              "3|Error opening START"));
}

TEST_F(StartUpTest, EveryStepOfTheDestructorRunsWhateverTheOneBeforeItThrew)
{
    const std::string stop = "run cimserver -s", pause = "sleep 3", start = "system " + RemovalOf("START", "-f");
    const std::string wipe = "system " + RemovalOf("R/pegasus/repository");
    const std::string wipeLsi = "system " + RemovalOf("R/pegasus/provider/lsi_mir/repository.xml");
    struct
    {
        const char* fFailingLine; // the logger throws at it
        std::vector<std::string> fTrace;
    } const rows[] = {
        {"failed at stop command", {stop, pause, start, wipe, wipeLsi}},
        {"Error opening", {stop, pause, wipe, wipeLsi}},
    };
    fRig.fWorld.fRun = [](const TSpawnCall&, std::string&) { throw TVRXException(12); };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fFailingLine);
        auto ns = fRig.MakeNamespace();
        EXPECT_EQ(12U, StatusOf([&] { ns->Initialize(fRig.Context()); }));
        fRig.fWorld.Take();
        fRig.fLog.FailOn(row.fFailingLine);
        ns.reset();
        fRig.fLog.FailOn("");
        EXPECT_EQ(row.fTrace, fRig.Abbreviate(fRig.fWorld.Trace()));
    }
}

TEST_F(StartUpTest, KeepsTheBrocadeLibraryOnlyForItsAdapterVersion)
{
    struct
    {
        const char* fName;
        const char* fOutput; // null: the tool cannot be run
        bool fRemoved;
    } const rows[] = {
        {"the version", "bcu version 3.0.0\n", false},
        {"inside a longer version", "build 13.0.0.7", false},
        {"another version", "bcu version 3.1.0\n", true},
        {"no output", "", true},
        {"no tool", nullptr, true},
    };
    const auto ns = fRig.MakeNamespaceWithConsumer();
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        fRig.fWorld.Take();
        fRig.fLog.Take();
        fRig.fWorld.fRun = [&row](const TSpawnCall& call, std::string& output) {
            if (call.fName != "bcu -v") {
                return;
            }
            EXPECT_EQ(300, call.fTimeoutSeconds);
            output = row.fOutput ? row.fOutput : "3.0.0 of a tool that failed";
            if (!row.fOutput) {
                throw TVRXException(12);
            }
        };
        ns->preConfig();
        std::vector<std::string> trace = {"run cimconfig -s providerDir=", "system " + RemovalOf("/lsi_mr.conf"),
                                          "run bcu -v"};
        if (row.fRemoved) {
            trace.push_back("system " + RemovalOf("R/pegasus/provider/brocade/libdbfaj.so"));
        }
        EXPECT_EQ(trace, fRig.Abbreviate(fRig.fWorld.Trace()));
        std::vector<std::string> log = {"3|"};
        if (!row.fOutput) {
            log.push_back("0|" + std::string(TVRXException(12).what()));
        }
        EXPECT_EQ(log, fRig.fLog.Lines());
    }
    fRig.fWorld.fRun = [](const TSpawnCall& call, std::string&) {
        if (call.fName == "bcu -v") {
            throw std::runtime_error("not of the host's family");
        }
    };
    EXPECT_THROW(ns->preConfig(), std::runtime_error);
    fRig.fWorld.fRun = nullptr;
}

TEST_F(StartUpTest, WritesTheLsiConfigurationForAllReadersAndThroughNoLink)
{
    const auto ns = fRig.MakeNamespaceWithConsumer();
    const std::string file = fRig.fWorld.fFiles["/lsi_mr.conf"], other = fRig.fRoot.Write("other", "kept");
    const std::string directory = fRig.R() + "/pegasus/provider/lsi_mir/";
    const std::string written = "DATA_DIR=" + directory + "\nLIBRARY_DIR=" + directory;
    struct
    {
        const char* fName;
        mode_t fMask;
        std::function<void()> fPut;
        std::string fContent;
    } const rows[] = {
        {"new, all rights", 0, [] {}, written},
        {"new, few rights", 077, [] {}, written},
        {"longer, open to all", 022,
         [&] {
             fRig.fRoot.Write("written-lsi_mr.conf", std::string(999, 'x'));
             ASSERT_EQ(0, ::chmod(file.c_str(), 0666));
         },
         written},
        {"a link", 022, [&] { ASSERT_EQ(0, ::symlink(other.c_str(), file.c_str())); }, "kept"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        std::filesystem::remove(file);
        ASSERT_NO_FATAL_FAILURE(row.fPut());
        const mode_t before = ::umask(row.fMask);
        ns->preConfig();
        ::umask(before);
        struct stat status = {};
        ASSERT_EQ(0, ::lstat(file.c_str(), &status));
        if (row.fContent == written) {
            EXPECT_EQ(S_IFREG | 0644U, status.st_mode);
        }
        EXPECT_EQ(row.fContent, ReadWholeFile(file));
    }
    fRig.fWorld.fOnSystem = [&](const std::string& command) {
        if (command == RemovalOf("/lsi_mr.conf")) {
            std::filesystem::remove(file);
        }
    };
    ns->preConfig();
    EXPECT_EQ(written, ReadWholeFile(file)); // after the removal
    EXPECT_THAT(fRig.fLog.LinesWith("0|"), IsEmpty());
}

} // namespace
} // namespace NKOLVRX20
