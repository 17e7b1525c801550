// SPDX-License-Identifier: MIT
#include "pegasus/repository/Repository.h"
#include "tests/support/PrivateServer.h"
#include "tests/support/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <random>
#include <thread>

#include <poll.h>
#include <sys/inotify.h>
#include <unistd.h>

using test::PrivateServer;
using test::ProgramResult;
using test::TemporaryDirectory;

namespace {

const char* const kKey = "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);\n";

// One server for all tests of the program.
class Cimmof : public testing::Test
{
  protected:
    static void SetUpTestSuite()
    {
        server = std::make_unique<PrivateServer>();
        server->start();
    }
    static void TearDownTestSuite() { server.reset(); }

    // Compiles a text as "t.mof" into a namespace.
    ProgramResult compile(const std::string& nameSpace, const std::string& text) const
    {
        return server->run("cimmof", {"-n", nameSpace, "-aE", directory.write("t.mof", text)});
    }

    TemporaryDirectory directory;
    static std::unique_ptr<PrivateServer> server;
};

// Counts writes into the files of a directory. Writes that follow each other fast may count as one.
class WriteCounter
{
  public:
    explicit WriteCounter(const std::string& directory) : fWatch(::inotify_init1(IN_CLOEXEC))
    {
        EXPECT_GE(::inotify_add_watch(fWatch, directory.c_str(), IN_MODIFY), 0) << directory;
    }
    ~WriteCounter() { ::close(fWatch); }
    WriteCounter(const WriteCounter&) = delete;
    WriteCounter& operator=(const WriteCounter&) = delete;

    // Returns: false when fewer writes come before the timeout.
    bool waitFor(unsigned count)
    {
        pollfd wait = {fWatch, POLLIN, 0};
        alignas(inotify_event) char event[sizeof(inotify_event) + NAME_MAX + 1];
        for (unsigned seen = 0; seen < count; ++seen) {
            if (::poll(&wait, 1, 20000) != 1 || ::read(fWatch, event, sizeof event) <= 0) {
                return false;
            }
        }
        return true;
    }

  private:
    int fWatch;
};

std::unique_ptr<PrivateServer> Cimmof::server;

} // namespace

TEST_F(Cimmof, AnswersTheCommandLineAsOpenPegasusDoes)
{
    const std::string good = directory.write("good.mof", "class Good {};");
    const std::string bad = directory.write("bad.mof", "class {};");
    const std::string capital = directory.write("capital.mof", "Class Good {};");
    const std::string outside = directory.write("below/outside.mof", "#pragma include (\"../good.mof\")");
    const std::string including = directory.write("m.mof", "#pragma include (\"nofile.mof\")\nclass Later {};");
    struct Row
    {
        const char* name;
        std::vector<std::string> arguments;
        int exitStatus;
        std::string out; // a part of it; "": no output
        std::string err;
    };
    const Row rows[] = {
        {"nothing", {}, 0, "", ""},
        {"good", {"-n", "root/cl", "-aE", good}, 0, "", ""},
        {"attached", {"-nroot/cl2", "-w", good}, 0, "", ""},
        {"quiet", {"-w", "-n", "root/cl", good}, 0, "", ""},
        {"twice", {"-n", "root/cl", good}, 0, "", ":1:7: warning: Class Good already exists in the repository\n"},
        {"checkOnly", {"-E", good, good}, 0, "", ""},
        {"checkOnlyBad", {"-E", bad}, 250, "", "bad.mof:1:7: error: expected a class name instead of '{'\n"},
        {"strict", {"-E", "--strict", capital}, 250, "", ":1:1: error: fails on OpenPegasus 2.14: the word"},
        {"outsideInclude", {"-E", outside}, 250, "", "lies outside"},
        {"anyInclude", {"-E", "--any-include", outside}, 0, "", ""},
        {"noInclude",
         {"-n", "root/cl", including},
         0,
         "",
         "m.mof:1:18: warning: Could not open include file nofile.mof"},
        {"afterNoInclude", {"-n", "root/cl", including}, 0, "", "m.mof:2:7: warning: Class Later already exists"},
        {"noFile", {"-n", "root/cl", "missing.mof"}, 249, "", "Can't open file missing.mof\n"},
        {"directory", {"-n", "root/cl", "/"}, 2, "", "it is a directory"},
        {"badNamespace",
         {"-n", "bad ns", good},
         247,
         "",
         "Error: invalid CIM namespace name: bad ns\nFailed to set DefaultNamespacePath.\n"},
        {"unknownFlag", {"--nope"}, 254, "", ": Command line errors:\n> Unknown flag nope\n\n"},
        {"missingValue", {"-n"}, 254, "", "> Missing value for flag n\n"},
        {"refusedFlag", {"-uc", good}, 254, "", "Flag uc is not supported"},
        {"help", {"--help"}, 255, "Usage: cimmof", ""},
        {"secondFileToo", {"-n", "root/cl3", bad, good}, 250, "", "bad.mof:1:7: error"},
        {"secondFileThere", {"-n", "root/cl3", good}, 0, "", "already exists"},
    };
    for (const Row& row : rows) {
        const ProgramResult result = server->run("cimmof", row.arguments);
        EXPECT_EQ(result.exitStatus, row.exitStatus) << row.name;
        for (const auto& [got, wanted] : {std::pair(result.out, row.out), std::pair(result.err, row.err)}) {
            EXPECT_THAT(got, testing::HasSubstr(wanted)) << row.name;
            EXPECT_EQ(got.empty(), wanted.empty()) << row.name << ": " << got;
        }
    }
}

