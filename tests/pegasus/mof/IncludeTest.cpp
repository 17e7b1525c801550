// SPDX-License-Identifier: MIT
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"
#include "tests/pegasus/mof/Describe.h"
#include "tests/support/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/stat.h>

using namespace Pegasus::mof;
using test::TemporaryDirectory;

namespace {

// Changes the working directory for its lifetime.
class WorkingDirectory
{
  public:
    explicit WorkingDirectory(const std::string& path) : fBefore(std::filesystem::current_path())
    {
        std::filesystem::current_path(path);
    }
    ~WorkingDirectory() { std::filesystem::current_path(fBefore); }

  private:
    std::filesystem::path fBefore;
};

std::string classesOf(const std::string& file, const CompileOptions& options)
{
    MemoryHandler handler;
    compileFile(file, options, handler);
    std::string names;
    for (const Pegasus::CIMClass& found : handler.classes()) {
        names += mof_test::utf8(found.getClassName().getString()) + " ";
    }
    return names;
}

} // namespace

TEST(Include, LooksBesideTheIncludingFileFirstThenHereThenInTheDirectoriesInOrder)
{
    const TemporaryDirectory tree;
    const std::string top = tree.write("a/top.mof", "#pragma include (\"x.mof\")\nclass Top {};");
    tree.write("a/x.mof", "#pragma include (\"deep/y.mof\")\nclass X_beside {};");
    tree.write("a/deep/y.mof", "#pragma include (\"z.mof\")\nclass Y_beside {};");
    tree.write("here/z.mof", "class Z_here {};");
    tree.write("here/x.mof", "class X_here {};");
    tree.write("i1/z.mof", "class Z_first {};");
    tree.write("i2/z.mof", "class Z_second {};");
    CompileOptions options;
    options.includeDirectories = {tree.path() + "/i1", tree.path() + "/i2"};

    options.includesAny = true;
    EXPECT_EQ(classesOf(top, options), "Z_first Y_beside X_beside Top ");
    const WorkingDirectory here(tree.path() + "/here");
    EXPECT_EQ(classesOf(top, options), "Z_here Y_beside X_beside Top ");
    std::filesystem::remove(tree.path() + "/a/x.mof");
    EXPECT_EQ(classesOf("../a/top.mof", options), "X_here Top ");
}

TEST(Include, TakesBackslashesAndAbsolutePaths)
{
    const TemporaryDirectory tree;
    tree.write("a/b.mof", "class B {};");
    const std::string top = tree.write("t.mof", R"(#pragma include ("a\b.mof"))"
                                                "\n"
                                                R"(#pragma include ("a\\b.mof"))"
                                                "\n#pragma include (\"" +
                                                    tree.path() + "/a/b.mof\")");
    MemoryHandler handler;
    compileFile(top, {}, handler);
    EXPECT_THAT(handler.warnings(),
                testing::ElementsAre(testing::HasSubstr("Class B already exists"),
                                     testing::HasSubstr("fails on OpenPegasus 2.14: an absolute include path"),
                                     testing::HasSubstr("Class B already exists")));
}

// What a vendor's file includes is shown in diagnostics, so it must not lead to other files of the machine.
TEST(Include, StaysBelowItsFolders)
{
    const TemporaryDirectory tree;
    const std::string secret = tree.write("secret", "root:hash");
    tree.write("own/sub/x.mof", "#pragma include (\"../y.mof\")");
    tree.write("own/y.mof", "class Y {};");
    tree.write("own-other/z.mof", "class Z {};");
    std::filesystem::create_symlink(secret, tree.path() + "/own/link.mof");
    std::filesystem::create_directory(tree.path() + "/private");
    const std::string linked = tree.path() + "/private/top.mof";
    std::filesystem::create_symlink(tree.write("own/linked.mof", "#pragma include (\"y.mof\")"), linked);
    std::filesystem::create_symlink(tree.path() + "/own/y.mof", tree.path() + "/private/y.mof");
    EXPECT_EQ(classesOf(linked, {}), "Y "); // a private root, whose files are links to those of the tree
    EXPECT_EQ(classesOf(tree.write("own/inside.mof", "#pragma include (\"sub/x.mof\")"), {}), "Y ");

    for (const char* outside : {"../secret", "sub/../../secret", "link.mof", "../own-other/z.mof"}) {
        const std::string top =
            tree.write("own/top.mof", std::string("#pragma include (\"") + outside + "\")\nclass A {};");
        try {
            classesOf(top, {});
            ADD_FAILURE() << outside << ": no error";
        } catch (const MofError& error) {
            EXPECT_THAT(error.cause(), testing::HasSubstr("lies outside")) << outside;
            EXPECT_THAT(error.diagnostic(), testing::Not(testing::HasSubstr("hash"))) << outside;
        }
    }
    CompileOptions any;
    any.includesAny = true;
    try {
        classesOf(tree.write("own/top.mof", "#pragma include (\"../secret\")"), any);
        ADD_FAILURE() << "no error";
    } catch (const MofError& error) {
        EXPECT_THAT(error.diagnostic(), testing::Not(testing::HasSubstr("hash")));
    }
    any.includeDirectories = {tree.path() + "/own-other"};
    any.includesAny = false;
    EXPECT_EQ(classesOf(tree.write("own/top.mof", "#pragma include (\"z.mof\")"), any), "Z ");
}

