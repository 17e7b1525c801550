#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"
#include "tests/pegasus/mof/Describe.h"
#include "tests/pegasus/mof/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace Pegasus::mof;
using mof_test::TemporaryDirectory;

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

    EXPECT_EQ(classesOf(top, options), "Z_first Y_beside X_beside Top ");
    const WorkingDirectory here(tree.path() + "/here");
    EXPECT_EQ(classesOf(top, options), "Z_here Y_beside X_beside Top ");
    std::filesystem::remove(tree.path() + "/a/x.mof");
    EXPECT_EQ(classesOf("../a/top.mof", options), "X_here Top ");
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
    const TemporaryDirectory tree;
    tree.write("inner.mof", "class A { fault }; class B {};");
    const std::string file = tree.write("outer.mof", "class C {};\n#pragma include (\"inner.mof\")\nclass D {};");
    MemoryHandler handler;
    try {
        compileFile(file, {}, handler);
        ADD_FAILURE() << "no error";
    } catch (const MofError& error) {
        EXPECT_THAT(error.diagnostic(), testing::EndsWith("^\n2 definitions after it were not compiled\n"));
    }
}

TEST(Include, ReportsAnUnreadableTopFileAsSuch)
{
    const TemporaryDirectory tree;
    MemoryHandler handler;
    EXPECT_THROW(compileFile(tree.path() + "/none.mof", {}, handler), FileError);
    EXPECT_THROW(compileFile(tree.path(), {}, handler), FileError);
}
