// SPDX-License-Identifier: MIT
// What the server keeps and checks: configuration, log, lock and start file.
#include "pegasus/server/admin/Config.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/admin/PrivateFile.h"
#include "pegasus/server/admin/StartFile.h"
#include "pegasus/server/admin/TreeClaim.h"
#include "pegasus/server/net/Acceptor.h"
#include "tests/support/TemporaryDirectory.h"

#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <fstream>

#include <sched.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace Pegasus::server {
namespace {

namespace fs = std::filesystem;

class StateTest : public testing::Test
{
  protected:
    StateTest() { fs::create_directories(fHome + "/lib"); }

    const test::TemporaryDirectory fDirectory;
    const std::string fHome = fDirectory.path();
};

struct ValueRow
{
    const char* name;
    const char* value;
    bool valid;
};

TEST_F(StateTest, configurationValuesAreChecked)
{
    const ValueRow rows[] = {
        {"httpPort", "1", true},
        {"httpPort", "65535", true},
        {"httpPort", "0", false},
        {"httpPort", "65536", false},
        {"httpPort", "80x", false},
        {"httpPort", "", false},
        {"httpPort", " 80", false},
        {"maxConnections", "0", false},
        {"idleConnectionTimeout", "0", true},
        {"maxBodyBytes", "-1", false},
        {"daemon", "yes", false},
        {"daemon", "false", true},
        {"consumer", "a+b,c:d@e", true},
        {"consumer", "a/b", false},
        {"consumer", "a b", false},
        {"consumer", "..", false},
        {"consumer", "$(x)", false},
        {"consumer", "a\x01", false},
        {"providerDir", "lib", true},
        {"providerDir", "lib:", true},
        {"providerDir", ":", false},
        {"providerDir", "lib:no", false},
        {"providerDir", "", false},
        {"logLevel", "LOUD", false},
        {"repositoryDir", "x\ny", false},
        {"enableHttpsConnection", "true", false},
        {"agentCapabilities", "net_raw,sys_rawio", true},
        {"agentCapabilities", "all", true},
        {"agentCapabilities", "", false},
        {"agentCapabilities", "net_raw,", false},
        {"agentCapabilities", "CAP_NET_RAW", false},
    };
    for (const ValueRow& row : rows) {
        EXPECT_EQ(isValidConfigValue(*findConfigProperty(row.name), row.value, fHome), row.valid)
            << row.name << "=" << row.value;
    }
    for (const ConfigProperty& property : configTable()) {
        EXPECT_TRUE(isValidConfigValue(property, property.defaultValue, fHome)) << property.name;
    }
}

TEST_F(StateTest, plannedValuesRuleTheNextStartAndCurrentOnesThisRun)
{
    {
        Config config(fHome);
        config.setPlanned("httpPort", "1234");
        config.setCurrent("maxConnections", "5");
        EXPECT_EQ(config.text("httpPort"), "5988");
        EXPECT_EQ(config.planned("httpPort"), "1234");
        EXPECT_EQ(config.number("maxConnections"), 5u);
        EXPECT_THROW(config.setCurrent("httpPort", "80"), ConfigError);
        EXPECT_THROW(config.setCurrent("maxConnections", "0"), ConfigError);
        EXPECT_THROW(config.setPlanned("nope", "0"), ConfigError);
        EXPECT_THROW(config.text("nope"), ConfigError);
        EXPECT_THROW(config.planned("nope"), ConfigError);
        EXPECT_EQ(readConfigFile(currentConfigPath(fHome)).at("maxConnections"), "5");
    }
    Config config(fHome);
    EXPECT_EQ(config.text("httpPort"), "1234");
    EXPECT_EQ(config.number("maxConnections"), 128u) << "current values are forgotten";
    config.setFromCommandLine("httpPort", "99");
    EXPECT_EQ(config.text("httpPort"), "99");
    config.resetPlanned("httpPort");
    EXPECT_EQ(Config(fHome).text("httpPort"), "5988");
}

// A file size limit fails a write as a full disk does.
TEST_F(StateTest, aValueThatCannotBeWrittenStaysAsItWas)
{
    Config config(fHome);
    config.setCurrent("maxConnections", "5");
    config.setPlanned("maxConnections", "6");
    const unsigned generation = config.generation();
    rlimit usual = {};
    ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &usual), 0);
    const auto handler = ::signal(SIGXFSZ, SIG_IGN);
    const rlimit full = {10, usual.rlim_max};
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &full), 0);
    EXPECT_THROW(config.setCurrent("maxConnections", "7"), std::system_error);
    EXPECT_THROW(config.setPlanned("maxConnections", "7"), std::system_error);
    EXPECT_THROW(config.resetCurrent("maxConnections"), std::system_error);
    ::setrlimit(RLIMIT_FSIZE, &usual);
    ::signal(SIGXFSZ, handler);
    EXPECT_EQ(config.text("maxConnections"), "5");
    EXPECT_EQ(config.generation(), generation);
    EXPECT_EQ(config.planned("maxConnections"), "6");
    EXPECT_EQ(readConfigFile(currentConfigPath(fHome)).at("maxConnections"), "5");
    EXPECT_EQ(std::distance(fs::directory_iterator(fHome), {}), 3) << "two files and lib, no half-written ones";
}

