// SPDX-License-Identifier: MIT
// Whose files may run: fixtures with modes and owners, and what is said about them.
#include "pegasus/base/OwnedPath.h"

#include "tests/support/TemporaryDirectory.h"

#include <gtest/gtest.h>

#include <filesystem>

#include <sys/stat.h>
#include <unistd.h>

namespace Pegasus::base {
namespace {

namespace fs = std::filesystem;

constexpr unsigned kOther = 65534; // "nobody"

class OwnedPathTest : public testing::Test
{
  protected:
    OwnedPathTest() { fDirectory.write("above/folder/file", "x"); }

    const test::TemporaryDirectory fDirectory;
    const std::string fRoot = fDirectory.path();
};

struct Row
{
    const char* name;
    const char* changed; // below the root
    unsigned mode;
    int owner; // -1: as it is
    int group;
    bool owned;
};

TEST_F(OwnedPathTest, nobodyElseMayChangeTheFileOrAFolderAbove)
{
    const Row rows[] = {
        {"as made", "", 0700, -1, -1, true},
        {"file others may read", "/above/folder/file", 0755, -1, -1, true},
        {"file others may write", "/above/folder/file", 0646, -1, -1, false},
        {"file another group may write", "/above/folder/file", 0664, -1, kOther, false},
        {"file another group may read", "/above/folder/file", 0644, -1, kOther, true},
        {"file of another user", "/above/folder/file", 0600, kOther, -1, false},
        {"folder others may write", "/above/folder", 0777, -1, -1, false},
        {"folder of another user", "/above/folder", 0700, kOther, -1, false},
        {"folder with the sticky bit", "/above/folder", 01777, -1, -1, true},
        {"another user's folder with the sticky bit", "/above", 01777, kOther, -1, false},
        {"folder further above", "/above", 0775, -1, kOther, false},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.name);
        if ((row.owner >= 0 || row.group >= 0) && ::geteuid() != 0) {
            std::cout << "[  SKIPPED ] " << row.name << ": needs root, to give files away\n";
            continue;
        }
        const std::string changed = fRoot + row.changed;
        struct stat before = {};
        ASSERT_EQ(::stat(changed.c_str(), &before), 0);
        ASSERT_EQ(::chown(changed.c_str(), static_cast<uid_t>(row.owner), static_cast<gid_t>(row.group)), 0);
        ASSERT_EQ(::chmod(changed.c_str(), row.mode), 0);
        const std::string fault = ownershipFault(fRoot + "/above/folder/file");
        EXPECT_EQ(fault.empty(), row.owned) << fault;
        EXPECT_EQ(fault.rfind(row.owned ? "" : changed + " (owner ", 0), 0u) << fault;
        ASSERT_EQ(::chown(changed.c_str(), before.st_uid, before.st_gid), 0);
        ASSERT_EQ(::chmod(changed.c_str(), before.st_mode & 07777), 0);
    }
}

// The sticky bit protects what lies in a folder; the folder itself stays unfit to search libraries in.
TEST_F(OwnedPathTest, theStickyBitIsNoExcuseForTheFolderItself)
{
    ASSERT_EQ(::chmod((fRoot + "/above").c_str(), 01777), 0);
    EXPECT_NE(ownershipFault(fRoot + "/above"), "");
    EXPECT_NE(ownershipFault(fRoot + "/above/"), "");
    EXPECT_EQ(ownershipFault(fRoot + "/above/folder"), "");
}

TEST_F(OwnedPathTest, theSentenceNamesPathOwnerAndMode)
{
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root, to give files away";
    }
    ASSERT_EQ(::chown((fRoot + "/above").c_str(), 4711, 0), 0);
    ASSERT_EQ(::chmod((fRoot + "/above").c_str(), 0751), 0);
    EXPECT_EQ(ownershipFault(fRoot + "/above/folder"),
              fRoot + "/above (owner 4711, mode 0751) can be changed by users other than root");
}

// Both the way to a link and the way that it leads count.
TEST_F(OwnedPathTest, linksAreFollowed)
{
    fs::create_directories(fRoot + "/links");
    fs::create_symlink(fRoot + "/above/folder", fRoot + "/links/folder");
    EXPECT_EQ(ownershipFault(fRoot + "/links/folder/file"), "");
    ASSERT_EQ(::chmod((fRoot + "/above").c_str(), 0777), 0);
    EXPECT_NE(ownershipFault(fRoot + "/links/folder/file"), "");
    ASSERT_EQ(::chmod((fRoot + "/above").c_str(), 0755), 0);
    ASSERT_EQ(::chmod((fRoot + "/links").c_str(), 0777), 0);
    EXPECT_NE(ownershipFault(fRoot + "/links/folder/file"), "");
    EXPECT_EQ(ownershipFault(fRoot + "/nothing"), "") << "what is not there cannot run";
}

TEST_F(OwnedPathTest, aPrivateGroupCountsAsItsUser)
{
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root, whose group is its own";
    }
    ASSERT_EQ(::chmod((fRoot + "/above").c_str(), 0770), 0);
    EXPECT_EQ(ownershipFault(fRoot + "/above"), "");
}

} // namespace
} // namespace Pegasus::base
