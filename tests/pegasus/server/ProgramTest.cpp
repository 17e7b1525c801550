// SPDX-License-Identifier: MIT
// cimserver and cimconfig as people and other programs call them: texts, exit statuses, files.
#include "pegasus/base/TreeLockFile.h"
#include "tests/pegasus/server/HttpExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <signal.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace servertest {
namespace {

namespace fs = std::filesystem;

struct ProgramRow
{
    const char* name;
    std::string command; // a program and its arguments, apart by a blank
    int exitStatus;
    std::string out;
    std::string err;
};

void check(const ServerTree& tree, const std::vector<ProgramRow>& rows)
{
    for (const ProgramRow& row : rows) {
        SCOPED_TRACE(row.name);
        std::istringstream command(row.command);
        std::vector<std::string> words{std::istream_iterator<std::string>(command), {}};
        const std::string program = words.front();
        words.erase(words.begin());
        const ProgramResult result = tree.run(program, words);
        EXPECT_EQ(result.exitStatus, row.exitStatus);
        EXPECT_EQ(result.out, row.out);
        EXPECT_EQ(result.err, row.err);
    }
}

std::string contentOf(const std::string& path)
{
    if (!fs::is_regular_file(fs::symlink_status(path))) {
        return {};
    }
    std::ifstream file(path);
    return {std::istreambuf_iterator<char>(file), {}};
}

unsigned modeOf(const std::string& path)
{
    struct stat info = {};
    return ::lstat(path.c_str(), &info) == 0 ? info.st_mode & 07777 : 0;
}

const char kHint[] = "cimconfig: Use '--help' to obtain command syntax.\n";

TEST(ProgramTest, withoutAServer)
{
    const ServerTree tree;
    check(tree,
          {{"version", "cimserver -v", 0, "0.1.0\n", ""},
           {"status", "cimserver --status", 2, "The CIM Server is not running.\n", ""},
           {"stop", "cimserver -s", 1, "", "Unable to connect to CIM Server.  CIM Server may not be running.\n"},
           {"option", "cimserver --nope", 1, "", "cimserver not started: Unrecognized command line option. \n"},
           {"property", "cimserver a=b", 1, "", "cimserver not started: Unrecognized config property: a\n"},
           {"word", "cimserver word", 1, "", "cimserver not started: Unrecognized config property: word\n"},
           {"value", "cimserver httpPort=abc", 1, "", "cimserver not started: Invalid property value: httpPort=abc\n"},
           {"TLS", "cimserver enableHttpsConnection=true", 1, "",
            "cimserver not started: Invalid property value: enableHttpsConnection=true\n"},
           {"consumer", "cimserver consumer=../x", 1, "",
            "cimserver not started: Invalid property value: consumer=../x\n"},
           {"home", "cimserver -D /nonexistent", 1, "",
            "cimserver not started: Failed to save configuration properties to file: cannot open file: "
            "/nonexistent/cimserver_current.conf. Configuration property not set.\n"},
           {"set", "cimconfig -s providerDir=lib", 1,
            "Current value for the property 'providerDir' can not be set because the CIM server is not running.\n", ""},
           {"get", "cimconfig -g providerDir", 1,
            "Current value can not be determined because the CIM server is not running.\n", ""},
           {"default", "cimconfig -g providerDir -d", 0, "Default value: lib\n", ""},
           {"no arguments", "cimconfig", 1, "", std::string("cimconfig: Required arguments missing.\n") + kHint},
           {"flag", "cimconfig -x", 1, "", std::string("cimconfig: Unknown flag -x\n") + kHint},
           {"no value", "cimconfig -s providerDir", 1, "",
            std::string("cimconfig: argument \"providerDir\" is not valid for option \"-s\"\n") + kHint},
           {"plan", "cimconfig -s httpPort=1234 -p", 0,
            "Planned value for the property httpPort is set to \"1234\" in CIMServer.\n", ""},
           {"planned", "cimconfig -g httpPort -p", 0, "Planned value: 1234\n", ""},
           {"plan a missing folder", "cimconfig -s providerDir=nope -p", 1,
            "Failed to set the config property.\nInvalid property value: providerDir=nope\n", ""},
           {"list planned", "cimconfig -l -p", 0, "consumer=" + tree.consumer() + "\nhttpPort=1234\n", ""}});
    EXPECT_EQ(modeOf(tree.home() + "/cimserver_planned.conf"), 0600u);
}

TEST(ProgramTest, withAServer)
{
    ServerTree tree;
    tree.start();
    fs::create_directories(tree.home() + "/provider/a");
    const std::string none = "CIM_ERR_INVALID_NAMESPACE: root/PG_Internal";
    check(tree, {{"set before the schema", "cimconfig -s providerDir=provider/a:", 1, "", none + "\n"},
                 {"get before the schema", "cimconfig -g providerDir", 1,
                  "Failed to get the config property." + none + "\n", ""}});
    tree.compileBase();
    check(tree,
          {{"status", "cimserver --status", 0, "The CIM Server is running.\n", ""},
           {"again", "cimserver", 1, "", "Unable to start CIMServer. CIMServer is already running.\n"},
           {"set", "cimconfig -s providerDir=provider/a:", 0,
            "Current value for the property providerDir is set to \"provider/a:\" in CIMServer.\n", ""},
           {"get", "cimconfig -g providerDir", 0, "Current value: provider/a:\n", ""},
           {"missing folder", "cimconfig -s providerDir=provider/b:", 1,
            "Failed to set the config property.CIM_ERR_FAILED: Invalid property value: providerDir=provider/b:\n", ""},
           {"empty list", "cimconfig -s providerDir=", 1,
            "Failed to set the config property.CIM_ERR_FAILED: Invalid property value: providerDir=\n", ""},
           {"unknown", "cimconfig -s nosuch=1", 1, "Specified property name was not found.\n",
            "CIM_ERR_NOT_FOUND: Configuration property \"nosuch\"\n"},
           {"not while it runs", "cimconfig -s httpPort=1234", 1, "Specified property can not be modified.\n",
            "CIM_ERR_NOT_SUPPORTED: NonDynamic config property: httpPort\n"},
           {"still", "cimconfig -g providerDir", 0, "Current value: provider/a:\n", ""},
           {"reset", "cimconfig -u providerDir", 0,
            "Current value for the property providerDir is set to \"lib\" in CIMServer.\n", ""},
           {"stop", "cimserver -s", 0, "CIM Server stopped.\n", ""},
           {"stopped", "cimserver --status", 2, "The CIM Server is not running.\n", ""}});
    for (const std::string& file : {tree.startFile(), tree.home() + "/cimserver.lock", tree.home() + "/cimxml.socket"})
    {
        EXPECT_FALSE(fs::exists(file)) << file;
    }
}

TEST(ProgramTest, everyLimitIsListedWithDefaultAndMeaning)
{
    const std::string list = ServerTree().run("cimconfig", {"-l"}).out;
    for (const char* line : {"maxConnections (default 128) ", "maxHeaderBytes (default 65536) ",
                             "maxBodyBytes (default 16777216) ", "requestReadTimeout (default 30) "})
    {
        EXPECT_NE(list.find(line), std::string::npos) << line;
    }
}

TEST(ProgramTest, stopsByForceWhenTheSchemaIsMissing)
{
    ServerTree tree;
    tree.start();
    const int server = tree.serverProcess();
    check(tree, {{"stop", "cimserver -s", 1, "",
                  "Error in server shutdown: The repository may be empty.\nForced shutdown initiated.\n"}});
    EXPECT_FALSE(isRunning(server));
    EXPECT_FALSE(fs::exists(tree.startFile()));
}

TEST(ProgramTest, theStartFileNamesTheServerAndIsPrivate)
{
    ServerTree tree;
    const std::string victim = tree.home() + "/victim";
    std::ofstream(victim) << "untouched";
    fs::create_symlink(victim, tree.startFile());
    tree.start();
    EXPECT_EQ(contentOf(victim), "untouched");
    EXPECT_EQ(modeOf(tree.startFile()), 0600u);
    EXPECT_FALSE(fs::is_symlink(tree.startFile()));
    EXPECT_TRUE(isRunning(tree.serverProcess()));
    EXPECT_EQ(contentOf(tree.startFile()), std::to_string(tree.serverProcess()) + "\n");
    EXPECT_EQ(modeOf(tree.home() + "/cimxml.socket"), 0600u);
    EXPECT_NE(tree.log().find("Wrote the start file " + tree.startFile()), std::string::npos);
}

struct HostileRow
{
    const char* name;
    void (*put)(const std::string& path);
    bool isWritten; // whether the server gets its start file after all
};

// Whatever another user puts where the start file belongs, the server starts and reports what failed.
TEST(ProgramTest, startsWhateverLiesAtTheStartFilesPath)
{
    const HostileRow rows[] = {
        {"a folder", [](const std::string& path) { fs::create_directory(path); }, false},
        {"another user's folder",
         [](const std::string& path) {
             fs::create_directories(path + "/x");
             if (::geteuid() == 0) {
                 ASSERT_EQ(::chown(path.c_str(), 65534, 65534), 0);
             }
         },
         false},
        {"a FIFO", [](const std::string& path) { ASSERT_EQ(::mkfifo(path.c_str(), 0666), 0); }, true},
        {"a link to nothing", [](const std::string& path) { fs::create_symlink("/nonexistent/x", path); }, true},
        {"a file that names another process",
         [](const std::string& path) {
             std::ofstream(path) << ::getpid() << "\n";
             if (::geteuid() == 0) {
                 ASSERT_EQ(::chown(path.c_str(), 65534, 65534), 0);
             }
         },
         true}};
    for (const HostileRow& row : rows) {
        SCOPED_TRACE(row.name);
        ServerTree tree;
        row.put(tree.startFile());
        check(tree, {{"not running", "cimserver --status", 2, "The CIM Server is not running.\n", ""}});
        tree.start();
        EXPECT_EQ(contentOf(tree.startFile()), row.isWritten ? std::to_string(tree.serverProcess()) + "\n" : "");
        const std::string log = tree.log();
        const std::string line = "No start file: cannot replace " + tree.startFile();
        EXPECT_EQ(log.find(line) != std::string::npos, !row.isWritten) << log;
        EXPECT_EQ(log.find(line), log.rfind(line)) << "said once";
        check(tree, {{"running", "cimserver --status", 0, "The CIM Server is running.\n", ""},
                     {"again", "cimserver", 1, "", "Unable to start CIMServer. CIMServer is already running.\n"},
                     {"stop", "cimserver -s", 1, "",
                      "Error in server shutdown: The repository may be empty.\nForced shutdown initiated.\n"},
                     {"stopped", "cimserver --status", 2, "The CIM Server is not running.\n", ""}});
        EXPECT_EQ(fs::exists(fs::symlink_status(tree.startFile())), !row.isWritten) << "only its own is removed";
        std::error_code ignored;
        fs::remove_all(tree.startFile(), ignored);
    }
}

// A host that was killed leaves its server running; the next host deletes the repository and starts a server.
TEST(ProgramTest, takesThePlaceOfAServerWhoseRepositoryIsGone)
{
    for (const bool stopped : {false, true}) {
        SCOPED_TRACE(stopped ? "the old server does not react" : "the old server ends when asked");
        ServerTree tree;
        tree.start();
        const int old = tree.serverProcess();
        EXPECT_THROW(tree.start(), std::runtime_error) << "its repository is there";
        EXPECT_TRUE(isRunning(old));
        ASSERT_EQ(stopped ? ::kill(old, SIGSTOP) : 0, 0);
        fs::remove_all(tree.home() + "/repository");
        const std::string consumer = tree.consumer() + "-b"; // the old one's start file is removed whatever its name
        tree.start({"consumer=" + consumer});
        EXPECT_FALSE(isRunning(old));
        EXPECT_NE(tree.serverProcess(), old);
        EXPECT_FALSE(fs::exists(tree.startFile()));
        EXPECT_NE(tree.log().find("Ended the server of process " + std::to_string(old)), std::string::npos);
        EXPECT_EQ(exchange(tree.port(), intrinsicRequest("EnumerateClassNames", "root", "")).status, 200);
        check(tree, {{"stop", "cimserver -s", 1, "",
                      "Error in server shutdown: The repository may be empty.\nForced shutdown initiated.\n"}});
        EXPECT_FALSE(fs::exists("/var/tmp/cimserverkol_tc_" + consumer + "_start.conf"));
    }
}

// Whoever can change the tree would run as the user who starts the server.
TEST(ProgramTest, refusesATreeThatOthersCanChange)
{
    ServerTree tree;
    const std::string home = tree.home();
    fs::create_directories(home + "/bin");
    fs::create_directories(home + "/provider/vendor");
    std::ofstream(home + "/lib/liba.so") << "x";
    struct Row
    {
        const char* name;
        std::string path;
        unsigned mode;
        bool foreign; // belongs to another user
        const char* property;
    };
    const Row rows[] = {
        {"home", home, 0777, false, "logLevel=ERROR"},
        {"home of another user", home, 0755, true, "logLevel=ERROR"},
        {"folder above", fs::path(home).parent_path().string(), 0777, false, "logLevel=ERROR"},
        {"programs", home + "/bin", 0777, false, "logLevel=ERROR"},
        {"libraries", home + "/lib", 0755, true, "logLevel=ERROR"},
        {"a library", home + "/lib/liba.so", 0646, false, "logLevel=ERROR"},
        {"providers", home + "/provider", 0777, false, "logLevel=ERROR"},
        {"a provider's folder", home + "/provider/vendor", 0777, false, "providerDir=provider/vendor"},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.name);
        if (row.foreign && ::geteuid() != 0) {
            std::cout << "[  SKIPPED ] " << row.name << ": needs root, to give files away\n";
            continue;
        }
        struct stat before = {};
        ASSERT_EQ(::stat(row.path.c_str(), &before), 0);
        ASSERT_EQ(::chmod(row.path.c_str(), row.mode), 0);
        ASSERT_EQ(row.foreign ? ::chown(row.path.c_str(), 65534, 65534) : 0, 0);
        const ProgramResult refused = tree.run("cimserver", {row.property});
        EXPECT_EQ(refused.exitStatus, 1);
        EXPECT_EQ(refused.err.rfind("cimserver not started: " + row.path + " (owner ", 0), 0u) << refused.err;
        EXPECT_EQ(std::count(refused.err.begin(), refused.err.end(), '\n'), 1) << refused.err;
        EXPECT_FALSE(fs::exists(home + "/cimserver.lock"));
        EXPECT_NO_THROW(tree.start({row.property, "strictOwners=false"}));
        EXPECT_EQ(::kill(tree.serverProcess(), SIGTERM), 0);
        EXPECT_TRUE(eventually([&] { return !fs::exists(home + "/cimserver.lock"); }));
        ASSERT_EQ(row.foreign ? ::chown(row.path.c_str(), before.st_uid, before.st_gid) : 0, 0);
        ASSERT_EQ(::chmod(row.path.c_str(), before.st_mode & 07777), 0);
    }
    EXPECT_NO_THROW(tree.start());
}

