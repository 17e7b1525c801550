// SPDX-License-Identifier: MIT
// Records: what comes out of one is what went in, a damaged one is refused, and two are compared.
#include "host/cli/record/RecordForm.h"
#include "host/cli/record/TRecordReader.h"
#include "tests/host/cli/VrxhostProgram.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include <cmath>
#include <limits>

namespace vrxhost {
namespace {

using NKOLVRX20::TCIMValue;
using testing::HasSubstr;
using TType = TCIMValue::TCIMType;

const TCIMValue kValues[] = {
    {},
    {true},
    {std::numeric_limits<unsigned long>::max()},
    {std::numeric_limits<long>::min()},
    {static_cast<signed char>(-128)},
    {0.1f},
    {5e-324},
    {std::nan("")},
    {-std::numeric_limits<double>::infinity()},
    {NKOLVRX20::TCIMChar16(0xd800)},
    {NKOLVRX20::TCIMDateTime("00000003040506.******:000")},
    {""},
    {"\\N"},
    {std::string("a\tb\nc\r\\x41\0\x7f\xff\xe2\x82\xac", 16)},
    {TType(TType::kString), 0},
    {TType(TType::kReference), 0},
    {TType(TType::kUint8Array), 0},
    {TType::kString, 0, {TCIMValue(""), TCIMValue("\t"), TCIMValue(TType(TType::kString), 0)}},
    {TType::kUint8, 0, std::vector<TCIMValue>(300, TCIMValue(static_cast<unsigned char>(255)))},
};

TEST(RecordForm, EveryValueComesBackAsItWas)
{
    for (const TCIMValue& value : kValues) {
        const std::string text = RecordValue(value);
        TRecordFields fields(text);
        const TCIMValue read = fields.NextValue();
        EXPECT_EQ(read, value) << text;
        EXPECT_EQ(read.GetType(), value.GetType()) << text;
        EXPECT_FALSE(fields.HasMore());
        EXPECT_EQ(text.find('\n'), std::string::npos);
    }
}

// The lines with the sums that belong to them.
std::string Sealed(const std::string& body)
{
    TRecordSum sum;
    const std::string lines = "vrxhost record\t1\n" + body + "end\tcomplete\tthen\t";
    sum.Add(lines);
    return lines + sum.GetText() + "\n";
}

std::string Refusal(const std::string& record)
{
    std::istringstream file(record);
    try {
        ReadRecord(file, "F");
        return "";
    } catch (const TRecordError& e) {
        return e.what();
    }
}

struct TRefusalRow
{
    std::string fRecord;
    const char* fSentence;
};

const TRefusalRow kRefusals[] = {
    {"", "F is not a record of vrxhost"},
    {"PK\n", "F:1: this is not a record of vrxhost"},
    {"vrxhost record\t2\n", "F:1: the record has version 2; this program reads version 1"},
    {"vrxhost record\t1\nclass\tA\t\n", "F:2: the record is cut: it ends after this line"},
    {Sealed("") + "log\tx\n", "F:3: a line stands after the end"},
    {Sealed("clas\tA\t\n"), "F:2: a line begins with an unknown word"},
    {Sealed("class\tA\tB\n"), "F:2: the superclass B is not declared above"},
    {Sealed("class\tA\t\nclass\ta\t\n"), "F:3: class a is declared twice"},
    {Sealed("class\tA\t\nproperty\tP\tuint7\n"), "F:3: \"uint7\" is not a type"},
    {Sealed("property\tP\tuint8\n"), "F:2: no class stands above"},
    {Sealed("class\tA\t\nproperty\tP\tuint8\tkey\tx\n"), "F:3: a line has more fields than it may have"},
    {Sealed("class\tA\t\nqualifier\tQ\tuint8\t300\n"), "F:3: \"300\" is not a value of type uint8"},
    {Sealed("class\tA\t\nqualifier\tQ\tstring\t\\q\n"), "F:3: an unknown escape stands after a backslash"},
    {Sealed("class\tA\t\nprovider\tp\t\t\nserves\tA\ninstance\tA\nserved\t2\t0\n"),
     "F:6: the class had 2 instances, and 1 stand above"},
    {Sealed("class\tA\t\nprovider\tp\t\t\nserves\tA\n"), "F:5: the instances of class A are not closed"},
    {"vrxhost record\t1\nlog\tx\nsum\t0\n", "F:3: the record is damaged between the lines 1 and 3: their sum differs"},
};

TEST(RecordReader, OddRecordsAreRefusedWithTheLine)
{
    for (const TRefusalRow& row : kRefusals) {
        EXPECT_EQ(Refusal(row.fRecord), row.fSentence);
    }
    EXPECT_EQ(Refusal("vrxhost record\t1\n" + std::string(kMaxRecordLineBytes + 1, 'x')),
              "F:2: the line is longer than 16 MiB");
    std::string chain = "class\tC0\t\n";
    for (int i = 1; i <= kMaxRecordedSuperclasses + 1; ++i) {
        chain += "class\tC" + std::to_string(i) + "\tC" + std::to_string(i - 1) + "\n";
    }
    EXPECT_THAT(Refusal(Sealed(chain)), HasSubstr("a class has more than 128 superclasses"));
}

class Record : public VrxhostProgram
{
  protected:
    std::string Make(const std::string& name, const std::string& fault = "", const std::string& count = "0") const
    {
        const std::string path = fFolder / name;
        Run({"record", path, "--set", "fake.count=" + count}, fault);
        return path;
    }

