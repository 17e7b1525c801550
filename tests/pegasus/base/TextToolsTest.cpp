// SPDX-License-Identifier: MIT
// Case, UTF-8, percent-coding and the texts of CIM objects: tables of bytes.
#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"
#include "pegasus/base/PercentCoding.h"
#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

#include <clocale>

namespace Pegasus::base {
namespace {

using namespace std::string_literals;

const std::string kReplacement = "\xEF\xBF\xBD";

TEST(AsciiCaseTest, OnlyTheLettersOfAsciiHaveACase)
{
    std::setlocale(LC_ALL, "tr_TR.UTF-8"); // where it is installed, I and i are two letters
    struct Row
    {
        const char* name;
        std::string text, folded;
    };
    const std::vector<Row> rows = {
        {"letters", "CIM_LogicalDisk", "cim_logicaldisk"},
        {"edges of the alphabet", "@AZ[`az{", "@az[`az{"},
        {"I of other locales", "INSTANCEid", "instanceid"},
        {"bytes above 0x7F", "\xC3\x84\xE9", "\xC3\x84\xE9"},
        {"zero byte", "A\0B"s, "a\0b"s},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(foldCase(row.text), row.folded) << row.name;
        EXPECT_TRUE(equalNoCase(row.text, row.folded)) << row.name;
        EXPECT_FALSE(equalNoCase(row.text, row.folded + "x")) << row.name;
        EXPECT_TRUE(startsWithNoCase(row.folded + "x", row.text)) << row.name;
        EXPECT_FALSE(startsWithNoCase(row.text, row.folded + "x")) << row.name;
    }
    EXPECT_FALSE(equalNoCase("@", "`")) << "32 apart, as the letters are";
    std::setlocale(LC_ALL, "C");
}

struct Utf8Row
{
    const char* name;
    std::string bytes;
    bool isValid;
    bool isDecoded; // a lone surrogate is not UTF-8, but a text may hold it
    std::string repaired;
};

const std::vector<Utf8Row> kUtf8Rows = {
    {"ASCII", "plain", true, true, "plain"},
    {"two, three, four bytes", "\u00E9\u540D\U0001F600", true, true, "\u00E9\u540D\U0001F600"},
    {"first and last of each length", "\x7F\u0080\u07FF\u0800\uFFFF\U00010000\U0010FFFF", true, true,
     "\x7F\u0080\u07FF\u0800\uFFFF\U00010000\U0010FFFF"},
    {"around the surrogates", "\xED\x9F\xBF\xEE\x80\x80", true, true, "\xED\x9F\xBF\xEE\x80\x80"},
    {"zero byte", "a\0b"s, true, true, "a\0b"s},
    {"continuation alone", "a\x80z", false, false, "a" + kReplacement + "z"},
    {"overlong, two bytes", "\xC1\xBF", false, false, kReplacement + kReplacement},
    {"overlong, three bytes", "\xE0\x9F\xBF", false, false, kReplacement + kReplacement + kReplacement},
    {"overlong, four bytes", "\xF0\x8F\xBF\xBF", false, false,
     kReplacement + kReplacement + kReplacement + kReplacement},
    {"above U+10FFFF", "\xF4\x90\x80\x80", false, false, kReplacement + kReplacement + kReplacement + kReplacement},
    {"surrogate", "\xED\xA0\x80", false, true, kReplacement + kReplacement + kReplacement},
    {"cut", "\xE2\x82", false, false, kReplacement + kReplacement},
    {"cut by ASCII", "\xE2\x82z", false, false, kReplacement + kReplacement + "z"},
    {"Latin-1", "caf\xE9 au lait", false, false, "caf" + kReplacement + " au lait"},
    {"byte that never occurs", "\xFF", false, false, kReplacement},
};

TEST(Utf8Test, EveryReaderTakesTheSameTextForValid)
{
    for (const Utf8Row& row : kUtf8Rows) {
        for (std::size_t shift = 0; shift <= 8; ++shift) { // eight ASCII bytes are read at once
            SCOPED_TRACE(std::string(row.name) + " after " + std::to_string(shift));
            const std::string before(shift, 'x');
            EXPECT_EQ(isUtf8(before + row.bytes + before), row.isValid);
            EXPECT_EQ(repairedUtf8(before + row.bytes), before + row.repaired);
            if (row.isDecoded) {
                const String text = fromUtf8(before + row.bytes);
                EXPECT_EQ(utf8(text), before + row.bytes);
                EXPECT_EQ(utf8(fromUtf8Repaired(before + row.bytes)), before + row.bytes);
            } else {
                EXPECT_THROW(fromUtf8(before + row.bytes), Exception);
                EXPECT_EQ(utf8(fromUtf8Repaired(before + row.bytes)), before + row.repaired);
            }
        }
    }
}

TEST(Utf8Test, EveryCodePointComesBack)
{
    for (std::uint32_t code = 0; code <= 0x10FFFF; code += code < 0x11000 ? 1 : 0x3FF) {
        std::string bytes;
        appendUtf8(bytes, code);
        const bool isSurrogate = code >= 0xD800 && code <= 0xDFFF;
        ASSERT_EQ(isUtf8(bytes), !isSurrogate) << code;
        ASSERT_EQ(utf8(fromUtf8(bytes)), bytes) << code;
    }
}

TEST(TextTest, NamesAndNullNames)
{
    EXPECT_EQ(utf8(CIMName("CIM_Fan")), "CIM_Fan");
    EXPECT_EQ(utf8(CIMName()), "");
    EXPECT_EQ(utf8(CIMNamespaceName("root/cimv2")), "root/cimv2");
    EXPECT_EQ(utf8(CIMNamespaceName()), "");
    EXPECT_EQ(fromUtf8(std::string_view()).size(), 0u);
}

TEST(PercentCodingTest, BothSets)
{
    struct Row
    {
        const char* name;
        std::string text, strict, unreserved;
    };
    const std::vector<Row> rows = {
        {"letters and digits", "azAZ09", "azAZ09", "azAZ09"},
        {"marks of both", "-_.", "-_.", "-_."},
        {"marks of the larger set", "!~*'()", "%21%7E%2A%27%28%29", "!~*'()"},
        {"path", "root/cimv2:A.k=\"v\"", "root%2Fcimv2%3AA.k%3D%22v%22", "root%2Fcimv2%3AA.k%3D%22v%22"},
        {"the escape itself", "100%", "100%25", "100%25"},
        {"UTF-8", "\u00E9", "%C3%A9", "%C3%A9"},
        {"zero and line ends", "\0\r\n"s, "%00%0D%0A", "%00%0D%0A"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(percentEncoded(row.text, PercentSet::kStrict), row.strict) << row.name;
        EXPECT_EQ(percentEncoded(row.text, PercentSet::kUnreserved), row.unreserved) << row.name;
        EXPECT_EQ(percentDecoded(row.strict), row.text) << row.name;
        EXPECT_EQ(percentDecoded(row.unreserved), row.text) << row.name;
    }
}

TEST(PercentCodingTest, WhatIsNotAnEscapeStays)
{
    const std::vector<std::pair<std::string, std::string>> rows = {
        {"%", "%"}, {"%4", "%4"}, {"a%4", "a%4"}, {"%zz%41", "%zzA"}, {"%4g", "%4g"}, {"%%41", "%A"}, {"%2f%2F", "//"},
    };
    for (const auto& [encoded, text] : rows) {
        EXPECT_EQ(percentDecoded(encoded), text) << encoded;
    }
}

TEST(NumberTextTest, HexadecimalDigits)
{
    const std::string digits = "0123456789abcdef";
    for (int c = 0; c < 256; ++c) {
        const std::size_t at = digits.find(lowerAscii(static_cast<char>(c)));
        EXPECT_EQ(hexDigitValue(static_cast<char>(c)), at == std::string::npos ? -1 : static_cast<int>(at)) << c;
    }
}

TEST(NumberTextTest, RealsOutsideTheTypeAreTooSmallOrTooBig)
{
    const std::string zeros(400, '0');
    const std::pair<std::string, std::optional<Real64>> rows[] = {
        {"1.0e-400", 0.0},
        {"-1.0E-400", 0.0},
        {"0." + zeros + "1", 0.0},
        {"0." + zeros + "1e+5", 0.0},
        {"0." + zeros + "1e399", 0.01},
        {"1.0e-99999999999999999999", 0.0},
        {"1.0e400", std::nullopt},
        {"1" + zeros + ".0", std::nullopt},
        {"1" + zeros + ".0e-5", std::nullopt},
        {"-1" + zeros + ".0e-399", -10.0},
        {"0.01e+99999999999999999999", std::nullopt},
    };
    for (const auto& [text, value] : rows) {
        EXPECT_EQ(parseReal64(text), value) << text;
    }
    EXPECT_EQ(parseReal32("1.0e-50"), 0.0F);
    EXPECT_EQ(parseReal32("1.0e50"), std::nullopt);
}

} // namespace
} // namespace Pegasus::base
