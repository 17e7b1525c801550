// SPDX-License-Identifier: MIT
// Which directories vrxhost works in, and that it leaves all others as they are.
#include "tests/host/cli/VrxhostProgram.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include <sys/stat.h>

namespace vrxhost {
namespace {

using testing::HasSubstr;
using testing::StartsWith;

constexpr uid_t kForeignUser = 54321; // has no entry and owns nothing else

class Root : public VrxhostProgram
{
  protected:
    // Whatever is run, removed or opened shows in the snapshot.
    Root()
    {
        Install("cimconfig", "echo ran > ran\n");
        fs::create_directories(fRoot / "pegasus/repository");
        std::ofstream(fRoot / "pegasus/repository/precious") << "somebody's work";
        fs::create_directories(fRoot / "pegasus/provider/acme");
        fs::create_directories(fRoot / "pegasus/lib");
        for (const char* path : {"pegasus/provider", "pegasus/provider/acme", "pegasus/lib"}) {
            SetMode(path, 0755);
        }
        for (const char* path :
             {"pegasus/provider/acme/libacme.so", "pegasus/lib/libpeg.so", "pegasus/pegSchema/base.mof", "libany.so"})
        {
            std::ofstream(fRoot / path) << "run or compiled";
            SetMode(path, 0644);
        }
    }