TEST_F(StateTest, aPlannedValueThatIsNoLongerValidGivesWay)
{
    fs::create_directories(fHome + "/vendor");
    Config(fHome).setPlanned("providerDir", "vendor");
    fs::remove(fHome + "/vendor");
    EXPECT_EQ(Config(fHome).text("providerDir"), "lib");
    std::ofstream(plannedConfigPath(fHome)) << "# comment\n\nnoequals\nhttpPort=x\nnope=1\nmaxBodyBytes=7\n";
    EXPECT_EQ(Config(fHome).number("maxBodyBytes"), 7u);
    EXPECT_EQ(Config(fHome).text("httpPort"), "5988");
    EXPECT_EQ(Config(fHome).ignored(), (std::vector<std::string>{"httpPort=x", "nope=1"})) << "for the log";
}

TEST_F(StateTest, privateFilesReplaceLinksAndAreReadOnlyIfRegular)
{
    const std::string victim = fHome + "/victim";
    std::ofstream(victim) << "untouched";
    fs::create_symlink(victim, fHome + "/file");
    writePrivateFile(fHome + "/file", "new");
    EXPECT_EQ(readOwnFile(victim, 100), "untouched");
    EXPECT_EQ(readOwnFile(fHome + "/file", 100), "new");
    EXPECT_EQ(readOwnFile(fHome + "/file", 2), "ne");
    fs::create_symlink(victim, fHome + "/link");
    EXPECT_EQ(readOwnFile(fHome + "/link", 100), "");
    ASSERT_EQ(::mkfifo((fHome + "/fifo").c_str(), 0600), 0);
    EXPECT_EQ(readOwnFile(fHome + "/fifo", 100), "");
    EXPECT_THROW(writePrivateFile(fHome + "/no/file", "x"), std::system_error);
}

TEST_F(StateTest, aStartFileIsRemovedOnlyByTheServerThatItNames)
{
    const std::string path = fHome + "/start.conf";
    StartFile::write(path, 1234);
    EXPECT_EQ(readOwnFile(path, 100), "1234\n");
    StartFile::remove(path, 123);
    EXPECT_TRUE(fs::exists(path));
    if (::geteuid() == 0) {
        ASSERT_EQ(::chown(path.c_str(), 65534, 65534), 0);
        EXPECT_EQ(readOwnFile(path, 100), "") << "another user's file is not believed";
        StartFile::remove(path, 1234);
        EXPECT_TRUE(fs::exists(path));
        ASSERT_EQ(::chown(path.c_str(), 0, 0), 0);
    }
    StartFile::remove(path, 1234);
    EXPECT_FALSE(fs::exists(path));
}

TEST_F(StateTest, aFloodOfRefusalsIsOneLineASecondWithACount)
{
    using std::chrono::milliseconds;
    Log::open(fHome, false);
    RefusalLog refusals;
    const RefusalLog::Clock::time_point start = RefusalLog::Clock::now();
    for (int i = 0; i < 1000; ++i) {
        refusals.note(4711, start + milliseconds(i));
    }
    refusals.note(4712, start + milliseconds(1000));
    refusals.note(std::nullopt, start + milliseconds(2500)); // nobody in between
    std::string log = readOwnFile(fHome + "/cimserver.log", 1u << 20);
    for (const char* line : {"Refused a connection of user 4711.\n",
                             "Refused a connection of user 4712. Others refused since the last such line: 999.\n",
                             "Refused a connection: the kernel does not say whose it is.\n"})
    {
        const std::size_t at = log.find(line);
        ASSERT_NE(at, std::string::npos) << line << log;
        log.erase(0, at + std::strlen(line));
    }
    EXPECT_EQ(log, "");
}

