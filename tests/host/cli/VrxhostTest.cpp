// SPDX-License-Identifier: MIT
// vrxhost as a program, with a plug-in that misbehaves on demand: what it prints, what it says and how it exits.
#include "tests/host/cli/VrxhostProgram.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

namespace vrxhost {
namespace {

using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

// golden_test.py has the documents whole.
TEST_F(VrxhostProgram, InventoryLeavesAClearedNamespaceAndALog)
{
    const auto outcome = Run({"inventory"});
    EXPECT_TRUE(HasStatus(outcome, 0));
    EXPECT_THAT(outcome.fOutput, HasSubstr("      MixedCase  -128\n      Names      a, b\\xff\n"));
    EXPECT_EQ(outcome.fErrorOutput, "");
    EXPECT_TRUE(IsCleared());
    EXPECT_THAT(ReadFile(fRoot / "vrxhost.log"), HasSubstr("consumer vrxhost-"));
}

// The cases of golden_test.py are stable documents; these members are the rest.
TEST_F(VrxhostProgram, JsonHasTimesAndVolatileProperties)
{
    const auto json = nlohmann::ordered_json::parse(Run({"instances", "fake_everytype", "--format", "json"}).fOutput);
    std::string names;
    for (const auto& member : json.items()) {
        names += member.key() + " ";
    }
    EXPECT_EQ(names, "format tool command host run started name superclass properties instances ended complete losses "
                     "notes ");
    EXPECT_EQ(json["instances"][0]["properties"]["MixedCase"], -128);
}

struct TFaultRow
{
    const char* fFault;
    int fStatus;
    const char* fSentence;
};

const TFaultRow kFaults[] = {
    {"initialize-throws", 1, "could not be initialised: no initialisation today"},
    {"registers-nothing", 1, "registered no provider named \"pegasus\""},
    {"throws-standard", 1, "the namespace could not be opened: out of luck"},
    {"throws-status", 1, "the namespace could not be opened: The connection to the CIM server failed (status 42)"},
    {"throws-directory", 1, "The directory could not be opened (status 11): "},
    {"throws-int", 1, "the namespace could not be opened: an exception of type int"},
    {"returns-null", 1, "the namespace could not be opened: the plug-in returned none"},
    {"class-throws", 3, "instances of Fake_Broken could not be fetched: an exception of type int"},
    {"clear-throws", 3, "the plug-in could not shut its namespace down: no shutdown today"},
    {"leaves-a-thread", 3, "the plug-in left threads behind and stays loaded"},
    {"prints", 0, ""},
    {"threads", 0, ""},
};

TEST_F(VrxhostProgram, EveryFaultOfAPluginIsOneSentenceAndAValidDocument)
{
    for (const TFaultRow& row : kFaults) {
        SCOPED_TRACE(row.fFault);
        fs::remove(fRoot / "cleared");
        const auto outcome = Run({"inventory", "--format", "json"}, row.fFault);
        EXPECT_TRUE(HasStatus(outcome, row.fStatus));
        const auto json = nlohmann::json::parse(outcome.fOutput, nullptr, false);
        ASSERT_TRUE(json.is_object()) << outcome.fOutput;
        EXPECT_THAT(outcome.fErrorOutput, HasSubstr(row.fSentence));
        EXPECT_EQ(json["complete"], row.fStatus == 0 || json["losses"].empty());
        const bool hasNamespace =
            std::string(row.fFault).find("initialize") != 0 && std::string(row.fFault).find("registers") != 0;
        EXPECT_EQ(IsCleared(), hasNamespace);
    }
}

TEST_F(VrxhostProgram, WhatThePluginPrintsDoesNotReachTheDocument)
{
    const auto outcome = Run({"providers"}, "prints");
    EXPECT_THAT(outcome.fOutput, Not(HasSubstr("printed")));
    EXPECT_EQ(outcome.fErrorOutput, "printed by the plug-in\n");
}

TEST_F(VrxhostProgram, APluginThatEndsTheProcessIsReported)
{
    const auto outcome = Run({"providers"}, "exits");
    EXPECT_TRUE(HasStatus(outcome, 1));
    EXPECT_THAT(outcome.fErrorOutput, HasSubstr("vrxhost: the plug-in ended the process: no TCP port"));
}

TEST_F(VrxhostProgram, ProvidersOfSeveralThreadsAreAllListed)
{
    const auto json = nlohmann::json::parse(Run({"providers", "--format", "json"}, "threads").fOutput);
    EXPECT_EQ(json["providers"].size(), 8u);
}

TEST_F(VrxhostProgram, LossesAreLearntFromTheLogAndFromPrograms)
{
    const auto outcome = Run({"inventory", "--format", "json"}, "losses");
    EXPECT_TRUE(HasStatus(outcome, 3));
    const std::vector<std::string> expected = {
        "class list /x/linux/a.classes.xml, line 3:syntax error",
        "class CIM_Gone, CIM_Lost could not be fetched: not found",
        "class CIM_Odd  CIM_Base could not be built: The value has the wrong type",
        "MOF file /x/provider/linux/bad.mof of vendor linux did not compile, cimmof: exit status 250: "
        "Parsing error: bad.mof:3"};
    const auto losses = nlohmann::json::parse(outcome.fOutput)["losses"];
    std::vector<std::string> sentences;
    std::transform(losses.begin(), losses.end(), std::back_inserter(sentences),
                   [](const auto& loss) { return loss["text"]; });
    EXPECT_EQ(sentences, expected);
    EXPECT_EQ(losses[1]["classes"], nlohmann::json({"CIM_Gone", "CIM_Lost"}));
    EXPECT_THAT(ReadFile(fRoot / "vrxhost.log"), HasSubstr("identifier:vrx [normal]"));
    std::string error;
    for (const std::string& sentence : expected) {
        error += "vrxhost: " + sentence + "\n";
    }
    EXPECT_EQ(outcome.fErrorOutput, error);
}

TEST_F(VrxhostProgram, MissingOrForeignPluginFails)
{
    auto command = Command({"inventory"});
    command[4] = "/nonexistent.so";
    auto outcome = Start(command);
    EXPECT_TRUE(HasStatus(outcome, 1));
    EXPECT_THAT(outcome.fErrorOutput, HasSubstr("vrxhost: the plug-in could not be loaded: /nonexistent.so"));
    command[4] = PLUGIN_WITHOUT_ENTRY_POINTS;
    outcome = Start(command);
    EXPECT_TRUE(HasStatus(outcome, 1));
    EXPECT_THAT(outcome.fErrorOutput, HasSubstr("is not a namespace-provider plug-in"));
}

struct TUsageRow
{
    std::vector<std::string> fArguments;
    int fStatus;
    const char* fError;
};

const TUsageRow kUsages[] = {
    {{}, 2, "a command is missing: summary, doctor, inventory"},
    {{"frobnicate"}, 2, "there is no command frobnicate"},
    {{"inventry"}, 2, "there is no command inventry; did you mean inventory?"},
    {{"inventory", "--formt", "json"}, 2, "there is no option --formt; did you mean --format?"},
    {{"inventory", "--format", "htm"}, 2, "--format: there is no format htm; did you mean html?"},
    {{"classes", "Fake_Many"}, 2, "the argument Fake_Many is one too many"},
    {{"instances"}, 2, "CLASS is required"},
    {{"inventory", "--format", "xml"}, 2, "--format"},
    {{"inventory", "--set", "novalue"}, 2, "key=value is expected, not \"novalue\""},
    {{"inventory", "--set", "Pegasus_multithread=on"}, 2, "did you mean pegasus_multi_thread?"},
    {{"inventory", "--set", "pegasus_multi_thread=yes"}, 2, "pegasus_multi_thread is \"yes\"; it can be: on, off"},
    {{"inventory", "--set", "threads=on"}, 2, "there is no setting threads"},
    {{"inventory", "--config", "/nonexistent"}, 2, "/nonexistent"},
    {{"instances", "Fake_None"}, 1, "there is no class Fake_None"},
    {{"class", "Fake_EveryType", "--where", "ID=1"}, 2, "class has no option --where; it belongs to instances"},
    {{"--replay", "", "providers"}, 2, "--replay: a name is expected, not an empty text"},
    {{"record", ""}, 2, "FILE: a name is expected, not an empty text"},
    {{"help", "invok"}, 2, "there is no command invok; did you mean invoke?"},
    {{"instances", "Fake_EveryType", "--where", "Sped=1"}, 1, "has no property Sped; did you mean Speed?"},
    {{"instances", "Fake_EveryType", "--props", "ID,Nmes"}, 1, "has no property Nmes; did you mean Names?"},
    {{"instances", "Fake_EveryType", "--where", "ID"}, 2, "PROPERTY=VALUE is expected, not \"ID\""},
    {{"get", "Fake_Many.Number=1"}, 1, "there is no instance Fake_Many.Number=1"},
    {{"invoke", "Fake_EveryType", "Rest"}, 1, "class Fake_EveryType has no method Rest; did you mean Reset?"},
    {{"invoke", "Fake_EveryType", "Reset", "Port=1"}, 1, "method Reset has no parameter Port; did you mean Ports?"},
    {{"invoke", "Fake_EveryType", "Reset", "Ports=1,70000"}, 1, "parameter Ports: \"70000\" is not a uint16"},
    {{"invoke", "Fake_EveryType", "Reset", "Force=yes"}, 1, "parameter Force: \"yes\" is not a boolean"},
    {{"instances", "fake_evrytype"}, 1, "there is no class fake_evrytype; did you mean Fake_EveryType?"},
};

TEST_F(VrxhostProgram, UsageErrorIsOneSentenceAndADocument)
{
    for (const TUsageRow& row : kUsages) {
        SCOPED_TRACE(row.fError);
        const auto outcome = Run(row.fArguments);
        EXPECT_TRUE(HasStatus(outcome, row.fStatus));
        EXPECT_EQ(outcome.fOutput, "");
        EXPECT_THAT(outcome.fErrorOutput, StartsWith("vrxhost: "));
        EXPECT_THAT(outcome.fErrorOutput, HasSubstr(row.fError));
        auto arguments = row.fArguments;
        arguments.insert(arguments.begin(), {"--format", "json"});
        const auto json = nlohmann::json::parse(Run(arguments).fOutput, nullptr, false);
        ASSERT_TRUE(json.is_object());
        EXPECT_EQ(json["losses"].size(), 1u);
    }
    EXPECT_THAT(Run({"help", "instances"}).fOutput, HasSubstr("--where"));
    for (const auto& arguments : std::vector<std::vector<std::string>>{{"--help"}, {"inventory", "--help"}}) {
        const auto help = Run(arguments);
        EXPECT_TRUE(HasStatus(help, 0));
        EXPECT_THAT(help.fOutput, HasSubstr("Exit status: 0 complete"));
        EXPECT_THAT(help.fOutput, HasSubstr("--consumer"));
    }
}

struct TCommandRow
{
    std::vector<std::string> fArguments;
    const char* fOutput;
};

const TCommandRow kCommands[] = {
    {{"--version"}, "vrxhost 0.1.0\n"},
    {{"classes", "--tree"}, "CIM_Thing\n  Fake_EveryType\nFake_Broken\nFake_Many\n"},
    {{"class", "Fake_EveryType"}, R"(Fake_EveryType : CIM_Thing

  [key] string ID

  uint64 Speed
      unit  Bits per second

  sint8 MixedCase
      counter  yes

  string[] Names

  uint32 Reset(boolean Force, uint16[] Ports)
)"},
    {{"instances", "Fake_Many", "--set", "fake.count=9", "--where", "number=7", "--props", "Number"},
     "Fake_Many: 1 instance\n  #1\n    Number  7\n"},
    {{"instances", "Fake_Many", "--set", "fake.count=5", "--props", "Number"},
     "Fake_Many: 5 instances\n  Number\n  0\n  1\n  2\n  3\n  4\n"},
    {{"instances", "Fake_EveryType", "--raw", "--props", "Speed"},
     "Fake_EveryType: 1 instance\n  #1\n    Speed  18446744073709551615 Bits per second\n"},
    {{"invoke", "Fake_EveryType.ID=\"x\"", "reset", "ports=80,443"}, R"(ReturnValue  80, 443
Ports        80, 443
Target       Fake_EveryType.ID="x" Reset
)"},
    {{"instances", "Fake_EveryType", "--format", "csv", "--stable", "--props", "ID,MixedCase"},
     "provider,class,path,property,type,value,text\n"
     R"(fake,Fake_EveryType,"Fake_EveryType.ID=""one \""two\""\x1b[31m""",ID,string,)"
     R"("one ""two""\x1b[31m","one ""two""\x1b[31m")"
     "\n"},
};

TEST_F(VrxhostProgram, CommandsShowWhatTheyAreAskedFor)
{
    for (const TCommandRow& row : kCommands) {
        const auto outcome = Run(row.fArguments);
        EXPECT_TRUE(HasStatus(outcome, 0));
        EXPECT_EQ(outcome.fOutput, row.fOutput);
    }
}

TEST_F(VrxhostProgram, NdjsonRecordsStandOnTheirOwnAndTheLastOneCountsThem)
{
    std::istringstream lines(Run({"inventory", "--format", "ndjson", "--set", "fake.count=3"}).fOutput);
    std::map<std::string, int> counts;
    nlohmann::json last;
    int number = 0;
    for (std::string line; std::getline(lines, line);) {
        last = nlohmann::json::parse(line);
        ++counts[last["record"]];
        EXPECT_EQ(last["run"].get<std::string>().size(), 36u);
        EXPECT_EQ(last["seq"], ++number);
    }
    EXPECT_EQ(counts, (std::map<std::string, int>{{"class", 3}, {"instance", 4}, {"end", 1}}));
    EXPECT_EQ(last["instances"], 4);
    EXPECT_EQ(last["complete"], true);
}

TEST_F(VrxhostProgram, StableDocumentsOfTwoRunsAreEqual)
{
    for (const std::string format : {"json", "ndjson", "csv", "table"}) {
        const auto run = [&] { return Run({"inventory", "--stable", "--format", format}).fOutput; };
        const std::string first = run();
        EXPECT_EQ(first, run());
        EXPECT_THAT(first, HasSubstr("Speed"));
        EXPECT_THAT(first, Not(HasSubstr("-128"))) << "a counter in " << format;
    }
}

} // namespace
} // namespace vrxhost
