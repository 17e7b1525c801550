// SPDX-License-Identifier: MIT
#include "tests/pegasus/mof/Describe.h"
#include "tests/pegasus/repository/RepositoryHandler.h"
#include "tests/support/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <random>
#include <thread>

#include <sys/wait.h>
#include <unistd.h>

using namespace Pegasus;
using namespace Pegasus::repository;
using mof_test::describe;
using mof_test::utf8;
using repository_test::compileText;
using test::TemporaryDirectory;

namespace {

const CIMNamespaceName kNamespace("root/test");
constexpr int kKillRounds = 12;

const char* const kKey = "Qualifier Key : boolean = false, Scope(property), Flavor(DisableOverride, ToSubclass);\n";

std::string classText(unsigned number)
{
    const std::string name = "C" + std::to_string(number);
    const std::string above = number == 0 ? "" : " : C" + std::to_string(number % 7 == 0 ? 0 : number - number % 7);
    return "class " + name + above + " { " + (number == 0 ? "[Key] string id; " : "") + "string p" +
           std::to_string(number) + " = \"" + std::string(300, 'x') + "\"; };\n" + "instance of " + name +
           " { id = \"i\"; };\n";
}

// In the child: defines one class and one instance after the other and acknowledges each pair with a byte.
[[noreturn]] void writeForEver(const std::string& directory, int acknowledgements)
{
    try {
        Repository repository(directory);
        compileText(repository, "root/test", kKey);
        for (unsigned number = 0;; ++number) {
            compileText(repository, "root/test", classText(number));
            if (::write(acknowledgements, "+", 1) != 1) {
                ::_exit(3);
            }
        }
    } catch (...) {
        ::_exit(2);
    }
}

unsigned countBytes(int descriptor)
{
    unsigned count = 0;
    char buffer[4096];
    for (ssize_t got; (got = ::read(descriptor, buffer, sizeof buffer)) > 0;) {
        count += static_cast<unsigned>(got);
    }
    return count;
}

// Kills the writer when it has acknowledged so many pairs and works on the next one.
// Returns: how many pairs it has acknowledged in the end.
unsigned writeAndKill(const std::string& directory, unsigned pairs)
{
    int ends[2];
    if (::pipe(ends) != 0) {
        return 0;
    }
    const pid_t child = ::fork();
    if (child == 0) {
        ::close(ends[0]);
        writeForEver(directory, ends[1]);
    }
    ::close(ends[1]);
    unsigned acknowledged = 0;
    for (char one; acknowledged < pairs && ::read(ends[0], &one, 1) == 1;) {
        ++acknowledged;
    }
    EXPECT_EQ(acknowledged, pairs) << "the writer ended by itself";
    ::kill(child, SIGKILL);
    acknowledged += countBytes(ends[0]);
    ::close(ends[0]);
    int status = 0;
    ::waitpid(child, &status, 0);
    EXPECT_TRUE(WIFSIGNALED(status));
    return acknowledged;
}

} // namespace

TEST(Durability, KeepsEveryAcknowledgedWriteAndNothingHalfWhenKilled)
{
    const unsigned seed = std::random_device()();
    SCOPED_TRACE("seed " + std::to_string(seed));
    std::mt19937 random(seed);
    for (int round = 0; round < kKillRounds; ++round) {
        const TemporaryDirectory directory;
        const unsigned acknowledged =
            writeAndKill(directory.path(), std::uniform_int_distribution<unsigned>(1, 60)(random));

        Repository repository(directory.path());
        const std::vector<CIMName> classes = repository.enumerateClassNames(kNamespace, CIMName(), true);
        const std::size_t instanceCount = repository.enumerateInstanceNames(kNamespace, CIMName("C0")).size();
        EXPECT_GE(instanceCount, acknowledged) << "round " << round;
        EXPECT_LE(classes.size(), acknowledged + 1) << "round " << round;
        EXPECT_THAT(instanceCount, testing::AnyOf(classes.size(), classes.size() - 1)) << "round " << round;
        // Everything that is listed can be read whole, and writing goes on.
        for (const CIMName& name : classes) {
            EXPECT_NO_THROW(repository.getClass(kNamespace, name, {false, true, true, {}})) << round;
        }
        compileText(repository, "root/test", "class After {};");
    }
}

