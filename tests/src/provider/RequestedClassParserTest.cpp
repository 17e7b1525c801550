// SPDX-License-Identifier: MIT
// What is read of a requested-class file, and the exact line that each oddity costs.
#include "src/provider/TPEGASUSRequestedClassParser.h"
#include "tests/src/support/CapturedLog.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

struct TParserRow
{
    const char* fName;
    std::string fText;
    std::vector<std::string> fClasses;
    std::map<std::string, std::string> fInformation;
    std::vector<std::string> fReports; // "line:message"
};

const std::string kRoot = "1:Unrecognized identifier:vrx";

const TParserRow kRows[] = {
    {"only the root", "<vrx></vrx>", {}, {}, {kRoot}},
    {"everything, once each",
     "<vrx>\n<timeout value='30'/>\n<nsp name='root/cimv2'/>\n<module name='acme'/>\n"
     "<functionality diagnosticonly='YES'/>\n<class name='A'/>\n</vrx>",
     {"A"},
     {{"timeout", "30"}, {"nsp", "root/cimv2"}, {"module", "acme"}, {"diagnosticonly", "YES"}},
     {kRoot, "2:Unrecognized identifier", "3:Unrecognized identifier", "4:Unrecognized identifier",
      "5:Unrecognized identifier"}},
    {"order and duplicates kept",
     "<vrx><class name='B[120]%^CDM^%'/><class name='A'/><class name='A'></class></vrx>",
     {"B[120]%^CDM^%", "A", "A"},
     {},
     {kRoot}},
    {"element names in any case",
     "<VRX><CLASS name='A'/><Nsp name='n'/></VRX>",
     {"A"},
     {{"nsp", "n"}},
     {kRoot, "1:Unrecognized identifier"}},
    {"attribute names as written",
     "<vrx>\n<CLASS NAME='A'/></vrx>",
     {},
     {},
     {kRoot, "2:Unrecognized Attribute:NAME", "2:No Name Specified for Counter identifier"}},
    {"an attribute that sorts before",
     "<vrx><class name='A' id='1'/></vrx>",
     {"A"},
     {},
     {kRoot, "1:Unrecognized Attribute:id"}},
    {"an attribute that sorts after", "<vrx><class zeta='1' name='A'/></vrx>", {"A"}, {}, {kRoot}},
    {"the later value wins",
     "<vrx><nsp name='a'/><nsp name='b'/></vrx>",
     {},
     {{"nsp", "b"}},
     {kRoot, "1:Unrecognized identifier", "1:Unrecognized identifier"}},
    {"no attribute at all",
     "<vrx>\n<timeout/>\n<nsp/>\n<module/>\n<functionality/>\n<class/></vrx>",
     {},
     {},
     {kRoot, "2:No Version Specified for value identifier", "2:Unrecognized identifier",
      "3:No Name Specified for name identifier", "3:Unrecognized identifier", "4:No Name Specified for name identifier",
      "4:Unrecognized identifier", "5:No Name Specified for diagnosticonly identifier", "5:Unrecognized identifier",
      "6:No Name Specified for Counter identifier"}},
    {"only foreign attributes",
     "<vrx><timeout a='1' b='2'/></vrx>",
     {},
     {},
     {kRoot, "1:Unrecognized Attribute:a", "1:Unrecognized Attribute:b", "1:No Version Specified for value identifier",
      "1:Unrecognized identifier"}},
    {"an unknown element",
     "<vrx>\n\n<Counter name='A'>x</Counter><class name='A'/></vrx>",
     {"A"},
     {},
     {kRoot, "3:Unrecognized identifier:counter", "3:Unrecognized identifier"}},
    {"text, comments, instructions and notations are passed over",
     "<!DOCTYPE vrx [<!NOTATION gif SYSTEM 'x'>]><vrx>text<?pi data?><!-- c --><class name='A'/></vrx>",
     {"A"},
     {},
     {kRoot}},
    {"values as written", "<vrx><class name=' A&amp;&#x41; '/></vrx>", {" A&A "}, {}, {kRoot}},
};

TEST(RequestedClassParserTest, ReadsWhatItKnowsAndReportsTheRest)
{
    for (const TParserRow& row : kRows) {
        SCOPED_TRACE(row.fName);
        TCapturedLog log;
        TPEGASUSRequestedClassParser parser;
        parser.Parse(row.fText.data(), row.fText.size());
        EXPECT_EQ(row.fClasses, parser.GetRequestedClassData());
        EXPECT_EQ(row.fInformation, parser.GetRequestedProInfoData());
        std::vector<std::string> lines;
        for (const std::string& report : row.fReports) {
            lines.push_back("0|Performance Data RDD Parser line " + report);
        }
        EXPECT_EQ(lines, log.Lines());
    }
}

TEST(RequestedClassParserTest, WritesDebugOutputAtTheGivenSeverity)
{
    TCapturedLog log;
    TPEGASUSRequestedClassParser parser;
    const std::string text = "<vrx/>";
    parser.Parse(text.data(), text.size());
    log.Take();
    parser.DebugOutput(ILogger::kInfo, "noted");
    EXPECT_THAT(log.Lines(), ::testing::ElementsAre("3|Performance Data RDD Parser line 1:noted"));
}

} // namespace
} // namespace NKOLVRX20