    void ExpectRefusal(const std::vector<std::string>& command, const std::string& sentence) const
    {
        const auto before = Snapshot(fFolder);
        const auto outcome = Start(command);
        EXPECT_TRUE(HasStatus(outcome, 2));
        EXPECT_THAT(outcome.fErrorOutput, StartsWith("vrxhost: "));
        EXPECT_THAT(outcome.fErrorOutput, HasSubstr(sentence));
        EXPECT_EQ(std::count(outcome.fErrorOutput.begin(), outcome.fErrorOutput.end(), '\n'), 1);
        EXPECT_EQ(Snapshot(fFolder), before);
    }
};

struct TFolderRow
{
    const char* fName;
    const char* fRemoved;
    const char* fMark; // null: as staged
    const char* fSentence;
};

const TFolderRow kFolders[] = {
    {"a source folder or an installed OpenPegasus", "pegasus/tree.conf", nullptr, "no readable pegasus/tree.conf"},
    {"a later format", "pegasus/tree.conf", "format = 2\nserver = embedded\n", "does not know the kind of tree"},
    {"an unknown server", "pegasus/tree.conf", "format = 1\nserver = other\n", "does not know the kind of tree"},
    {"no server", "pegasus/bin/cimserver", nullptr, "no program pegasus/bin/cimserver"},
    {"no schema", "pegasus/pegSchema", nullptr, "no folder pegasus/pegSchema"},
};

TEST_F(Root, FolderThatIsNotADeployedTreeStaysAsItIs)
{
    for (const TFolderRow& row : kFolders) {
        SCOPED_TRACE(row.fName);
        fs::rename(fRoot / row.fRemoved, fFolder / "aside");
        if (row.fMark) {
            std::ofstream(fRoot / row.fRemoved) << row.fMark;
        }
        ExpectRefusal(Command({"inventory"}), row.fSentence);
        fs::rename(fFolder / "aside", fRoot / row.fRemoved);
    }
    const auto refused = Start({VRXHOST, "--root", "/", "--format", "json", "providers"});
    EXPECT_TRUE(HasStatus(refused, 2));
    EXPECT_EQ(nlohmann::json::parse(refused.fOutput)["complete"], false);
}

TEST_F(Root, WorkingDirectoryIsNeverTheRoot)
{
    ExpectRefusal({"/bin/sh", "-c", "cd " + fRoot.string() + " && exec " VRXHOST " classes"},
                  "the root directory " + fs::path(VRXHOST).parent_path().string() + " is not a deployed tree");
}

struct TOwnerRow
{
    const char* fName;
    const char* fPath;
    uid_t fOwner;
    gid_t fGroup;
    unsigned int fMode;
    bool fRefused;
};

const TOwnerRow kOwners[] = {
    {"root writable by all", "", 0, 0, 0777, true},
    {"sticky does not protect a folder's new entries", "", 0, 0, 01777, true},
    {"server's folder", "pegasus", 0, 0, 0757, true},
    {"program folder", "pegasus/bin", 0, 0, 0775, false},
    {"program folder of another group", "pegasus/bin", 0, kForeignUser, 0775, true},
    {"another group that only reads", "pegasus/bin", 0, kForeignUser, 0755, false},
    {"program of another user", "pegasus/bin/cimconfig", kForeignUser, 0, 0755, true},
    {"library of the host", "libany.so", 0, 0, 0646, true},
    {"server's libraries", "pegasus/lib", 0, 0, 0757, true},
    {"server's library", "pegasus/lib/libpeg.so", kForeignUser, 0, 0644, true},
    {"base schemas", "pegasus/pegSchema", 0, kForeignUser, 0775, true},
    {"base schema", "pegasus/pegSchema/base.mof", 0, 0, 0666, true},
    {"vendors' folder", "pegasus/provider", kForeignUser, 0, 0755, true},
    {"vendor's folder", "pegasus/provider/acme", 0, 0, 0777, true},
    {"vendor's library", "pegasus/provider/acme/libacme.so", kForeignUser, 0, 0644, true},
    {"folder above", "..", 0, 0, 0777, true},
    {"sticky folder above", "..", 0, 0, 01777, false},
    {"another user's folder above", "..", kForeignUser, 0, 0755, true},
};

TEST_F(Root, WhatAnotherUserCouldHaveChangedIsNotRun)
{
    if (::geteuid() != 0) {
        GTEST_SKIP() << "only root may give files away";
    }
    for (const TOwnerRow& row : kOwners) {
        SCOPED_TRACE(row.fName);
        const fs::path path = (fRoot / row.fPath).lexically_normal();
        struct stat before = {};
        ASSERT_EQ(::stat(path.c_str(), &before), 0);
        ASSERT_EQ(::chown(path.c_str(), row.fOwner, row.fGroup), 0);
        ASSERT_EQ(::chmod(path.c_str(), row.fMode), 0);
        if (row.fRefused) {
            char text[8];
            std::snprintf(text, sizeof text, "%04o", row.fMode);
            const std::string owner = row.fOwner ? "user " + std::to_string(row.fOwner) : "root";
            const std::string shown = *row.fPath ? path.string() : fRoot.string();
            ExpectRefusal(Command({"inventory"}), shown + " (owner " + owner + ", mode " + text + ")");
        } else {
            EXPECT_TRUE(HasStatus(Run({"providers"}), 0));
        }
        ASSERT_EQ(::chown(path.c_str(), before.st_uid, before.st_gid), 0);
        ASSERT_EQ(::chmod(path.c_str(), before.st_mode & 07777), 0);
    }
}

// The file at the end may be trusted, but whoever may write the folder of a link chooses the end.
TEST_F(Root, LinkThroughAFolderOfOthersIsRefused)
{
    const fs::path open = fFolder / "open";
    fs::create_directories(open);
    fs::create_symlink(fRoot / "libany.so", open / "libacme.so");
    fs::permissions(open, fs::perms(0777));
    fs::create_symlink("../../../../open/libacme.so", fRoot / "pegasus/provider/acme/liblinked.so");
    ExpectRefusal(Command({"inventory"}), open.string());
}

TEST_F(Root, LogIsTheUsersAloneAndFollowsNoLink)
{
    const fs::path target = fFolder / "target";
    std::ofstream(target) << "precious";
    fs::create_symlink(target, fRoot / "vrxhost.log");
    const auto linked = Run({"providers"});
    EXPECT_TRUE(HasStatus(linked, 0));
    EXPECT_THAT(linked.fErrorOutput, HasSubstr("the log file " + (fRoot / "vrxhost.log").string() + " could not"));
    EXPECT_EQ(ReadFile(target), "precious");
    fs::remove(fRoot / "vrxhost.log");
    ASSERT_EQ(::mkfifo((fRoot / "vrxhost.log").c_str(), 0600), 0);
    EXPECT_TRUE(HasStatus(Run({"providers"}), 0)) << "nobody reads the FIFO";
    fs::remove(fRoot / "vrxhost.log");
    std::ofstream(fRoot / "vrxhost.log") << "of an earlier run";
    SetMode("vrxhost.log", 0666);
    EXPECT_TRUE(HasStatus(Run({"providers"}), 0));
    EXPECT_EQ(fs::status(fRoot / "vrxhost.log").permissions(), fs::perms(0600));
}

} // namespace
} // namespace vrxhost
