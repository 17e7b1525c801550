// SPDX-License-Identifier: MIT
// The server as a process: the port it gets, what is run with which arguments, what is killed and what is removed.
#include "tests/src/support/NamespaceRig.h"

#include <host/TVRXException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>

#include <sys/stat.h>
#include <unistd.h>

namespace NKOLVRX20 {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class ServerProcessTest : public ::testing::Test
{
  protected:
    TNamespaceRig fRig;
};

constexpr char kOthersLine[] = "3|Can not bind to port 5988, try others";

struct TPortRow
{
    const char* fName;
    std::vector<unsigned short> fTaken;
    unsigned short fLowestTaken; // 0, or all ports from here up are taken
    unsigned short fPort;
    bool fTriesOthers;
};

TEST_F(ServerProcessTest, TakesThePreferredPortOrTheHighestFreeOne)
{
    const TPortRow rows[] = {
        {"preferred free", {}, 0, 5988, false},
        {"preferred taken", {5988}, 0, 65535, true},
        {"highest taken too", {5988, 65535, 65534}, 0, 65533, true},
        {"only the lowest left", {}, 1025, 1024, true},
    };
    for (const TPortRow& row : rows) {
        SCOPED_TRACE(row.fName);
        std::vector<unsigned short> probed;
        fRig.fWorld.fIsPortFree = [&](unsigned short port) {
            probed.push_back(port);
            const bool taken = std::find(row.fTaken.begin(), row.fTaken.end(), port) != row.fTaken.end();
            return !taken && (row.fLowestTaken == 0 || port < row.fLowestTaken);
        };
        fRig.fWorld.fBindForReal = false;
        fRig.fLog.Take();
        EXPECT_EQ(row.fPort, fRig.MakeNamespace()->getAvailablePort());
        EXPECT_EQ(row.fTriesOthers ? std::vector<std::string>{kOthersLine} : std::vector<std::string>{},
                  fRig.fLog.LinesWith("3|Can"));
        std::vector<unsigned short> expected = {5988};
        for (unsigned int port = 65535; row.fTriesOthers && port >= row.fPort; --port) {
            expected.push_back(static_cast<unsigned short>(port));
        }
        EXPECT_EQ(expected, probed);
        EXPECT_EQ("127.0.0.1 close-on-exec", fRig.fWorld.fProbe);
    }
}

TEST_F(ServerProcessTest, EndsTheProcessWhenNoPortIsFree)
{
    const auto ns = fRig.MakeNamespace();
    const auto endsTheProcess = [&] {
        static unsigned short fgLowest = 0;
        std::atexit([] { std::fprintf(stderr, "down to %d", fgLowest); });
        fRig.fWorld.fIsPortFree = [](unsigned short port) {
            fgLowest = port;
            return false;
        };
        ns->getAvailablePort();
    };
    EXPECT_EXIT(endsTheProcess(), ::testing::ExitedWithCode(1), "^down to 1024$");
}

TEST_F(ServerProcessTest, AFailingSocketIsAConnectionFailureAndLeavesTheProcessAlone)
{
    fRig.fWorld.fSocketFails = true;
    EXPECT_EQ(42U, StatusOf([&] { fRig.MakeNamespace()->getAvailablePort(); }));
    EXPECT_THAT(fRig.fLog.LinesWith("0|TPEGASUSNamespace::getAvailablePort"),
                ElementsAre("0|TPEGASUSNamespace::getAvailablePort failed: no socket: Too many open files"));
}

TEST_F(ServerProcessTest, RunsEachProgramWithItsPathEnvironmentAndTimeOut)
{
    fRig.fRoot.MakeDirectory("pegasus/provider/acme");
    fRig.fRoot.MakeDirectory("pegasus/provider/beta");
    fRig.fRoot.Write("pegasus/provider/file", "no directory");
    const auto ns = fRig.MakeNamespace();
    fRig.fWorld.fRun = [](const TSpawnCall& call, std::string& output) { output = "output of " + call.fName; };

    ns->callCimconfig();
    ns->callCimserver(4711);
    ns->callCimmof("root/acme", "/x/acme.mof");
    ns->closeCimserver(true);

    EXPECT_THAT(fRig.fWorld.Trace(),
                ElementsAre(::testing::AnyOf("run cimconfig -s providerDir=provider/acme:provider/beta:",
                                             "run cimconfig -s providerDir=provider/beta:provider/acme:"),
                            "run cimserver httpPort=4711 enableHttpsConnection=false", "sleep 1",
                            "run cimmof -n root/acme -aE /x/acme.mof", "run cimserver -s", "sleep 3",
                            "system " + RemovalOf("/var/tmp/cimserverkol_tc__start.conf", "-f")));
    EXPECT_THAT(fRig.fLog.Lines(),
                ElementsAre("3|output of cimconfig", "3|output of cimserver", "3|output of cimmof",
                            "3|output of cimserver", "3|Error opening /var/tmp/cimserverkol_tc__start.conf"));
    for (const TSpawnCall& call : fRig.fWorld.Runs()) {
        SCOPED_TRACE(call.fName);
        EXPECT_EQ(fRig.R() + "/pegasus/bin/" + call.fName, call.fProgramPath);
        EXPECT_EQ(32767, call.fTimeoutSeconds);
        const std::string providers = ":R/pegasus/provider/";
        const std::string path = ::getenv("PATH");
        EXPECT_THAT(fRig.Abbreviate(call.fEnvironment),
                    ElementsAre("PEGASUS_HOME=R/pegasus",
                                "LD_LIBRARY_PATH=R/pegasus/lib:R" + providers + "broadcom" + providers + "mellanox" +
                                    providers + "intelCDM" + providers + "brocade" + providers + "fusionio" +
                                    providers + "nvidia",
                                "PATH=" + path + ":R:R/pegasus/provider/mellanox"));
    }
}

struct TResidualRow
{
    const char* fName;
    const char* fStartFile; // null: there is none
    const char* fListing;   // null: ps cannot be run
    bool fRunsPs;
    int fKilled; // 0: nothing
};

TEST_F(ServerProcessTest, KillsOnlyAServerThatTheStartFileAndTheProcessListingName)
{
    const TResidualRow rows[] = {
        {"no start file", nullptr, "12345 ? 00:00:01 cimserver\n", false, 0},
        {"a running server", "12345\n", "    1 ? 00:00:01 init\n12345 ? 00:00:01 cimserver\n", true, 12345},
        {"more after the id", "12345 quvex\n", "12345 ? 00:00:01 cimserver\n", true, 12345},
        {"blanks before the id", "12345", "  12345 ? 00:00:01 cimserver <defunct>\n", true, 12345},
        {"last line without end", "12345", "12345 ? 00:00:01 cimserver", true, 12345},
        {"another program", "12345", "12345 ? 00:00:01 bash\n99 ? 00:00:01 cimserver\n", true, 0},
        {"a longer id", "12345", "123456 ? 00:00:01 cimserver\n", true, 0},
        {"a shorter id", "12345", "1234 ? 00:00:01 cimserver\n", true, 0},
        {"the id elsewhere in the line", "12345", "99 ? 12345 cimserver 12345\n", true, 0},
        {"a server that has gone", "12345", "    1 ? 00:00:01 init\n", true, 0},
        {"an empty listing", "12345", "", true, 0},
        {"an empty start file", "", "12345 ? 00:00:01 cimserver\n", true, 0},
        {"no number in the start file", "cimserver", "12345 ? 00:00:01 cimserver\n", true, 0},
        {"ps cannot be run", "12345", nullptr, true, 0},
    };
    const auto ns = fRig.MakeNamespaceWithConsumer();
    for (const TResidualRow& row : rows) {
        SCOPED_TRACE(row.fName);
        fRig.fLog.Take();
        fRig.fWorld.Take();
        if (row.fStartFile) {
            std::ofstream(fRig.StartFile()) << row.fStartFile;
        }
        fRig.fWorld.fRun = [&row](const TSpawnCall& call, std::string& output) {
            EXPECT_EQ(360, call.fTimeoutSeconds);
            if (!row.fListing) {
                throw TVRXException(12);
            }
            output = row.fListing;
        };
        ns->killResidualCimserver();

        std::vector<std::string> log, trace;
        if (row.fRunsPs) {
            trace.push_back("run ps -e");
            log.push_back("3|" + std::string(row.fListing ? row.fListing : ""));
        } else {
            log.push_back("3|Error opening START");
        }
        if (row.fKilled) {
            log.push_back("3|Killing process..");
            trace.push_back("kill " + std::to_string(row.fKilled) + " 9");
        }
        trace.push_back("system " + RemovalOf("START", "-f"));
        EXPECT_EQ(log, fRig.Abbreviate(fRig.fLog.Lines()));
        EXPECT_EQ(trace, fRig.Abbreviate(fRig.fWorld.Trace()));
        std::remove(fRig.StartFile().c_str());
    }
    fRig.fWorld.fRun = nullptr;
}

TEST_F(ServerProcessTest, UsesWhatAFailingProcessListingHasWritten)
{
    fRig.fWorld.fRun = [](const TSpawnCall&, std::string& output) {
        output = "7 ? 00:00:01 cimserver\n";
        throw TVRXException(12);
    };
    const auto ns = fRig.MakeNamespace();
    EXPECT_TRUE(ns->isResidualCimserver(7));
    EXPECT_FALSE(ns->isResidualCimserver(8));
    fRig.fWorld.fRun = [](const TSpawnCall&, std::string&) { throw std::runtime_error("not of the host's family"); };
    EXPECT_THROW(ns->isResidualCimserver(7), std::runtime_error);
}

TEST_F(ServerProcessTest, ReadsOnlyAStartFileThatNoOtherUserCanHavePutThere)
{
    // The directory of start files is everybody's; whoever lays something there must neither stop us nor make us kill.
    const std::string path = fRig.StartFile();
    const std::string other = fRig.fRoot.Write("other.conf", "12345\n");
    const auto write = [&] { std::ofstream(path) << "12345\n"; };
    struct
    {
        const char* fName;
        std::function<void()> fPut;
        const char* fReason; // null: the file is read
        bool fNeedsRoot = false;
    } const rows[] = {
        {"our own", write, nullptr},
        {"no right to read it", [&] { fRig.fWorld.fFiles[path] = ""; }, "Permission denied"},
        {"a pipe", [&] { ASSERT_EQ(0, ::mkfifo(path.c_str(), 0666)); }, "not a regular file"},
        {"a directory", [&] { ASSERT_EQ(0, ::mkdir(path.c_str(), 0777)); }, "not a regular file"},
        {"a link to a good file", [&] { ASSERT_EQ(0, ::symlink(other.c_str(), path.c_str())); }, "a symbolic link"},
        {"a link to nothing", [&] { ASSERT_EQ(0, ::symlink("/none", path.c_str())); }, "a symbolic link"},
        {"another user's file",
         [&] {
             write();
             ASSERT_EQ(0, ::chown(path.c_str(), 1, 1));
         },
         "owned by another user", true},
    };
    const auto ns = fRig.MakeNamespaceWithConsumer();
    fRig.fWorld.fRun = [](const TSpawnCall&, std::string& output) { output = "12345 ? 00:00:01 cimserver\n"; };
    for (const auto& row : rows) {
        if (row.fNeedsRoot && ::geteuid() != 0) {
            continue;
        }
        SCOPED_TRACE(row.fName);
        fRig.fLog.Take();
        fRig.fWorld.Take();
        ASSERT_NO_FATAL_FAILURE(row.fPut());
        ns->killResidualCimserver();
        std::filesystem::remove(path);
        fRig.fWorld.fFiles.erase(path);
        if (row.fReason) {
            EXPECT_THAT(fRig.Abbreviate(fRig.fLog.Lines()),
                        ElementsAre("3|Error opening START",
                                    std::string("3|TPEGASUSNamespace::killResidualCimserver does not read START: ") +
                                        row.fReason));
            EXPECT_THAT(fRig.Abbreviate(fRig.fWorld.Trace()), ElementsAre("system " + RemovalOf("START", "-f")));
        } else {
            EXPECT_THAT(fRig.fWorld.Traced("kill"), ElementsAre("12345 9"));
        }
    }
    fRig.fWorld.fRun = nullptr;
}

TEST_F(ServerProcessTest, CleanUpStopsKillsAndRemoves)
{
    {
        const auto ns = fRig.MakeNamespaceWithConsumer();
        std::filesystem::current_path("/"); // R stays what it was
        ns->cleanup();
    }
    const std::vector<std::string> once = {
        "run cimserver -s",
        "sleep 3",
        "system " + RemovalOf("START", "-f"),
        "system " + RemovalOf("R/pegasus/repository"),
        "system " + RemovalOf("R/pegasus/provider/lsi_mir/repository.xml"),
    };
    std::vector<std::string> twice = once; // cleanup, and the destructor
    twice.insert(twice.end(), once.begin(), once.end());
    EXPECT_EQ(twice, fRig.Abbreviate(fRig.fWorld.Trace()));
}

} // namespace
} // namespace NKOLVRX20
