// SPDX-License-Identifier: MIT
// A root of the user's own, for a tree that is read-only or must stay unchanged.
#include "host/cli/TDeployedTree.h"
#include "tests/host/cli/VrxhostProgram.h"

#include <gmock/gmock.h>

#include <sys/stat.h>

namespace vrxhost {
namespace {

using testing::HasSubstr;

class PrivateRoot : public VrxhostProgram
{
  protected:
    PrivateRoot()
    {
        Install("cimconfig", "echo $PEGASUS_HOME > home; echo settings > $PEGASUS_HOME/cimserver_planned.conf");
        fs::create_directories(fRoot / "pegasus/provider/acme/data");
        std::ofstream(fRoot / "pegasus/provider/acme/acme.classes.xml") << "classes";
        std::ofstream(fRoot / "pegasus/provider/acme/data/table") << "table";
        std::ofstream(fRoot / "vrx.conf") << "fake.count=2\n";
        fs::copy_file(FAKE_PLUGIN, fRoot / "libpegasus.nsp.so");
        for (const auto& entry : fs::recursive_directory_iterator(fRoot)) {
            fs::permissions(entry, fs::perms(0755));
        }
    }

    TProcessOutcome RunHere(const std::vector<std::string>& arguments) const
    {
        std::vector<std::string> command = {VRXHOST, "--root", fRoot, "--state", fState, "instances", "Fake_Many"};
        command.insert(command.end(), arguments.begin(), arguments.end());
        return Start(command);
    }