TEST_F(Cimmof, IsAsStrictAsTheRunningServer)
{
    const std::string file = directory.write("capital.mof", "Class Good {};");
    const std::string current = server->home() + "/cimserver_current.conf";
    EXPECT_EQ(server->run("cimmof", {"-E", file}).exitStatus, 0);
    std::filesystem::copy_file(current, directory.path() + "/before");
    std::ofstream(current, std::ios::app) << "strictProviders=true\n";
    EXPECT_EQ(server->run("cimmof", {"-E", file}).exitStatus, 250);
    std::filesystem::copy_file(directory.path() + "/before", current,
                               std::filesystem::copy_options::overwrite_existing);
}

TEST_F(Cimmof, SaysWhatTheServerRefused)
{
    struct Row
    {
        const char* name;
        const char* text;
        const char* error; // after the file name
    };
    const Row rows[] = {
        {"superclass", "class S1 : NoSuper {};",
         ":2:7: error: Error adding class S1 to the repository: CIM_ERR_INVALID_SUPERCLASS: NoSuper\n"
         "class S1 : NoSuper {};\n      ^\n"},
        {"scope", "[Key] class Q3 {};",
         ":2:13: error: Error adding class Q3 to the repository: CIM_ERR_FAILED: "
         "qualifier invalid in this scope: Key scope=CLASS\n"},
        {"reference", "class R1 { R1 ref r; };",
         ":2:7: error: Error adding class R1 to the repository: CIM_ERR_INVALID_PARAMETER: "
         "Non-association class contains reference property\n"},
        {"unknownClass", "instance of NoClass { a = 1; };",
         ":2:13: error: Error getting class NoClass from namespace root/refused: CIM_ERR_NOT_FOUND: NoClass\n"},
        {"unknownProperty", "class P1 { [Key] string id; }; instance of P1 { id = \"1\"; nope = 2; };",
         ":2:59: error: class P1 has no such property: nope\n"},
        {"noKeys", "class P2 { string id; }; instance of P2 { id = \"1\"; };",
         "error: Error adding an instance: CIM_ERR_FAILED: class has no keys: P2\n"},
        {"qualifier", "class U1 { [Nope] string s; };",
         ":2:13: error: Could not find declaration for Qualifier named Nope\n"},
    };
    for (const Row& row : rows) {
        const ProgramResult result = compile("root/refused", std::string(kKey) + row.text);
        EXPECT_EQ(result.exitStatus, 250) << row.name;
        EXPECT_THAT(result.err, testing::HasSubstr(row.error)) << row.name;
    }
}

