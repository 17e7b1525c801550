// SPDX-License-Identifier: MIT
#include "host/core/TChildProcess.h"
#include "host/core/TProcessLog.h"

#include <host/TOSSpecific.h>
#include <host/TRootObject.h>
#include <host/TVRXException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <future>
#include <thread>

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace NKOLVRX20 {
namespace {

using std::chrono::milliseconds;
using testing::HasSubstr;
using testing::StartsWith;

constexpr int kTimeoutSeconds = 20;
constexpr milliseconds kTimeout{20000};

class TCapturingLogger : public ILogger
{
  public:
    TCapturingLogger() : fReplaced(TRootObject::SetCoreLogger(this)) {}
    ~TCapturingLogger() override { TRootObject::SetCoreLogger(fReplaced); }
    void Log(EVRXLogSeverity severity, const std::string& text) override
    {
        fLines.push_back(std::to_string(severity) + " " + text);
    }
    std::vector<std::string> fLines;

  private:
    ILogger* fReplaced;
};

TProcessRequest Probe(const std::vector<std::string>& arguments)
{
    TProcessRequest request;
    request.fProgram = PROCESS_PROBE;
    request.fArguments = {"probe"};
    request.fArguments.insert(request.fArguments.end(), arguments.begin(), arguments.end());
    return request;
}

std::string OutputOf(const std::vector<std::string>& arguments, const std::vector<std::string>& environment = {})
{
    std::string output;
    TOSSpecific::SpawnProcess("probe", arguments, PROCESS_PROBE, environment, output, kTimeoutSeconds);
    return output;
}

struct TEndRow
{
    const char* fName;
    std::vector<std::string> fArguments;
    TProcessOutcome::EEnd fEnd;
    int fStatus;
    const char* fReason;
};

const TEndRow kEnds[] = {
    {"exit 0", {"exit", "0"}, TProcessOutcome::kExited, 0, "exit status 0"},
    {"exit 250", {"exit", "250"}, TProcessOutcome::kExited, 250, "exit status 250"},
    {"aborted", {"signal", "6"}, TProcessOutcome::kSignaled, 6, "signal 6 (Aborted)"},
    {"killed", {"signal", "9"}, TProcessOutcome::kSignaled, 9, "signal 9 (Killed)"},
};

TEST(TChildProcess, ReportsHowItEnded)
{
    for (const TEndRow& row : kEnds) {
        SCOPED_TRACE(row.fName);
        const auto request = Probe(row.fArguments);
        const auto outcome = TChildProcess(request).Run(kTimeout);
        EXPECT_EQ(outcome.fEnd, row.fEnd);
        EXPECT_EQ(outcome.fStatus, row.fStatus);
        TFailedProgram program{"probe", {}, outcome.fEnd, outcome.fStatus, "", ""};
        EXPECT_EQ(program.GetReason(), row.fReason);
    }
}

TEST(SpawnProcess, GivesArgumentsAndEnvironmentExactly)
{
    EXPECT_EQ(OutputOf({"arguments", "", "a b", "\"'$HOME;|", "\xff"}), "[probe][arguments][][a b][\"'$HOME;|][\xff]");
    EXPECT_EQ(OutputOf({"environment"}, {"A=1", "B=x y"}), "[A=1][B=x y]");
    EXPECT_EQ(OutputOf({"environment"}), "");
}

TEST(SpawnProcess, TheExactFormTakesThePathAsItIs)
{
    std::string output;
    EXPECT_THROW(TOSSpecific::SpawnProcess("true", {}, "true", {}, output, kTimeoutSeconds), TVRXException)
        << "PATH was searched";
    for (const int seconds : {0, -1}) {
        EXPECT_NO_THROW(TOSSpecific::SpawnProcess("true", {}, "/bin/true", {}, output, seconds))
            << "the shortest time-out is a second";
    }
}

TEST(SpawnProcess, SplitsACommandLineAndSearchesThePath)
{
    std::string output;
    TOSSpecific::SpawnProcess("  echo   a b  ", {"c  d", ""}, output, kTimeoutSeconds);
    EXPECT_EQ(output, "a b c  d \n");
    EXPECT_NO_THROW(TOSSpecific::SpawnProcess("true ignored", kTimeoutSeconds));
    EXPECT_THROW(TOSSpecific::SpawnProcess("   ", kTimeoutSeconds), TVRXException);
}

// Opens the descriptors and sets the signals that must stay hidden from a child, and puts the signals back.
class TDisturbedProcess
{
  public:
    TDisturbedProcess() : fInheritable(::open("/dev/null", O_RDONLY))
    {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &fMask);
        fPipeHandler = std::signal(SIGPIPE, SIG_IGN);
        fUserHandler = std::signal(SIGUSR1, SIG_IGN);
    }
    ~TDisturbedProcess()
    {
        std::signal(SIGPIPE, fPipeHandler);
        std::signal(SIGUSR1, fUserHandler);
        pthread_sigmask(SIG_SETMASK, &fMask, nullptr);
        ::close(fInheritable);
    }

  private:
    int fInheritable;
    sigset_t fMask;
    void (*fPipeHandler)(int);
    void (*fUserHandler)(int);
};

TEST(SpawnProcess, ChildInheritsNeitherDescriptorsNorSignals)
{
    const TDisturbedProcess disturbed;
    EXPECT_EQ(OutputOf({"descriptors"}), "[0][1][2]");
    EXPECT_EQ(OutputOf({"signals"}), "[2 open default][15 open default][13 open default][17 open default]"
                                     "[10 open default][leader]");
    EXPECT_NO_THROW(OutputOf({"input"}));
}

TEST(SpawnProcess, WorksWithoutStandardStreams)
{
    // In a child, because the test's own streams must stay.
    EXPECT_EXIT(
        {
            ::close(0);
            ::close(1);
            const int reportTo = ::dup(2);
            ::close(2);
            const std::string descriptors = OutputOf({"descriptors"});
            ::dup2(reportTo, 2);
            std::_Exit(descriptors == "[0][1][2]" ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

TEST(SpawnProcess, ReturnsAlthoughADaemonKeepsThePipes)
{
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(OutputOf({"daemon"}), "parent");
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(10));
}

TEST(SpawnProcess, TimeoutThrowsAndHandsOutWhatWasCaptured)
{
    const std::string lock = testing::TempDir() + "/spawn-" + std::to_string(::getpid());
    std::string output;
    EXPECT_THROW(TOSSpecific::SpawnProcess("probe", {"lock", lock}, PROCESS_PROBE, {}, output, 1), TVRXException);
    EXPECT_EQ(output, "locked");
    // The grandchild held the lock; the call waits until the kernel has let it go.
    const int fd = ::open(lock.c_str(), O_RDWR);
    ASSERT_GE(fd, 0);
    EXPECT_EQ(::flock(fd, LOCK_EX), 0);
    ::close(fd);
    ::unlink(lock.c_str());
}

// The kernel reaps the children of such a process itself, and their status is gone.
TEST(TChildProcess, RunsWhereTheHostIgnoresItsChildren)
{
    const auto handler = std::signal(SIGCHLD, SIG_IGN);
    const auto ended = Probe({"arguments"});
    const auto endedOutcome = TChildProcess(ended).Run(kTimeout);
    const auto running = Probe({"write-forever"});
    const auto runningOutcome = TChildProcess(running).Run(milliseconds(200));
    std::signal(SIGCHLD, handler);
    EXPECT_EQ(endedOutcome.fEnd, TProcessOutcome::kUnknown);
    EXPECT_EQ(endedOutcome.fOutput, "[probe][arguments]");
    EXPECT_EQ(runningOutcome.fEnd, TProcessOutcome::kTimedOut);
}

TEST(TChildProcess, TimeoutKillsAChildThatLeftItsGroup)
{
    const auto start = std::chrono::steady_clock::now();
    const auto request = Probe({"leave-group"});
    const auto outcome = TChildProcess(request).Run(milliseconds(1000));
    EXPECT_EQ(outcome.fEnd, TProcessOutcome::kTimedOut);
    EXPECT_EQ(outcome.fOutput, "left");
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(10)) << "it ended by itself";
}

TEST(TChildProcess, ChildThatNeverStopsWritingCannotHoldTheTimeout)
{
    const auto request = Probe({"write-forever"});
    const auto outcome = TChildProcess(request).Run(milliseconds(1000));
    EXPECT_EQ(outcome.fEnd, TProcessOutcome::kTimedOut);
    EXPECT_FALSE(outcome.fOutput.empty());
}

TEST(TChildProcess, OutputBeyondTheLimitIsDroppedAndCounted)
{
    const auto request = Probe({"bytes", std::to_string(kMaxOutputBytes + 5)});
    const auto outcome = TChildProcess(request).Run(kTimeout);
    EXPECT_EQ(outcome.fOutput.size(), kMaxOutputBytes);
    EXPECT_EQ(outcome.fDroppedBytes, 5u);
    EXPECT_TRUE(outcome.IsSuccess());
}

TEST(SpawnProcess, MissingProgramThrows)
{
    TCapturingLogger log;
    std::string output = "before";
    EXPECT_THROW(TOSSpecific::SpawnProcess("nope", {}, "/nonexistent/nope", {}, output, kTimeoutSeconds),
                 TVRXException);
    EXPECT_EQ(output, "");
    EXPECT_THROW(TOSSpecific::SpawnProcess("/dev/null", kTimeoutSeconds), TVRXException);
    ASSERT_EQ(log.fLines.size(), 2u);
    EXPECT_EQ(log.fLines[0], "3 TOSSpecific::SpawnProcess nope: not started: No such file or directory");
    EXPECT_THAT(log.fLines[1], StartsWith("3 TOSSpecific::SpawnProcess /dev/null: not started: "));
}

TEST(TProcessLog, FailuresAreLoggedInOneLineAndKeptForTheHost)
{
    TCapturingLogger log;
    TProcessLog::Instance().Take();
    OutputOf({"exit", "0"});
    OutputOf({"complain", "no such file"});
    OutputOf({"exit", "7"});
    EXPECT_THAT(log.fLines, testing::ElementsAre(
                                "3 TOSSpecific::SpawnProcess probe complain no such file: exit status 3: no such file",
                                "3 TOSSpecific::SpawnProcess probe exit 7: exit status 7"));
    const auto failed = TProcessLog::Instance().Take();
    ASSERT_EQ(failed.size(), 2u);
    EXPECT_EQ(failed[0].fName, "probe");
    EXPECT_EQ(failed[0].fArguments, (std::vector<std::string>{"complain", "no such file"}));
    EXPECT_EQ(failed[0].fErrorOutput, "no such file");
    EXPECT_EQ(failed[1].fStatus, 7);
    EXPECT_TRUE(TProcessLog::Instance().Take().empty());
}

TFailedProgram LastOf(const std::vector<TFailedProgram>& programs)
{
    return programs.empty() ? TFailedProgram() : programs.back();
}

TEST(TProcessLog, ForgetsTheOldestBeyondItsEntriesAndItsBytes)
{
    const TCapturingLogger log;
    TProcessLog& processes = TProcessLog::Instance();
    processes.Take();
    TProcessRequest request;
    request.fArguments = {"probe", std::string(kMaxErrorOutputBytes, 'a')};
    TProcessOutcome outcome;
    outcome.fEnd = TProcessOutcome::kExited;
    outcome.fErrorOutput = std::string(kMaxErrorOutputBytes, 'e');
    const auto addAll = [&](int count) {
        for (outcome.fStatus = 1; outcome.fStatus <= count; ++outcome.fStatus) {
            processes.Add(request, outcome);
        }
        return processes.Take();
    };
    auto kept = addAll(200);
    EXPECT_EQ(kept.size(), TProcessLog::kMaxBytes / (2 * kMaxErrorOutputBytes) - 1);
    EXPECT_EQ(LastOf(kept).fStatus, 200);
    request.fArguments = {"probe", std::string(TProcessLog::kMaxBytes, 'a')};
    EXPECT_EQ(LastOf(addAll(2)).fStatus, 2) << "larger than all bytes";
    request.fArguments = {"probe"};
    outcome.fErrorOutput.clear();
    kept = addAll(static_cast<int>(TProcessLog::kMaxEntries) + 2);
    EXPECT_EQ(kept.size(), TProcessLog::kMaxEntries);
    EXPECT_EQ(kept.front().fStatus, 3);
}

TEST(SpawnProcess, RunsFromSeveralThreadsAtOnce)
{
    std::vector<std::future<std::string>> outputs;
    for (int i = 0; i < 8; ++i) {
        outputs.push_back(std::async(std::launch::async, [i] { return OutputOf({"arguments", std::to_string(i)}); }));
    }
    for (int i = 0; i < 8; ++i) {
        EXPECT_EQ(outputs[static_cast<std::size_t>(i)].get(), "[probe][arguments][" + std::to_string(i) + "]");
    }
}

TEST(GetFileSize, AnswersForRegularFilesAlone)
{
    const std::string path = testing::TempDir() + "/size-" + std::to_string(::getpid());
    const int fd = ::open(path.c_str(), O_RDWR | O_CREAT | O_TRUNC, 0600);
    ASSERT_EQ(::write(fd, "12345", 5), 5);
    ::close(fd);
    EXPECT_EQ(TOSSpecific::GetFileSize(path), 5u);
    ::unlink(path.c_str());
    EXPECT_EQ(TOSSpecific::GetFileSize(path), 0u);
    EXPECT_EQ(TOSSpecific::GetFileSize("/"), 0u);
}

} // namespace
} // namespace NKOLVRX20