TEST(Durability, IsThereAgainAfterReopening)
{
    const TemporaryDirectory directory;
    const ClassOptions whole{false, true, true, {}};
    std::string before;
    {
        Repository repository(directory.path());
        compileText(repository, "root/test", kKey + classText(0) + classText(1));
        before = describe(repository.getClass(kNamespace, CIMName("C1"), whole));
    }
    const Repository repository(directory.path());
    EXPECT_EQ(describe(repository.getClass(kNamespace, CIMName("C1"), whole)), before);
    EXPECT_EQ(repository.enumerateQualifiers(kNamespace).size(), 1u);
    EXPECT_EQ(utf8(repository.enumerateInstanceNames(kNamespace, CIMName("C0")).at(1).toString()), "C1.id=\"i\"");
}

TEST(Durability, KeepsTextsThatAreHardToWriteDown)
{
    const TemporaryDirectory directory;
    const char* const texts[] = {
        "a\\x1\\x8\\x1fb", "\\xD800", "\\xDC00\\xD800", "\\xFFFE\\xFFFF",    " lead and trail ",
        "a\\n\\r\\tb",     "",        "]]>&<\\\"'",     "\\xD83D\\xDE00 é名"};
    std::vector<std::string> before;
    const auto name = [](std::size_t i) { return CIMName(("T" + std::to_string(i)).c_str()); };
    {
        Repository repository(directory.path());
        for (std::size_t i = 0; i < std::size(texts); ++i) {
            compileText(repository, "root/test",
                        "class T" + std::to_string(i) + " { string s = \"" + texts[i] + "\"; };");
            before.push_back(describe(repository.getClass(kNamespace, name(i), {})));
        }
    }
    const Repository repository(directory.path());
    for (std::size_t i = 0; i < std::size(texts); ++i) {
        EXPECT_EQ(describe(repository.getClass(kNamespace, name(i), {})), before[i]) << texts[i];
    }
}

TEST(Durability, GoesOnWhenItsDirectoryIsDeleted)
{
    const TemporaryDirectory tree;
    const std::string directory = tree.path() + "/repository";
    {
        Repository repository(directory);
        compileText(repository, "root/test", kKey + classText(0));
        std::filesystem::remove_all(directory);
        for (unsigned number = 1; number < 200; ++number) {
            compileText(repository, "root/test", classText(number));
        }
        EXPECT_EQ(repository.enumerateInstanceNames(kNamespace, CIMName("C0")).size(), 200u);
    }
    EXPECT_FALSE(std::filesystem::exists(directory)) << "the end of the repository must not bring files back";
    const Repository fresh(directory);
    EXPECT_FALSE(fresh.hasNamespace(kNamespace));
}

TEST(Durability, SaysWhyItCannotOpen)
{
    const TemporaryDirectory tree;
    tree.write("file", "not a directory");
    tree.write("garbage/repository.db", std::string(5000, 'x'));
    EXPECT_THAT(repository_test::failureOf([&] { Repository(tree.path() + "/file"); }),
                testing::StartsWith("1 cannot "));
    EXPECT_THAT(repository_test::failureOf([&] { Repository(tree.path() + "/file/below"); }),
                testing::HasSubstr("cannot create directory"));
    EXPECT_THAT(repository_test::failureOf([&] { Repository(tree.path() + "/garbage"); }),
                testing::HasSubstr("file is not a database"));
}

TEST(Concurrency, ServesManyThreadsAtOnce)
{
    const TemporaryDirectory directory;
    Repository repository(directory.path());
    compileText(repository, "root/test", kKey + classText(0));
    const auto work = [&repository](unsigned thread) {
        for (unsigned i = 0; i < 50; ++i) {
            const unsigned number = 1000 + thread * 100 + i;
            repository.createClass(kNamespace,
                                   CIMClass(CIMName(("T" + std::to_string(number)).c_str()), CIMName("C0")));
            const CIMConstClass found = repository.getClass(kNamespace, CIMName("C0"), {false, true, true, {}});
            EXPECT_EQ(found.getPropertyCount(), 2u);
            EXPECT_EQ(repository.enumerateInstanceNames(kNamespace, CIMName("C0")).size(), 1u);
        }
    };
    std::vector<std::thread> threads;
    for (unsigned thread = 0; thread < 4; ++thread) {
        threads.emplace_back(work, thread);
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(repository.enumerateClassNames(kNamespace, CIMName("C0"), false).size(), 200u);
}