// A registration refers to the base schema; the server itself answers for it.
TEST_F(Cimmof, RegistersAProviderOverTheBaseSchemas)
{
    for (const char* schema : {"PG_Internal", "PG_InterOp"}) {
        const std::string file = std::string(SCHEMA_DIR "/") + schema + "/" + schema + ".mof";
        const ProgramResult result = server->run("cimmof", {"-n", std::string("root/") + schema, "-aE", file});
        EXPECT_EQ(result.exitStatus, 0) << result.err;
        EXPECT_EQ(result.out + result.err, "") << schema;
    }
    const std::string registration =
        "instance of PG_ProviderModule { Name = \"M\"; Vendor = \"V\"; Version = \"1.0.0\"; InterfaceType = \"CMPI\";\n"
        "  InterfaceVersion = \"2.0.0\"; Location = \"m\"; };\n"
        "instance of PG_Provider { ProviderModuleName = \"M\"; Name = \"P\"; };\n"
        "instance of PG_ProviderCapabilities { ProviderModuleName = \"M\"; ProviderName = \"P\"; CapabilityID = "
        "\"1\";\n"
        "  ClassName = \"X\"; Namespaces = {\"root/cimv2\"}; ProviderType = {2, 5}; SupportedProperties = NULL; };\n";
    EXPECT_EQ(compile("root/PG_InterOp", registration).exitStatus, 0);
    const ProgramResult again = compile("root/PG_InterOp", registration);
    EXPECT_EQ(again.exitStatus, 0);
    EXPECT_THAT(again.err, testing::HasSubstr("the instance already exists"));
    const ProgramResult incomplete =
        compile("root/PG_InterOp", "instance of PG_ProviderModule { Name = \"N\"; Vendor = \"V\"; };");
    EXPECT_EQ(incomplete.exitStatus, 250);
    EXPECT_THAT(incomplete.err, testing::HasSubstr("which is required property in PG_ProviderModule class."));
}

TEST_F(Cimmof, LetsTwoCompilersWorkAtOnce)
{
    std::string text = kKey;
    for (int i = 0; i < 40; ++i) {
        text += "class Two" + std::to_string(i) + " { [Key] string id; };\n";
    }
    const std::string file = directory.write("two.mof", text);
    ProgramResult results[2];
    std::thread other([&] { results[1] = server->run("cimmof", {"-n", "root/two", file}); });
    results[0] = server->run("cimmof", {"-n", "root/two", file});
    other.join();
    for (const ProgramResult& result : results) {
        EXPECT_EQ(result.exitStatus, 0) << result.err;
    }
    EXPECT_THAT(server->run("cimmof", {"-n", "root/two", file}).err, testing::HasSubstr("Class Two39 already exists"));
}

TEST(CimmofAlone, SaysThatThereIsNoServer)
{
    const PrivateServer neverStarted;
    const TemporaryDirectory directory;
    const ProgramResult result = neverStarted.run("cimmof", {directory.write("t.mof", "class A {};")});
    EXPECT_EQ(result.exitStatus, 246);
    EXPECT_EQ(result.err, "Cannot connect to CIM Server. The CIM Server may not be running.\n");
}

// The server is killed in the middle of a compilation. The compiler must end with an error, and the repository must
// hold whole definitions only, over which the file can be compiled again.
TEST(CimmofAlone, LeavesAWholeRepositoryWhenTheServerIsKilled)
{
    constexpr int kRounds = 4;
    std::string text = kKey;
    for (int i = 0; i < 3000; ++i) {
        text += "class K" + std::to_string(i) + (i < 10 ? "" : " : K" + std::to_string(i / 10)) + " { string p" +
                std::to_string(i) + "; };\n";
    }
    const TemporaryDirectory directory;
    const std::string file = directory.write("many.mof", text);
    const unsigned seed = std::random_device()();
    SCOPED_TRACE("seed " + std::to_string(seed));
    std::mt19937 random(seed);
    PrivateServer server;
    std::size_t before = 0;
    for (int round = 0; round < kRounds; ++round) {
        server.start();
        WriteCounter writes(server.home() + "/repository");
        ProgramResult result;
        std::thread compiler([&] { result = server.run("cimmof", {"-w", "-n", "root/k", file}); });
        EXPECT_TRUE(writes.waitFor(std::uniform_int_distribution<unsigned>(1, 80)(random)));
        server.kill();
        compiler.join();
        EXPECT_THAT(result.exitStatus, testing::AnyOf(0, 246, 250)) << result.err;

        const Pegasus::repository::Repository repository(server.home() + "/repository");
        const Pegasus::CIMNamespaceName nameSpace("root/k");
        if (!repository.hasNamespace(nameSpace)) {
            EXPECT_EQ(before, 0u);
            continue;
        }
        const auto names = repository.enumerateClassNames(nameSpace, Pegasus::CIMName(), true);
        EXPECT_GE(names.size(), before) << "an acknowledged class is gone";
        before = names.size();
        for (std::size_t i = 0; i < names.size(); ++i) {
            EXPECT_TRUE(names[i].equal(Pegasus::CIMName(("K" + std::to_string(i)).c_str()))) << i;
            EXPECT_NO_THROW(repository.getClass(nameSpace, names[i], {false, true, true, {}})) << i;
        }
    }
    EXPECT_GT(before, 0u);
}
