// Start-up with the server absent: context, refusals, attempts, vendor preparation, and the whole life's traces.
#include "src/plugin/TPEGASUSNamespaceProvider.h"
#include "tests/src/support/NamespaceRig.h"

#include <host/TCIMReference.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

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
    const std::vector<std::string> failures = fRig.fLog.LinesWith("0|TPEGASUSNamespace::connect failed: ");
    ASSERT_EQ(6U, failures.size());
    for (std::size_t i = 0; i < failures.size(); ++i) {
        EXPECT_EQ("0|TPEGASUSNamespace::connect failed: " + std::string(TVRXException(12).what()) +
                      " try to restart cimserver " + std::to_string(i + 1) + "\n",
                  failures[i]);
    }
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

TEST_F(StartUpTest, TheDestructorOutlivesALoggerThatThrows)
{
    auto ns = fRig.MakeNamespaceWithConsumer();
    fRig.fWorld.fRun = [](const TSpawnCall&, std::string&) { throw TVRXException(12); };
    fRig.fLog.FailOn("failed at stop command");
    ns.reset();
    EXPECT_EQ(4U, fRig.fWorld.Trace().size() - 1); // all steps but the failed one ran
    fRig.fLog.FailOn("");
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
    fRig.fWorld.fRun = nullptr;
}

TEST_F(StartUpTest, AsksTheAdapterToolOnThePathForItsVersion)
{
    struct
    {
        const char* fName;
        const char* fScript; // null: there is no such program
        mode_t fMode;
        bool fRemoved;
        std::size_t fFailures;
    } const rows[] = {
        {"the version", "test $1 = -v && echo bcu 3.0.0", 0700, false, 0},
        {"a status that says failure", "echo 3.0.0; exit 1", 0700, false, 0},
        {"another version", "echo bcu 3.1.0", 0700, true, 0},
        {"the version as an error", "echo 3.0.0 >&2", 0700, true, 0},
        {"no program", nullptr, 0, true, 1},
        {"no right to run it", "echo 3.0.0", 0600, true, 1},
    };
    const std::string oldPath = ::getenv("PATH");
    const auto ns = fRig.MakeNamespaceWithConsumer();
    fRig.fWorld.fRun = [](const TSpawnCall& call, std::string& output) {
        if (call.fName == "bcu -v") {
            TOutsideWorld::RunByPathForReal(call, output);
        }
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        const TTempTree tree;
        if (row.fScript) {
            const std::string tool = tree.Write("bcu", std::string("#!/bin/sh\n") + row.fScript + "\n");
            ASSERT_EQ(0, ::chmod(tool.c_str(), row.fMode));
        }
        ASSERT_EQ(0, ::setenv("PATH", tree.Path().c_str(), 1));
        fRig.fWorld.Take();
        fRig.fLog.Take();
        ns->preConfig();
        ASSERT_EQ(0, ::setenv("PATH", oldPath.c_str(), 1));
        EXPECT_EQ(row.fRemoved ? 2U : 1U, fRig.fWorld.Traced("system").size());
        EXPECT_EQ(row.fFailures, fRig.fLog.LinesWith("0|").size());
    }
    fRig.fWorld.fRun = nullptr;
}

TEST_F(StartUpTest, WithoutAPathTheServersOwnDirectoriesRemain)
{
    const std::string oldPath = ::getenv("PATH");
    ASSERT_EQ(0, ::unsetenv("PATH"));
    const auto ns = fRig.MakeNamespace();
    ASSERT_EQ(0, ::setenv("PATH", oldPath.c_str(), 1));
    ns->callCimconfig();
    EXPECT_EQ("PATH=:R:R/pegasus/provider/mellanox", fRig.Abbreviate(fRig.fWorld.Runs().back().fEnvironment.at(2)));
}

TEST_F(StartUpTest, WritesTheLsiConfigurationWhereItCan)
{
    const auto ns = fRig.MakeNamespaceWithConsumer();
    const std::string directory = fRig.R() + "/pegasus/provider/lsi_mir/";
    EXPECT_EQ("DATA_DIR=" + directory + "\nLIBRARY_DIR=" + directory,
              ReadWholeFile(fRig.fWorld.fFiles["/lsi_mr.conf"]));
    fRig.fWorld.fFiles["/lsi_mr.conf"] = "";
    ns->preConfig();
    EXPECT_THAT(fRig.fLog.LinesWith("0|"), IsEmpty());
}

} // namespace
} // namespace NKOLVRX20