    // A command without a tree, as an ordinary user has it.
    static std::vector<std::string> Replay(const std::string& record, const std::vector<std::string>& arguments)
    {
        std::vector<std::string> command = {VRXHOST, "--replay", record};
        command.insert(command.end(), arguments.begin(), arguments.end());
        return command;
    }

    // The record with one text replaced, and right sums.
    void Change(const std::string& record, const std::string& text, const std::string& replacement) const
    {
        std::string lines = ReadFile(record);
        const std::size_t at = lines.find(text);
        ASSERT_NE(at, std::string::npos) << text << " is not in\n" << lines;
        lines.replace(at, text.size(), replacement);
        lines.erase(0, lines.find('\n') + 1);
        std::ofstream(record) << Sealed(lines.substr(0, lines.rfind("\nend\t") + 1));
    }
};

const std::vector<std::string> kReplayed[] = {
    {"inventory", "--stable", "--format", "json"},
    {"inventory", "--stable", "--format", "ndjson"},
    {"inventory"},
    {"inventory", "--format", "csv"},
    {"classes", "--format", "json", "--stable"},
    {"classes", "--tree"},
    {"class", "Fake_EveryType"},
    {"providers"},
    {"summary"},
    {"instances", "Fake_Many", "--where", "Number=2"},
    {"get", "Fake_EveryType.ID=\"one \\\"two\\\"\x1b[31m\""},
    {"instances", "Fake_None"},
};

TEST_F(Record, EveryCommandShowsOfARecordWhatItShowsOfTheMachine)
{
    const std::string record = Make("record", "", "3");
    EXPECT_EQ(fs::status(record).permissions(), fs::perms(0600));
    EXPECT_EQ(std::distance(fs::directory_iterator(fFolder), {}), 2) << "a temporary file is left";
    for (std::vector<std::string> arguments : kReplayed) {
        SCOPED_TRACE(arguments.front());
        const auto replayed = Start(Replay(record, arguments));
        arguments.insert(arguments.end(), {"--set", "fake.count=3"});
        const auto live = Run(arguments);
        EXPECT_EQ(replayed.fStatus, live.fStatus);
        EXPECT_EQ(replayed.fOutput, live.fOutput);
        EXPECT_EQ(replayed.fErrorOutput, live.fErrorOutput);
    }
    const auto shown = Start(Replay(record, {"providers", "-v"}));
    EXPECT_THAT(shown.fErrorOutput, HasSubstr("consumer vrxhost-")) << "the log";
    for (const std::vector<std::string>& refused :
         {std::vector<std::string>{"invoke", "Fake_EveryType", "Reset"}, {"record", "other"}})
    {
        const auto outcome = Start(Replay(record, refused));
        EXPECT_TRUE(HasStatus(outcome, 2));
        EXPECT_THAT(outcome.fErrorOutput, HasSubstr(refused.front() + " needs the machine itself: a record "));
    }
    EXPECT_TRUE(HasStatus(Start(Replay(record, {"providers", "--set", "threads=on"})), 2)) << "a mistake all the same";
}

TEST_F(Record, DocumentThatCannotBeWrittenIsOneSentence)
{
    const std::string replay = "ulimit -f 1; exec \"$0\" --replay '" + Make("record") + "' ";
    const std::pair<std::string, std::string> rows[] = {
        {"inventory >/dev/full", "the document could not be written: No space left on device"},
        {"inventory >&-", "the document could not be written: Bad file descriptor"}, // not into a file of the run
        {"--format json inventory >" + (fFolder / "out").string(), "the document could not be written: File too large"},
        {"--help >/dev/full", "standard output could not be written"},
    };
    for (const auto& [arguments, sentence] : rows) {
        SCOPED_TRACE(arguments);
        const auto outcome = Start({"/bin/sh", "-c", replay + arguments, VRXHOST});
        EXPECT_TRUE(HasStatus(outcome, 1));
        EXPECT_EQ(outcome.fErrorOutput, "vrxhost: " + sentence + "\n");
    }
}

TEST_F(Record, LossesAndInterruptionsAreRecorded)
{
    const std::string lossy = Make("lossy", "losses");
    const auto live = Run({"inventory"}, "losses");
    const auto replayed = Start(Replay(lossy, {"inventory"}));
    EXPECT_TRUE(HasStatus(replayed, 3));
    EXPECT_EQ(replayed.fErrorOutput, live.fErrorOutput);
    EXPECT_EQ(replayed.fOutput, live.fOutput);
    Change(lossy, "served\t1\t", "served\t1\t7654");
    const auto doctor = Start(Replay(lossy, {"doctor"}));
    EXPECT_THAT(doctor.fOutput, HasSubstr(" ms (Fake_EveryType 7654")) << "the time of the machine";
    EXPECT_THAT(doctor.fOutput, HasSubstr("correct the file at that line and column")) << "the kind of the loss";
    const auto stopped = Start(Replay(Make("stopped", "interrupt-enumeration"), {"providers"}));
    EXPECT_TRUE(HasStatus(stopped, 3));
    EXPECT_EQ(stopped.fErrorOutput, "vrxhost: interrupted\n");
    EXPECT_TRUE(HasStatus(Run({"record", fFolder / "none/record"}), 1));
    EXPECT_THAT(Run({"record", fFolder}).fErrorOutput, HasSubstr("could not be written: Is a directory"));
}

// Whatever byte is lost or changed, the record is refused.
TEST_F(Record, DamageIsFound)
{
    const std::string record = ReadFile(Make("record"));
    for (std::size_t at = 0; at < record.size(); at += 7) {
        std::string damaged = record;
        damaged[at] = static_cast<char>(damaged[at] ^ 1);
        EXPECT_NE(Refusal(damaged), "") << "byte " << at;
        EXPECT_NE(Refusal(record.substr(0, at)), "") << "cut at " << at;
    }
    EXPECT_EQ(Refusal(record), "");
}

TEST_F(Record, DifferencesByClassKeyAndProperty)
{
    const std::string a = Make("a", "", "2"), b = Make("b", "", "1");
    const auto same = Start({VRXHOST, "diff", a, a});
    EXPECT_TRUE(HasStatus(same, 0));
    EXPECT_EQ(same.fOutput, "no difference\n");
    Change(b, "value\tSpeed\tuint64\t18446744073709551615", "value\tSpeed\tuint64\t1000000000");
    Change(b, "value\tMixedCase\tsint8\t-128", "value\tMixedCase\tsint8\t1"); // a counter
    Change(b, "value\tBoolean\tboolean\ttrue\n", "");
    const auto outcome = Start({VRXHOST, "diff", a, b});
    EXPECT_TRUE(HasStatus(outcome, 4));
    EXPECT_EQ(outcome.fOutput, R"(Fake_EveryType
  changed  Fake_EveryType.ID="one \"two\"\x1b[31m"
    Boolean  true -> null
    Speed  18.4 Ebit/s -> 1 Gbit/s

Fake_Many
  removed  Fake_Many #2
)");
    const auto json = nlohmann::json::parse(Start({VRXHOST, "diff", b, a, "--format", "json"}).fOutput)["compared"];
    EXPECT_EQ(json["differences"][1].dump(),
              R"({"class":"Fake_EveryType","from":{"text":"1000000000 Bits per second","value":1000000000},)"
              R"("kind":"changed","path":"Fake_EveryType.ID=\"one \\\"two\\\"\u001b[31m\"","property":"Speed",)"
              R"("to":{"text":"18446744073709551615 Bits per second","value":18446744073709551615},)"
              R"("units":"Bits per second"})");
    EXPECT_EQ(json["differences"][2].dump(), R"({"class":"Fake_Many","kind":"added","path":"Fake_Many #2"})");
    const auto csv = Start({VRXHOST, "diff", a, b, "--format", "csv"});
    EXPECT_TRUE(HasStatus(csv, 4));
    EXPECT_EQ(csv.fOutput, R"(class,path,property,kind,from,to,reason
Fake_EveryType,"Fake_EveryType.ID=""one \""two\""\x1b[31m""",Boolean,changed,true,,
Fake_EveryType,"Fake_EveryType.ID=""one \""two\""\x1b[31m""",Speed,changed,18446744073709551615,1000000000,
Fake_Many,Fake_Many #2,,removed,,,
)");
    std::istringstream lines(Start({VRXHOST, "diff", b, a, "--format", "ndjson"}).fOutput);
    std::vector<nlohmann::json> records;
    for (std::string line; std::getline(lines, line);) {
        records.push_back(nlohmann::json::parse(line));
    }
    ASSERT_EQ(records.size(), 4U) << "the differences and the end";
    EXPECT_EQ(records[1]["difference"], json["differences"][1]);
    EXPECT_EQ(records[3]["compared"].dump(), nlohmann::json({{"from", b}, {"to", a}}).dump());
    EXPECT_EQ(records[3]["differences"], 3);
    const auto live = Run({"diff", a, "--set", "fake.count=2"});
    EXPECT_TRUE(HasStatus(live, 0));
}

// What a loss may have cost is not called removed.
TEST_F(Record, WhatWasNotCompleteIsUnknown)
{
    const std::string a = Make("a", "", "2"), b = Make("b");
    const std::string lost = "class\tFake_Many\n";
    Change(b, "log\t", "loss\t\tlate\t\t\t\t\nabout\t" + lost + "log\t");
    const auto outcome = Start({VRXHOST, "diff", a, b});
    EXPECT_TRUE(HasStatus(outcome, 3)) << "nothing is certain to differ";
    EXPECT_EQ(outcome.fOutput, "Fake_Many\n  unknown  Fake_Many was not complete in " + b + "\n");
    EXPECT_EQ(outcome.fErrorOutput, "vrxhost: late\n");
    Change(b, "about\t" + lost, "");
    EXPECT_EQ(Start({VRXHOST, "diff", a, b}).fOutput, "Fake_Many\n  unknown  " + b + " was not complete\n");
    for (const std::vector<std::string>& wrong :
         {std::vector<std::string>{VRXHOST, "diff", a, b, "--replay", a}, {VRXHOST, "diff", a, b, "--format", "tree"}})
    {
        EXPECT_TRUE(HasStatus(Start(wrong), 2));
    }
}

} // namespace
} // namespace vrxhost
