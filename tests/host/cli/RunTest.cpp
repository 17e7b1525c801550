// SPDX-License-Identifier: MIT
// A run of vrxhost from its settings to its end: files, the server's name and port, interruptions, deadlines, a second
// host and a reader that leaves.
#include "host/core/TUniqueFd.h"
#include "tests/host/cli/VrxhostProgram.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include <fcntl.h>
#include <sys/file.h>

namespace vrxhost {
namespace {

using testing::HasSubstr;

TEST_F(VrxhostProgram, SettingsFileAndLogFile)
{
    std::ofstream(fRoot / "vrx.conf") << "fake.fault=prints\nfake.count=2\n";
    const auto outcome = Start({VRXHOST, "--root", fRoot, "--plugin", FAKE_PLUGIN, "instances", "Fake_Many", "--log",
                                fRoot / "other.log", "-v"});
    EXPECT_TRUE(HasStatus(outcome, 0));
    EXPECT_THAT(outcome.fOutput, HasSubstr("Fake_Many: 2 instances"));
    EXPECT_THAT(outcome.fErrorOutput, HasSubstr("consumer vrxhost-")) << "-v shows the log";
    EXPECT_THAT(ReadFile(fRoot / "other.log"), HasSubstr("consumer vrxhost-"));
    EXPECT_FALSE(fs::exists(fRoot / "vrxhost.log"));
    for (const auto& [line, sentence] : std::map<std::string, std::string>{
             {"no equals sign", "\"key = value\" is expected"},
             {"pegasus_multithread = on",
              "there is no setting pegasus_multithread; did you mean pegasus_multi_thread?"}})
    {
        std::ofstream(fRoot / "vrx.conf") << "# comment\n" << line;
        const auto bad = Run({"providers"});
        EXPECT_TRUE(HasStatus(bad, 2));
        EXPECT_EQ(bad.fErrorOutput, "vrxhost: " + (fRoot / "vrx.conf:2: ").string() + sentence + "\n");
    }
    const auto noLog = Run({"--config", "/dev/null", "--log", "/dev/null/x", "providers"});
    EXPECT_TRUE(HasStatus(noLog, 0));
    EXPECT_THAT(noLog.fErrorOutput, HasSubstr("the log file /dev/null/x could not be opened"));
    EXPECT_EQ(Run({"--config", "/dev/null", "--log", "/dev/full", "providers"}).fErrorOutput,
              "vrxhost: the log file /dev/full could not be written: No space left on device; the run goes on "
              "without\n");
}

TEST_F(VrxhostProgram, ConsumerIsPlannedBeforeTheNamespaceIsOpened)
{
    Install("cimconfig", "echo \"$*\" >> arguments; echo \"$PEGASUS_HOME\" >> arguments");
    EXPECT_TRUE(HasStatus(Run({"providers", "--consumer", "me"}), 0));
    EXPECT_EQ(ReadFile(fRoot / "arguments"), "-s consumer=me -p\n" + fRoot.string() + "/pegasus\n");
    EXPECT_THAT(ReadFile(fRoot / "vrxhost.log"), HasSubstr("consumer me"));
    Install("cimconfig", "echo 'no such property' >&2; exit 1");
    const auto refused = Run({"providers", "--consumer", "me"});
    EXPECT_TRUE(HasStatus(refused, 1));
    EXPECT_EQ(refused.fErrorOutput,
              "vrxhost: the consumer me could not be set, cimconfig: exit status 1: no such property\n");
    EXPECT_TRUE(HasStatus(Run({"providers"}), 0)) << "without a name of its own a host takes what the server has";
}

// Another tree's server must not be found by this tree's start file.
TEST_F(VrxhostProgram, DefaultConsumerIsMadeOfTheRootUnlessTheServerIsAnInstalledOne)
{
    const auto consumer = [this](const fs::path& root) {
        EXPECT_TRUE(HasStatus(Start({VRXHOST, "--root", root, "--plugin", FAKE_PLUGIN, "providers"}), 0));
        const std::string log = ReadFile(root / "vrxhost.log");
        const std::size_t at = log.find("consumer ");
        return log.substr(at, log.find('\n', at) - at);
    };
    const std::string first = consumer(fRoot);
    EXPECT_EQ(first, consumer(fRoot));
    fs::copy(fRoot, fFolder / "copy", fs::copy_options::recursive);
    EXPECT_NE(first, consumer(fFolder / "copy"));
    std::ofstream(fRoot / "pegasus/tree.conf") << "format = 1\nserver = installed OpenPegasus\nconsumer = built\n";
    Install("cimconfig", "touch was-run");
    EXPECT_EQ(consumer(fRoot), "consumer built");
    EXPECT_FALSE(fs::exists(fRoot / "was-run")) << "such a server has no property of that name";
    EXPECT_TRUE(HasStatus(Run({"providers", "--consumer", "built"}), 0));
    const auto refused = Run({"providers", "--consumer", "me"});
    EXPECT_TRUE(HasStatus(refused, 2));
    EXPECT_THAT(refused.fErrorOutput, HasSubstr("was built for the consumer built and knows no other"));
}

TEST_F(VrxhostProgram, StartsOverWhenAnotherServerTookThePort)
{
    const auto healed = Run({"providers", "--format", "json", "--set", "fake.foreign-servers=2"});
    EXPECT_TRUE(HasStatus(healed, 0));
    EXPECT_TRUE(nlohmann::json::parse(healed.fOutput)["complete"]) << "losses of the attempts before do not count";
    EXPECT_EQ(ReadFile(fRoot / "allocations"), "3");
    const auto failed = Run({"providers", "--set", "fake.foreign-servers=9"});
    EXPECT_TRUE(HasStatus(failed, 1));
    EXPECT_EQ(ReadFile(fRoot / "allocations"), "3");
    EXPECT_THAT(failed.fErrorOutput, HasSubstr("the server did not start, cimserver: exit status 1"));
}

struct TInterruptionRow
{
    const char* fFault;
    int fStatus;
    std::size_t fClassesShown;
    bool fAnnounced;
};

const TInterruptionRow kInterruptions[] = {
    {"interrupt-program", 130, 0, true},
    {"program-at-shutdown", 130, 0, true},
    {"interrupt-enumeration", 130, 2, true}, // what was collected is shown
    {"interrupt-at-shutdown", 0, 3, false},  // the document was complete before
};

TEST_F(VrxhostProgram, InterruptionEndsWaitingProgramsAndEnumerations)
{
    for (const TInterruptionRow& row : kInterruptions) {
        SCOPED_TRACE(row.fFault);
        fs::remove(fRoot / "cleared");
        const auto outcome = Run({"inventory", "--format", "json"}, row.fFault);
        EXPECT_TRUE(HasStatus(outcome, row.fStatus));
        EXPECT_TRUE(IsCleared());
        const auto json = nlohmann::json::parse(outcome.fOutput);
        EXPECT_EQ(json["complete"], row.fStatus == 0);
        EXPECT_EQ(json["providers"].empty() ? 0 : json["providers"][0]["classes"].size(), row.fClassesShown);
        if (row.fAnnounced) {
            EXPECT_EQ(outcome.fErrorOutput, "vrxhost: stopping ...\nvrxhost: interrupted\n");
            EXPECT_EQ(json["losses"][0]["text"], "interrupted");
        }
    }
    EXPECT_TRUE(fs::exists(fRoot / "shut-down-program-ran"));
    // As a shell starts a job in the background, and nohup any program.
    std::vector<std::string> ignoring = {"/bin/sh", "-c", "trap '' INT; exec \"$0\" \"$@\""};
    const auto run = Command({"inventory", "--deadline", "1"}, "interrupt-enumeration");
    ignoring.insert(ignoring.end(), run.begin(), run.end());
    EXPECT_TRUE(HasStatus(Start(ignoring), 3)) << "the deadline ends it";
}

// What was delivered before the deadline is shown, and every format says that it is not all.
TEST_F(VrxhostProgram, ProviderThatTakesLongerThanTheDeadlineIsGivenUp)
{
    const std::map<std::string, std::string> marks = {
        {"json", R"("partial": true)"},
        {"ndjson", R"("partial":[{"provider":"fake","class":"Fake_Broken"},{"provider":"fake","class":"Fake_Many"}])"},
        {"csv", "fake,Fake_Many,,partial,boolean,true,\n"},
        {"table", "Fake_Many: 0 instances, partial: the provider was given up\n"},
        {"tree", "partial: provider fake was given up\n"},
        {"html", "<td>0, partial: the provider was given up</td>"}};
    for (const auto& [format, mark] : marks) {
        const auto outcome = Run({"inventory", "--deadline", "1", "--format", format}, "slow-class");
        EXPECT_TRUE(HasStatus(outcome, 3));
        EXPECT_THAT(outcome.fOutput, HasSubstr(mark));
        EXPECT_THAT(outcome.fOutput, HasSubstr("Fake_Broken")) << format;
        EXPECT_EQ(outcome.fErrorOutput, "vrxhost: provider fake took longer than 1 s and was given up; missing or "
                                        "incomplete: Fake_Broken, Fake_Many\n");
    }
    EXPECT_TRUE(HasStatus(Run({"instances", "Fake_Broken", "--deadline", "1"}, "slow-class"), 3));
    EXPECT_TRUE(HasStatus(Run({"inventory", "--deadline", "60"}), 0));
}

TEST_F(VrxhostProgram, SecondInterruptionEndsAtOnce)
{
    EXPECT_TRUE(HasStatus(Run({"inventory"}, "interrupt-twice"), 130));
    EXPECT_FALSE(IsCleared());
}

// Two at once would stop each other's server.
TEST_F(VrxhostProgram, SecondHostInOneRootIsRefused)
{
    std::ofstream(fRoot / "vrxhost.log") << "of the first";
    const NKOLVRX20::TUniqueFd root(::open(fRoot.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    ASSERT_EQ(::flock(root.Get(), LOCK_EX | LOCK_NB), 0);
    const auto outcome = Run({"inventory"});
    EXPECT_TRUE(HasStatus(outcome, 1));
    const std::string sentence = "another vrxhost is at work in " + fRoot.string();
    EXPECT_EQ(outcome.fErrorOutput, "vrxhost: " + sentence + "\n");
    const auto json = nlohmann::json::parse(Run({"inventory", "--format", "json"}).fOutput);
    EXPECT_EQ(json["complete"], false);
    EXPECT_EQ(json["losses"].dump(), nlohmann::json({{{"kind", "busy-root"}, {"text", sentence}}}).dump());
    EXPECT_EQ(ReadFile(fRoot / "vrxhost.log"), "of the first");
}

// The fault's class delivers without end.
TEST_F(VrxhostProgram, ReaderThatLeavesEndsTheRun)
{
    std::vector<std::string> command = {"/bin/bash", "-c", "\"$0\" \"$@\" | head -c 1; exit ${PIPESTATUS[0]}"};
    const auto run = Command({"inventory", "--format", "ndjson"}, "slow-class");
    command.insert(command.end(), run.begin(), run.end());
    const auto outcome = Start(command);
    EXPECT_TRUE(HasStatus(outcome, 1));
    EXPECT_EQ(outcome.fOutput, "{");
    EXPECT_EQ(outcome.fErrorOutput, "");
    EXPECT_TRUE(IsCleared());
}

} // namespace
} // namespace vrxhost
