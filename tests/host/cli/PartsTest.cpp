// SPDX-License-Identifier: MIT
// Parts of vrxhost, each tested apart from any plug-in.
#include "host/cli/TPrivateServer.h"
#include "host/cli/losses/LinePattern.h"
#include "host/cli/losses/LossRules.h"
#include "host/cli/losses/RegistrationText.h"
#include "host/cli/losses/TLossLog.h"
#include "host/cli/losses/TServerLog.h"

#include <host/TOSSpecific.h>
#include <host/TRootObject.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ;

namespace vrxhost {
namespace {

namespace fs = std::filesystem;
using NKOLVRX20::TFailedProgram;
using NKOLVRX20::TProcessOutcome;

struct TLineRow
{
    const char* fName;
    const char* fLine;
    const char* fSentence; // null: no loss
};

const TLineRow kLines[] = {
    {"class fetched", "TPEGASUSNamespace::GetClass from Pegasus for: CIM_Fan", nullptr},
    {"class not fetched", "TPEGASUSNamespace::GetClass from Pegasus for: CIM_Fan returned exception: timed out",
     "class CIM_Fan could not be fetched: timed out"},
    {"time-out with its warning",
     "Get Instances for: OMC_IpmiLogRecord returned ConnectionTimeoutException: late(may cause 'IPMI Event' page  "
     "lost)",
     "instances of OMC_IpmiLogRecord could not be fetched in time: late(may cause 'IPMI Event' page  lost)"},
    {"instances", "DEBUG1:TPEGASUSClass::EnumerateInstances from Pegasus for: A returned exception: x\ny\n",
     "instances of A could not be fetched: x y"},
    {"instances, refused by the client", "TPEGASUSClass::EnumerateInstances from Pegasus for: A returned exception: x",
     "instances of A could not be fetched: x"},
    {"instances announced", "TPEGASUSClass::EnumerateInstances A", nullptr},
    {"one instance", "DEBUG3:TPEGASUSClass::EI Error from Pegasus for: A, pegInst 2 returned exception: x",
     "an instance could not be built, A, pegInst 2: x"},
    {"qualifiers", " - error when Adding Qualifiers for property: Speed\tdetail: x",
     "qualifiers of property Speed could not be added: x"},
    {"progress", "before reg...", nullptr},
};

std::string TextOf(const std::optional<TLoss>& loss)
{
    return loss ? loss->GetText() : "none";
}

std::vector<std::string> SentencesOf(const TLossLog& log)
{
    std::vector<std::string> sentences;
    for (const TLoss& loss : log.GetLosses()) {
        sentences.push_back(loss.GetText());
    }
    return sentences;
}

TEST(LossRules, LinesOfThePlugin)
{
    for (const TLineRow& row : kLines) {
        TLossLog log("/");
        log.Log(NKOLVRX20::ILogger::kInfo, row.fLine);
        EXPECT_EQ(SentencesOf(log),
                  row.fSentence ? std::vector<std::string>{row.fSentence} : std::vector<std::string>{})
            << row.fName;
    }
}

struct TPatternRow
{
    const char* fPattern;
    const char* fLine;
    std::optional<std::vector<std::string>> fTaken;
};

const TPatternRow kPatterns[] = {
    {"in class <word>: <number>, end.", "in class A: B: 12, end.", std::nullopt}, // the word ends at the first colon
    {"in class <word>: <number>, end.", "in class A: 12, end.", {{"A", "12"}}},
    {"in class <word>: <number>, end.", "in class A: 12, end. More", std::nullopt},
    {"in class <word>: <number>, end.", "in class : 12, end.", std::nullopt},
    {"in class <word>: <number>, end.", "in class A: x, end.", std::nullopt},
    {"<text>key <word> of <word><text>", "a: key K of C, late", {{"a: ", "K", "C,", " late"}}},
    {"<text>key <word> of <word><text>", "key two words of C", std::nullopt},
    {"<text> is invalid", "x is invalid is invalid", {{"x is invalid"}}},
    {"<text> is invalid", "invalid", std::nullopt},
};

TEST(LossRules, GapsOfPatterns)
{
    for (const TPatternRow& row : kPatterns) {
        EXPECT_EQ(MatchLine(row.fPattern, row.fLine), row.fTaken) << row.fPattern << "\n" << row.fLine;
    }
}

// What a vendor writes must not fill the screen.
TEST(LossRules, LinesOfAnyLengthAreRead)
{
    const std::string name(1 << 20, 'x');
    const std::string trap = ": works here, fails on OpenPegasus 2.14: ";
    for (const std::string& line :
         {"TPEGASUSNamespace::CollectClass failed: the class name \"" + name + "\" in /a is invalid",
          "Not supported type of property " + name + " in class A: 1, default to string.",
          "x: /a:1:1: warning" + trap + name, "x: /" + name + ":1:1: warning" + trap + "b"})
    {
        EXPECT_FALSE(LossOfLine(line)) << line.substr(0, 60);
        EXPECT_TRUE(NotesOfCompiler(line).empty());
    }
    for (const std::string begin : {"setProperty: class ", "addKey: ", "setProperty: property "}) {
        EXPECT_FALSE(LossOfServerLine({"m", begin + name + " of A has another type"}));
        EXPECT_FALSE(NoteOfServerLine({"m", begin + name + " is not a key of class A"}));
    }
}

struct TProgramRow
{
    const char* fName;
    TFailedProgram fProgram;
    const char* fSentence; // null: no loss
};

const TProgramRow kPrograms[] = {
    {"base schema",
     {"cimmof",
      {"-n", "root/PG_InterOp", "-aE", "/r/pegasus/pegSchema/PG_InterOp/PG_InterOp.mof"},
      TProcessOutcome::kSignaled,
      9,
      "",
      ""},
     "MOF file /r/pegasus/pegSchema/PG_InterOp/PG_InterOp.mof did not compile, cimmof: signal 9 (Killed)"},
    {"quotation in the error",
     {"cimmof", {"/r/provider/x/a.mof"}, TProcessOutcome::kExited, 250, "", "a.mof:3:1: expected ';'\nuint32 b;\n^\n"},
     "MOF file /r/provider/x/a.mof of vendor x did not compile, cimmof: exit status 250: a.mof:3:1: expected ';'"},
    {"failed start",
     {"cimserver", {"httpPort=1"}, TProcessOutcome::kExited, 1, "\n", "in use\n"},
     "the server did not start, cimserver: exit status 1: in use"},
    {"stop of a stopped server", {"cimserver", {"-s"}, TProcessOutcome::kExited, 1, "", "x"}, nullptr},
    {"text on standard output",
     {"cimconfig", {"-s", "providerDir=x"}, TProcessOutcome::kExited, 1, "Failed\n", ""},
     "cimconfig -s providerDir=x failed: exit status 1: Failed"},
    {"no vendor",
     {"cimconfig", {"-s", "providerDir="}, TProcessOutcome::kExited, 1, "Failed\n", ""},
     "there is nothing to show: pegasus/provider has no vendor's folder"},
    {"no adapter tool, no adapter", {"bcu", {"-v"}, TProcessOutcome::kNotRun, 2, "", ""}, nullptr},
    {"process list", {"ps", {"-e"}, TProcessOutcome::kNotRun, 2, "", ""}, nullptr},
};

TEST(LossRules, Programs)
{
    for (const TProgramRow& row : kPrograms) {
        EXPECT_EQ(TextOf(LossOfProgram(row.fProgram, "/nonexistent")), row.fSentence ? row.fSentence : "none")
            << row.fName;
    }
}

struct TNamesRow
{
    const char* fName;
    const char* fModuleOfProvider;
    const char* fProviderName;
    const char* fEnd;
};

// The server refuses these registrations and names nothing.
TEST(LossRules, UnknownNamesInARegistrationAreNamed)
{
    const TNamesRow rows[] = {
        {"agree", "Mod", "Fan", ""},
        {"provider", "Mod", "Fann",
         "; PG_ProviderCapabilities names provider \"Fann\" of module \"Mod\", and the file registers provider \"Fan\" "
         "of module \"Mod\""},
        {"module", "mod", "Fan", "; PG_Provider names module \"mod\", and the file registers module \"Mod\""},
    };
    const fs::path file = testing::TempDir() + "/names-" + std::to_string(::getpid()) + ".registration.mof";
    for (const TNamesRow& row : rows) {
        SCOPED_TRACE(row.fName);
        std::ofstream(file)
            << "instance of PG_ProviderModule { Name = \"Mod\"; };\n/* instance of PG_Provider { Name = "
               "\"Fann\"; }; */\nINSTANCE OF PG_Provider\n{ Name=\"Fan\"; // \"\n ProviderModuleName = \""
            << row.fModuleOfProvider
            << "\"; };\ninstance of PG_ProviderCapabilities { ProviderModuleName = \"Mod\"; Namespaces = "
               "{\"a\", \"b\"}; ProviderName = \""
            << row.fProviderName << "\"; };\n";
        const TFailedProgram program = {"cimmof", {file}, TProcessOutcome::kExited,
                                        250,      "",     "PG_X class needs to be registered before register Y"};
        const auto loss = LossOfProgram(program, "/");
        ASSERT_TRUE(loss);
        EXPECT_EQ(loss->GetText(), "MOF file " + file.string() +
                                       " did not compile, cimmof: exit status 250: PG_X class needs to be registered "
                                       "before register Y" +
                                       row.fEnd);
        EXPECT_EQ(loss->fKind, *row.fEnd ? ELossKind::kProviderName : ELossKind::kSchema);
    }
    for (const char* odd : {"", "\"", "/*", "instance of", "instance of PG_Provider { Name = \"x", "a = \"b\""}) {
        std::ofstream(file) << odd;
        EXPECT_EQ(DescribeUnknownNames(file).find("Fan"), std::string::npos) << odd;
    }
    fs::remove(file);
}

// A failed attempt to start the server is a loss only when every attempt fails, and then its cause comes first.
TEST(TLossLog, FailedServerStartsCountWhenTheServerIsNeeded)
{
    const auto run = [](const std::string& name) {
        std::string output;
        NKOLVRX20::TOSSpecific::SpawnProcess(name, {"-c", "exit 1"}, "/bin/sh", {}, output, 20);
    };
    const std::string start = "the server did not start, cimserver: exit status 1";
    const std::string connected = "TPEGASUSNamespace::connect succeeded \n";
    const std::string config = "cimconfig -c exit 1 failed: exit status 1";
    TLossLog retried("/"), failed("/"), foreign("/");
    NKOLVRX20::TRootObject::SetCoreLogger(&retried);
    run("cimserver");
    retried.Log(NKOLVRX20::ILogger::kError,
                "TPEGASUSNamespace::connect failed: no program try to restart cimserver 1\n");
    EXPECT_TRUE(retried.HasNoServer());
    retried.Log(NKOLVRX20::ILogger::kInfo, connected);
    EXPECT_FALSE(retried.HasNoServer());
    run("cimconfig");
    NKOLVRX20::TRootObject::SetCoreLogger(&failed);
    run("cimserver");
    run("cimserver");
    run("cimconfig");
    NKOLVRX20::TRootObject::SetCoreLogger(&foreign);
    run("cimserver");
    foreign.Log(NKOLVRX20::ILogger::kInfo, "TPEGASUSNamespace::connect failed: refused try to reconnect 1");
    foreign.Log(NKOLVRX20::ILogger::kInfo, connected);
    EXPECT_TRUE(foreign.HasNoServer()) << "another host's server answered";
    NKOLVRX20::TRootObject::SetCoreLogger(nullptr);
    EXPECT_EQ(SentencesOf(retried), (std::vector<std::string>{config}));
    EXPECT_EQ(SentencesOf(failed), (std::vector<std::string>{start, config}));
}

// A vendor's losses name vendor and file, are folded by cause, and carry what the server's log says about the vendor.
TEST(TLossLog, LossesAreFoldedUnderTheirCause)
{
    const fs::path vendors = testing::TempDir() + "/vendors-" + std::to_string(::getpid());
    for (const std::string vendor : {"fan", "psu"}) {
        fs::create_directories(vendors / vendor);
        const std::string prefix = vendor == "fan" ? "FAN_" : "PSU_";
        std::ofstream(vendors / vendor / "x.classes.xml")
            << "<vrx><class name='" << prefix << "A[300]'/><class name='" << prefix << "B%^CDM^%'/><class name='"
            << prefix << "C'/></vrx>";
    }
    TLossLog log("/");
    log.SetVendors(TVendorFiles(vendors));
    TLoss mof;
    mof.fBegin = "MOF file";
    mof.fVendor = "psu";
    mof.fIsCause = true;
    log.Add(mof);
    for (const std::string name : {"PSU_A", "FAN_A", "PSU_C", "FAN_C", "PSU_A"}) {
        log.Log(NKOLVRX20::ILogger::kInfo, "TPEGASUSNamespace::GetClass from Pegasus for: " + name +
                                               " returned exception: none: \"" + name + "\"");
    }
    log.Log(NKOLVRX20::ILogger::kInfo, "TPEGASUSClass::EnumerateInstances FAN_C");
    log.Log(NKOLVRX20::ILogger::kInfo, "4TPEGASUSClass::EnumerateInstances - Unable to retrieve property: rpm");
    log.AddServerLog({{"fans", "warning: a"},
                      {"fans", "warning: setProperty: class FAN_A has no property Rpm"},
                      {"fans", "warning: provider Fan: works here, fails on OpenPegasus 2.14: convert it"},
                      {"fans", "warning: addKey: Bay is not a key of class FAN_A"},
                      {"fans", "warning: addKey: key Slot of FAN_C has another type"},
                      {"x", "b"}},
                     {{"fans", "fan"}});
    const std::string fan = "vendor fan, " + (vendors / "fan/x.classes.xml").string() + ": ";
    EXPECT_EQ(SentencesOf(log),
              (std::vector<std::string>{"MOF file; missing as a consequence: PSU_A, PSU_C",
                                        fan + "class FAN_A, FAN_C could not be fetched: none",
                                        fan + "property rpm of class FAN_C could not be converted and is missing from "
                                              "its instance",
                                        fan + "property Rpm of class FAN_A is not declared, so that the value which "
                                              "provider module fans sets is lost",
                                        "vendor fan: provider module fans does what fails on OpenPegasus 2.14: "
                                        "convert it",
                                        "vendor fan: provider module fans uses Bay as a key of class FAN_A, which "
                                        "declares it as none",
                                        fan + "property Slot of class FAN_C is declared with another type, so that the "
                                              "value which provider module fans sets is lost"}));
    EXPECT_TRUE(log.GetLosses()[4].fIsNote);
    EXPECT_EQ(log.GetLosses()[1].fLog, std::vector<std::string>{"warning: a"});
    EXPECT_TRUE(log.GetLosses()[0].fLog.empty());
    fs::remove_all(vendors);
}

// A provider may print anything, the server's own sentences too.
TEST(TServerLog, WhatAProviderPrintsCausesNoLoss)
{
    const fs::path root = fs::path(testing::TempDir()) / ("server-log-" + std::to_string(::getpid()));
    fs::create_directories(root / "pegasus");
    const TServerLog log(root);
    std::ofstream file(root / "pegasus/cimserver.log");
    for (const std::string sentence : {"setProperty: class A has no property B", "addKey: C is not a key of class A",
                                       "works here, fails on OpenPegasus 2.14: x"})
    {
        file << "2026-11-22T12:00:00Z [7] info: provider module \"fans\" wrote: " << sentence << "\n"
             << "2026-11-22T12:00:00Z [7] info: provider module \"fans\" wrote: provider module \"fans\": " << sentence
             << "\n2026-11-22T12:00:00Z [7] warning: provider module \"fans\": " << sentence << "\n";
    }
    file.close();
    TLossLog losses("/");
    losses.AddServerLog(log.Read(), {{"fans", "fan"}});
    EXPECT_EQ(losses.GetLosses().size(), 3U);
    EXPECT_EQ(log.Read().size(), 9U) << "all of them explain a loss";
    const TServerLog later(root);
    std::ofstream(root / "pegasus/cimserver.log", std::ios::app) << "warning: provider module \"a\": before\n";
    fs::rename(root / "pegasus/cimserver.log", root / "pegasus/cimserver.log.1"); // it is full
    std::ofstream(root / "pegasus/cimserver.log") << "warning: provider module \"b\": after\n";
    EXPECT_EQ(later.Read().size(), 2U);
    fs::remove_all(root);
}

// A tree whose "server" is a copy of a program that waits, and its start file.
class PrivateServerTest : public testing::Test
{
  protected:
    PrivateServerTest()
    {
        fs::create_directories(fRoot + "/pegasus/bin");
        fs::copy_file("/bin/sleep", fRoot + "/pegasus/bin/cimserver", fs::copy_options::overwrite_existing);
    }
    ~PrivateServerTest() override
    {
        fs::remove_all(fRoot);
        fs::remove(fStartFile);
    }

