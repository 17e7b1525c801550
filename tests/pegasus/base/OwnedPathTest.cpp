// SPDX-License-Identifier: MIT
// Whose files may run: fixtures with modes and owners, and what is said about them.
#include "pegasus/base/OwnedPath.h"

#include "tests/support/TemporaryDirectory.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>

#include <grp.h>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

constexpr uid_t kSecondUser = 4711;

// The users root and "second", and a group named root, whatever the machine has.
struct Accounts
{
    const char* member = nullptr; // of the group, besides root
    gid_t rootsPrimary = 0;
    gid_t secondsPrimary = kSecondUser;
    int listed = 0; // entries that getpwent_r() returned
};
Accounts gAccounts;

void fill(passwd& entry, uid_t user)
{
    static char gNames[2][8] = {"root", "second"};
    entry = {};
    entry.pw_uid = user;
    entry.pw_name = gNames[user == 0 ? 0 : 1];
    entry.pw_gid = user == 0 ? gAccounts.rootsPrimary : gAccounts.secondsPrimary;
}

} // namespace

// In place of libc's.
extern "C" int getpwuid_r(uid_t user, passwd* entry, char*, size_t, passwd** found)
{
    fill(*entry, user);
    *found = user == 0 ? entry : nullptr;
    return 0;
}

extern "C" void setpwent()
{
    gAccounts.listed = 0;
}

extern "C" int getpwent_r(passwd* entry, char*, size_t, passwd** found)
{
    if (gAccounts.listed == 2) {
        return ENOENT;
    }
    fill(*entry, gAccounts.listed++ == 0 ? 0 : kSecondUser);
    *found = entry;
    return 0;
}

extern "C" int getgrgid_r(gid_t group, struct group* entry, char*, size_t, struct group** found)
{
    static char gName[] = "root";
    static char* gMembers[3] = {};
    gMembers[0] = gName;
    gMembers[1] = const_cast<char*>(gAccounts.member);
    *entry = {};
    entry->gr_gid = group;
    entry->gr_name = gName;
    entry->gr_mem = gMembers;
    *found = entry;
    return 0;
}

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

// Each folder on the way counts: of the path as written, of each link, and of the end.
TEST_F(OwnedPathTest, linksAreFollowedOneByOne)
{
    for (const char* folder : {"/first", "/middle", "/round"}) {
        fs::create_directories(fRoot + folder);
    }
    fs::create_symlink(fRoot + "/middle/folder", fRoot + "/first/folder");
    fs::create_symlink("../above/folder", fRoot + "/middle/folder");
    fs::create_symlink("round", fRoot + "/round/round");
    const std::string path = fRoot + "/first/./folder/../folder/file";
    EXPECT_EQ(ownershipFault(path), "");
    for (const char* open : {"/first", "/middle", "/above", "/above/folder"}) {
        ASSERT_EQ(::chmod((fRoot + open).c_str(), 0777), 0);
        EXPECT_EQ(ownershipFault(path).rfind(fRoot + open + " (owner ", 0), 0u) << ownershipFault(path);
        ASSERT_EQ(::chmod((fRoot + open).c_str(), 0755), 0);
    }
    EXPECT_EQ(ownershipFault(fRoot + "/nothing"), "") << "what is not there cannot run";
    EXPECT_EQ(ownershipFault(fRoot + "/round/round"), "") << "nor what leads nowhere";
}

// The name of a group says nothing about who is in it.
TEST_F(OwnedPathTest, aGroupOfOneUserCountsAsThatUser)
{
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root, whose group is its own";
    }
    struct GroupRow
    {
        const char* name;
        Accounts accounts;
        bool owned;
    };
    const GroupRow rows[] = {
        {"of root alone", {nullptr, 0, kSecondUser}, true},
        {"another member", {"second", 0, kSecondUser}, false},
        {"primary group of another user too", {nullptr, 0, 0}, false},
        {"of root's name, but another one is root's", {nullptr, 1, kSecondUser}, false},
    };
    ASSERT_EQ(::chmod((fRoot + "/above").c_str(), 0770), 0);
    for (const GroupRow& row : rows) {
        gAccounts = row.accounts;
        EXPECT_EQ(ownershipFault(fRoot + "/above").empty(), row.owned) << row.name;
    }
    gAccounts = Accounts();
}

} // namespace
} // namespace Pegasus::base