TEST(Include, StopsAtTheLimits)
{
    const TemporaryDirectory tree;
    struct Row
    {
        const char* name;
        std::string file;
        const char* cause;
    };
    const Row rows[] = {
        {"itself", tree.write("loop.mof", "#pragma include (\"loop.mof\")"), "limit includeDepth (4)"},
        {"many",
         tree.write("many.mof", "#pragma include (\"e.mof\")\n#pragma include (\"e.mof\")\n"
                                "#pragma include (\"e.mof\")\n#pragma include (\"e.mof\")\n"
                                "#pragma include (\"e.mof\")\n#pragma include (\"e.mof\")\n"),
         "limit includeCount (5)"},
        {"large", tree.write("l.mof", "#pragma include (\"big.mof\")"), "limit fileBytes (400)"},
    };
    tree.write("e.mof", "");
    tree.write("big.mof", std::string(401, ' '));
    CompileOptions options;
    options.limits.includeDepth = 4;
    options.limits.includeCount = 5;
    options.limits.fileBytes = 400;
    for (const Row& row : rows) {
        MemoryHandler handler;
        try {
            compileFile(row.file, options, handler);
            ADD_FAILURE() << row.name << ": no error";
        } catch (const MofError& error) {
            EXPECT_THAT(error.cause(), testing::HasSubstr(row.cause)) << row.name;
        }
    }
}

TEST(Include, GoesOnWithoutAMissingFile)
{
    const TemporaryDirectory tree;
    tree.write("sub/x", "");
    const std::string file =
        tree.write("m.mof", "#pragma include (\"nofile.mof\")\nclass A {};\n#pragma include (\"sub\")\nclass B {};");
    MemoryHandler handler;
    compileFile(file, {}, handler);
    EXPECT_EQ(handler.classes().size(), 2u);
    EXPECT_THAT(handler.warnings(),
                testing::ElementsAre(file + ":1:18: warning: Could not open include file nofile.mof",
                                     file + ":3:18: warning: Could not open include file sub"));
}

TEST(Include, CountsWhatAnErrorKeepsFromBeingCompiledInEveryFile)
{
    struct Row
    {
        const char* inner;
        const char* after; // in the outer file
        const char* error;
        const char* skipped;
    };
    // The compiler may have parsed the rest of both files when a class fails.
    const Row rows[] = {
        {"class A { fault }; class B {};", "", "1:11: error: ", "2 definitions after it were not compiled\n"},
        {"class A : Nope {}; class B {};", "", "1:7: error: ", "2 definitions after it were not compiled\n"},
        {"class B {}; class A : Nope {};", "class { fault", "1:19: error: superclass does not exist: Nope\n",
         "1 definition after it was not compiled\n"},
        {"class B {}; class A : Nope {};", "#pragma unknown (\"warning\") class E {", "1:19: error: superclass",
         "2 definitions after it were not compiled\n"},
    };
    for (const Row& row : rows) {
        const TemporaryDirectory tree;
        tree.write("inner.mof", row.inner);
        const std::string file = tree.write("outer.mof", "class C {};\n#pragma include (\"inner.mof\")\nclass D {}; " +
                                                             std::string(row.after));
        MemoryHandler handler;
        try {
            compileFile(file, {}, handler);
            ADD_FAILURE() << "no error";
        } catch (const MofError& error) {
            EXPECT_THAT(error.diagnostic(), testing::StartsWith(tree.path() + "/inner.mof:" + row.error));
            EXPECT_THAT(error.diagnostic(), testing::EndsWith(std::string("^\n") + row.skipped));
        }
        EXPECT_THAT(handler.warnings(), testing::IsEmpty()) << row.after;
    }
}

TEST(Include, ReportsAnUnreadableTopFileAsSuch)
{
    const TemporaryDirectory tree;
    MemoryHandler handler;
    EXPECT_THROW(compileFile(tree.path() + "/none.mof", {}, handler), FileError);
    const std::string pipe = tree.path() + "/pipe.mof";
    ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
    for (const std::string& path : {tree.path(), pipe, std::string("/dev/zero")}) {
        EXPECT_THROW(compileFile(path, {}, handler), FileError) << path;
    }
    const std::string including = tree.write("t.mof", "#pragma include (\"pipe.mof\")");
    EXPECT_THROW(compileFile(including, {}, handler), MofError);
}