    pid_t Start(const std::string& program)
    {
        char name[] = "server", seconds[] = "60";
        char* const arguments[] = {name, seconds, nullptr};
        pid_t pid = -1;
        EXPECT_EQ(::posix_spawn(&pid, program.c_str(), nullptr, nullptr, arguments, environ), 0);
        std::ofstream(fStartFile) << pid << "\n";
        return pid;
    }

    static int Reap(pid_t pid)
    {
        int status = 0;
        ::waitpid(pid, &status, 0);
        return status;
    }

    const std::string fConsumer = "parts-test-" + std::to_string(::getpid());
    const std::string fRoot = testing::TempDir() + "/" + fConsumer;
    const std::string fStartFile = "/var/tmp/cimserverkol_tc_" + fConsumer + "_start.conf";
};

TEST_F(PrivateServerTest, EndsTheServerOfItsOwnTree)
{
    const pid_t pid = Start(fRoot + "/pegasus/bin/cimserver");
    TPrivateServer(fRoot, fConsumer).End();
    EXPECT_EQ(WTERMSIG(Reap(pid)), SIGTERM);
}

TEST_F(PrivateServerTest, LeavesAnyOtherProcessAlone)
{
    const pid_t pid = Start("/bin/sleep");
    const TPrivateServer server(fRoot, fConsumer);
    server.End();
    for (const char* text : {"", "none", "0", "1", "-1", "99999999999999999999"}) {
        std::ofstream(fStartFile) << text;
        server.End();
    }
    EXPECT_EQ(::waitpid(pid, nullptr, WNOHANG), 0) << "a foreign process was ended";
    ::kill(pid, SIGKILL);
    Reap(pid);
}

} // namespace
} // namespace vrxhost