// A laboratory's exception is the user's own to make: another user's configuration file is ignored.
TEST(ProgramTest, anotherUsersConfigurationIsNotRead)
{
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root, to give files away";
    }
    ServerTree tree;
    const std::string planned = tree.home() + "/cimserver_planned.conf";
    ASSERT_EQ(::chmod(tree.home().c_str(), 0777), 0);
    std::ofstream(planned) << "strictOwners=false\n";
    ASSERT_EQ(::chown(planned.c_str(), 65534, 65534), 0);
    EXPECT_EQ(tree.run("cimserver", {}).exitStatus, 1);
    ASSERT_EQ(::chown(planned.c_str(), 0, 0), 0);
    EXPECT_NO_THROW(tree.start());
}

TEST(ProgramTest, endsInOrderOnSignals)
{
    for (const int signal : {SIGTERM, SIGHUP, SIGINT}) {
        SCOPED_TRACE(signal);
        ServerTree tree;
        tree.start();
        const int server = tree.serverProcess();
        ASSERT_EQ(::kill(server, signal), 0);
        EXPECT_TRUE(eventually([&] { return !isRunning(server); }));
        EXPECT_FALSE(fs::exists(tree.startFile()));
        EXPECT_FALSE(fs::exists(tree.home() + "/cimserver.lock"));
    }
}