// What a vendor writes must neither forge a line nor reach a terminal.
TEST_F(StateTest, controlBytesAreEscapedInTheLogAndOthersCannotReadIt)
{
    const std::string path = fHome + "/cimserver.log";
    std::ofstream(path) << "";
    ASSERT_EQ(::chmod(path.c_str(), 0666), 0); // by an earlier host
    Log::open(fHome, false);
    EXPECT_EQ(fs::status(path).permissions(), fs::perms::owner_read | fs::perms::owner_write);
    Log::write(LogLevel::kError, "a\nb\x1b[2J\x7f \xc3\xa9");
    const std::string log = readOwnFile(fHome + "/cimserver.log", 1000);
    EXPECT_NE(log.find("error: a\\nb\\x1b[2J\\x7f \xc3\xa9\n"), std::string::npos) << log;
}

// A server and its agents: together they fill the file once, so that two renames would lose lines.
TEST_F(StateTest, processesThatShareTheLogRollItOnce)
{
    constexpr int kProcesses = 3;
    constexpr int kLines = 4'000;
    const std::string line(1000, 'x'); // 12 MB in all
    pid_t children[kProcesses];
    for (pid_t& child : children) {
        child = ::fork();
        if (child == 0) {
            Log::open(fHome, false);
            for (int i = 0; i < kLines; ++i) {
                Log::write(LogLevel::kInformation, line);
            }
            ::_exit(0);
        }
    }
    for (const pid_t child : children) {
        int status = -1;
        ::waitpid(child, &status, 0);
        EXPECT_EQ(status, 0);
    }
    std::ptrdiff_t lines = 0;
    for (const char* name : {"/cimserver.log", "/cimserver.log.1"}) {
        const std::string text = readOwnFile(fHome + name, 2 * Log::kMaxLogBytes);
        lines += std::count(text.begin(), text.end(), '\n');
    }
    EXPECT_EQ(lines, kProcesses * kLines);
}

TEST_F(StateTest, oneLockATree)
{
    EXPECT_EQ(base::readTreeLock(fHome).state, base::TreeLockState::kAbsent);
    TreeLock first;
    TreeLock second;
    EXPECT_TRUE(first.acquire(fHome));
    EXPECT_FALSE(second.acquire(fHome));
    first.write({123, 4567, "/x/start file", "/x/repository", 18446744073709551615u, 2});
    for (int i = 0; i < 2; ++i) { // to look is not to take
        const base::TreeLockStatus status = base::readTreeLock(fHome);
        EXPECT_EQ(status.state, base::TreeLockState::kHeld);
        EXPECT_EQ(status.record.pid, 123);
        EXPECT_EQ(status.record.port, 4567);
        EXPECT_EQ(status.record.startFile, "/x/start file");
        EXPECT_EQ(status.record.repository, "/x/repository");
        EXPECT_EQ(status.record.device, 18446744073709551615u);
        EXPECT_EQ(status.record.inode, 2u);
    }
    first.release();
    EXPECT_TRUE(second.acquire(fHome));
}

TEST_F(StateTest, aLockFileWithoutItsServerIsFree)
{
    std::ofstream(base::treeLockPath(fHome)) << "pid=1\nport=80\n";
    const base::TreeLockStatus status = base::readTreeLock(fHome);
    EXPECT_EQ(status.state, base::TreeLockState::kFree);
    EXPECT_EQ(status.record.pid, 0);
    fs::remove(base::treeLockPath(fHome));
    ASSERT_EQ(::mkfifo(base::treeLockPath(fHome).c_str(), 0600), 0);
    EXPECT_EQ(base::readTreeLock(fHome).state, base::TreeLockState::kAbsent);
}

// Only a server of this program is ended for its repository's sake.
TEST_F(StateTest, aTreeThatAnotherProgramHoldsIsLeftAlone)
{
    const pid_t child = ::fork();
    if (child == 0) {
        ::execlp("sleep", "sleep", "60", nullptr);
        ::_exit(127);
    }
    const std::string program = "/proc/" + std::to_string(child) + "/comm";
    while (readOwnFile(program, 100) != "sleep\n") { // until the program is another one
        ::sched_yield();
    }
    TreeLock holder;
    ASSERT_TRUE(holder.acquire(fHome));
    holder.write({child, 0, "", fHome + "/gone", 1, 2});
    TreeClaim claim;
    EXPECT_THROW(claim.take(Config(fHome)), StartError);
    EXPECT_EQ(::kill(child, SIGKILL), 0);
    int status = 0;
    ::waitpid(child, &status, 0);
    EXPECT_EQ(WTERMSIG(status), SIGKILL);
}

} // namespace
} // namespace Pegasus::server