    const fs::path fState = fFolder / "of the user" / "state";
};

// The plug-in's module path and its working directory are the private root then; the tree stays as it is.
TEST_F(PrivateRoot, HoldsEverythingThatIsWritten)
{
    const auto before = Snapshot(fRoot);
    const auto outcome = RunHere({});
    EXPECT_TRUE(HasStatus(outcome, 0));
    EXPECT_THAT(outcome.fOutput, HasSubstr("Fake_Many: 2 instances")) << "the tree's settings hold";
    EXPECT_TRUE(Snapshot(fRoot) == before);
    EXPECT_EQ(ReadFile(fState / "home"), (fState / "pegasus\n").string());
    EXPECT_EQ(ReadFile(fState / "pegasus/cimserver_planned.conf"), "settings\n");
    for (const char* written : {"cleared", "vrxhost.log"}) {
        EXPECT_TRUE(fs::exists(fState / written)) << written;
    }
    for (const char* folder : {"pegasus/provider/acme", "pegasus/provider/acme/data", "pegasus/bin"}) {
        EXPECT_FALSE(fs::is_symlink(fState / folder)) << folder << ": a removal below it would reach the tree";
    }
    for (const char* file : {"libpegasus.nsp.so", "pegasus/provider/acme/data/table", "pegasus/bin/cimserver"}) {
        EXPECT_TRUE(fs::is_symlink(fState / file)) << file;
    }
}

TEST_F(PrivateRoot, FollowsTheTreeAndKeepsWhatIsNotALink)
{
    ASSERT_TRUE(HasStatus(RunHere({}), 0));
    fs::remove(fState / "pegasus/provider/acme/acme.classes.xml"); // as the plug-in removes a vendor's file
    fs::remove_all(fRoot / "pegasus/provider/acme/data");
    std::ofstream(fRoot / "pegasus/provider/acme/new.mof") << "new";
    std::ofstream(fState / "pegasus/provider/acme/state") << "the vendor's";
    ASSERT_TRUE(HasStatus(RunHere({}), 0));
    EXPECT_EQ(ReadFile(fState / "pegasus/provider/acme/acme.classes.xml"), "classes");
    EXPECT_EQ(ReadFile(fState / "pegasus/provider/acme/new.mof"), "new");
    EXPECT_EQ(ReadFile(fState / "pegasus/provider/acme/state"), "the vendor's");
    EXPECT_FALSE(fs::exists(fState / "pegasus/provider/acme/data"));
}

// Its repository would be deleted.
TEST_F(PrivateRoot, IsNeverAFolderOfSomethingElse)
{
    fs::create_directories(fState / "pegasus/repository");
    std::ofstream(fState / "pegasus/repository/precious") << "somebody's work";
    const auto before = Snapshot(fFolder);
    const auto foreign = RunHere({});
    EXPECT_TRUE(HasStatus(foreign, 2));
    EXPECT_THAT(foreign.fErrorOutput, HasSubstr("holds a folder pegasus that vrxhost did not make"));
    EXPECT_TRUE(Snapshot(fFolder) == before);
}

// An installed package's tree is read-only for root too.
TEST_F(PrivateRoot, IsWhereTheTreesMarkSaysWhenThatCanBeWritten)
{
    const fs::path state = fFolder / "var";
    std::ofstream(fRoot / "pegasus/tree.conf", std::ios::app) << "state = " << state.string() << "\n";
    const auto before = Snapshot(fRoot);
    ASSERT_TRUE(HasStatus(Start({VRXHOST, "--root", fRoot, "instances", "Fake_Many"}), 0));
    EXPECT_TRUE(fs::exists(state / "vrxhost.log"));
    EXPECT_TRUE(Snapshot(fRoot) == before);
}

// Somebody who may not write the tree gets a place of their own; the first of these that is named.
TEST_F(PrivateRoot, OfAnOrdinaryUserIsInTheStateFolderTheHomeOrTmp)
{
    constexpr uid_t kNobody = 65534;
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root, to become an ordinary user";
    }
    const fs::path mine = fFolder / "mine";
    fs::create_directory(mine);
    ASSERT_EQ(::chown(mine.c_str(), kNobody, kNobody), 0);
    const std::string id = TDeployedTree(fRoot).GetId();
    const fs::path inTmp = "/tmp/vrxhost-" + std::to_string(kNobody);
    const bool wasThere = fs::exists(inTmp);
    const struct
    {
        std::vector<std::string> fEnvironment;
        fs::path fExpected;
    } rows[] = {
        {{"XDG_STATE_HOME=" + mine.string(), "HOME=/nonexistent"}, mine / "vrxhost" / id},
        {{"HOME=" + mine.string()}, mine / ".local/state/vrxhost" / id},
        {{"XDG_STATE_HOME=relative"}, inTmp / id},
        {{"HOME=/nonexistent"}, inTmp / id},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fExpected);
        std::vector<std::string> command = {"/usr/bin/setpriv", "--reuid=65534", "--regid=65534",
                                            "--clear-groups",   "/usr/bin/env",  "-i"};
        command.insert(command.end(), row.fEnvironment.begin(), row.fEnvironment.end());
        for (const std::string& word :
             {std::string(VRXHOST), std::string("--root"), fRoot.string(), std::string("providers")})
        {
            command.push_back(word);
        }
        EXPECT_TRUE(HasStatus(Start(command), 0));
        EXPECT_TRUE(fs::exists(row.fExpected / "vrxhost.log"));
        EXPECT_EQ(fs::status(row.fExpected).permissions(), fs::perms(0700));
        fs::remove_all(row.fExpected);
    }
    if (!wasThere) {
        std::error_code inUse; // by another run of the test
        fs::remove(inTmp, inUse);
    }
}

TEST_F(PrivateRoot, PlaceThatCannotBeUsedIsOneSentence)
{
    const auto outcome = Start({VRXHOST, "--root", fRoot, "--state", "/proc/none", "providers"});
    EXPECT_TRUE(HasStatus(outcome, 2));
    EXPECT_THAT(outcome.fErrorOutput, HasSubstr("the state directory /proc/none cannot be made or written"));
    fs::create_directories(fState);
    fs::permissions(fState, fs::perms(0777));
    EXPECT_TRUE(HasStatus(RunHere({}), 2)) << "others may write it";
}

} // namespace
} // namespace vrxhost