TEST(ProgramTest, startsAgainOverWhatAKilledServerLeft)
{
    ServerTree tree;
    tree.start();
    tree.compileBase();
    const int server = tree.serverProcess();
    ASSERT_EQ(::kill(server, SIGKILL), 0);
    ASSERT_TRUE(eventually([&] { return !isRunning(server); }));
    EXPECT_TRUE(fs::exists(tree.startFile()));
    tree.start();
    EXPECT_NE(tree.serverProcess(), server);
    EXPECT_EQ(tree.run("cimserver", {"-s"}).exitStatus, 0) << "the schema was kept";
}

TEST(ProgramTest, aTakenPortIsNamed)
{
    ServerTree tree;
    const int taken = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    address.sin_port = htons(tree.port());
    ASSERT_EQ(::bind(taken, reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    ASSERT_EQ(::listen(taken, 1), 0);
    const std::string port = std::to_string(tree.port());
    check(tree, {{"start", "cimserver httpPort=" + port, 1, "",
                  "cimserver not started: Bind failed: Failed to bind socket on port " + port +
                      ": Address already in use (error code 98).\n"}});
    EXPECT_FALSE(fs::exists(tree.startFile()));
    EXPECT_EQ(Pegasus::base::readTreeLock(tree.home()).state, Pegasus::base::TreeLockState::kFree)
        << "the tree's clients know that nobody on the port is its server";
    EXPECT_FALSE(fs::exists(tree.home() + "/repository")) << "the port comes first";
    ::close(taken);
}

TEST(ProgramTest, aConfigurationThatCannotBeSavedIsReportedWithItsCause)
{
    const ServerTree tree;
    const std::string file = tree.home() + "/cimserver_current.conf";
    fs::create_directory(file);
    const ProgramResult result = tree.run("cimserver", {"httpPort=" + std::to_string(tree.port())});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.err,
              "cimserver not started: Failed to save configuration properties to file: cannot open file: " + file +
                  ". Configuration property not set.\ncannot replace " + file + ": Is a directory\n");
}

// The launcher's caller may wait for the end of a pipe that the server would otherwise hold open.
TEST(ProgramTest, theServerKeepsNoneOfItsCallersDescriptors)
{
    ServerTree tree;
    int ends[2];
    ASSERT_EQ(::pipe(ends), 0); // not close-on-exec: the launcher inherits both
    tree.start();
    ::close(ends[1]);
    char byte;
    EXPECT_EQ(::read(ends[0], &byte, 1), 0);
    ::close(ends[0]);
    const std::string fds = "/proc/" + std::to_string(tree.serverProcess()) + "/fd/";
    for (const char* fd : {"0", "1", "2"}) {
        EXPECT_EQ(fs::read_symlink(fds + fd), "/dev/null");
    }
}

// The pipe to the launcher must not be taken for standard output.
TEST(ProgramTest, startsForACallerWithoutStandardDescriptors)
{
    ServerTree tree;
    const pid_t pid = ::fork();
    if (pid == 0) {
        for (const int fd : {0, 1, 2}) {
            ::close(fd);
        }
        ::setenv("PEGASUS_HOME", tree.home().c_str(), 1);
        const std::string port = "httpPort=" + std::to_string(tree.port());
        ::execl(programPath("cimserver").c_str(), "cimserver", port.c_str(), nullptr);
        ::_exit(127);
    }
    int status = -1;
    EXPECT_TRUE(eventually([&] { return ::waitpid(pid, &status, WNOHANG) == pid; }));
    EXPECT_EQ(status, 0);
    if (status == -1) {
        ::kill(pid, SIGKILL);
        ::waitpid(pid, nullptr, 0);
        return;
    }
    EXPECT_EQ(exchange(tree.port(), intrinsicRequest("EnumerateClassNames", "root", "")).status, 200);
}

TEST(ProgramTest, listensOnLoopbackOnly)
{
    ServerTree tree;
    tree.start();
    char text[16];
    std::snprintf(text, sizeof text, ":%04X", tree.port());
    std::ifstream table("/proc/net/tcp");
    for (std::string line; std::getline(table, line);) {
        if (line.find(text) == std::string::npos || line.find(" 0A ") == std::string::npos) {
            continue; // not a listener on our port
        }
        EXPECT_NE(line.find(std::string("0100007F") + text), std::string::npos) << line;
    }
    std::ifstream six("/proc/net/tcp6");
    EXPECT_EQ(std::string(std::istreambuf_iterator<char>(six), {}).find(std::string(text) + " 0000000000000000"),
              std::string::npos);
}

} // namespace
} // namespace servertest
