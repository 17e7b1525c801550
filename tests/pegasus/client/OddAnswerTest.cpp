// SPDX-License-Identifier: MIT
// What other servers write: odd pieces of an answer that cost no object, and those that must never become a value.
#include "pegasus/wire/XmlText.h"
#include "tests/pegasus/client/AnswerReplay.h"

#include <gtest/gtest.h>

namespace {

using namespace std::string_view_literals;

struct OddRow
{
    const char* name;
    std::string_view find; // in kAnswer, at its first place
    std::string_view put;
    std::string_view outcome; // occurs in what was read
};

const std::string kAnswer =
    "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">"
    "<MESSAGE ID=\"1000\" PROTOCOLVERSION=\"1.0\"><SIMPLERSP><IMETHODRESPONSE NAME=\"GetInstance\"><IRETURNVALUE>"
    "<INSTANCE CLASSNAME=\"A\"><PROPERTY NAME=\"S\" TYPE=\"string\"><VALUE>text</VALUE></PROPERTY>"
    "<PROPERTY.ARRAY NAME=\"L\" TYPE=\"string\"><VALUE.ARRAY><VALUE>x</VALUE></VALUE.ARRAY></PROPERTY.ARRAY>"
    "</INSTANCE></IRETURNVALUE></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n<!-- end -->";
constexpr std::string_view kWhole = "<VALUE>text</VALUE>";
constexpr std::string_view kScalar = "TYPE=\"string\"><VALUE>text</VALUE>";
constexpr std::string_view kArray = "TYPE=\"string\"><VALUE.ARRAY><VALUE>x</VALUE>";
constexpr std::string_view kNullInArray = "XmlError: Validation error: on line 2: Expected close of VALUE.ARRAY";

#define MANY "a=\"\" a=\"\" a=\"\" a=\"\" a=\"\" a=\"\" a=\"\" a=\"\" "

const OddRow kRows[] = {
    {"a namespace", "<CIM ", "<CIM xmlns=\"urn:x\" xmlns:a=\"b\" ", kWhole},
    {"attributes of an element without any", "<VALUE>", "<VALUE xml:lang=\"en\" TYPE=\"string\">", kWhole},
    {"an unknown attribute twice", "<INSTANCE ", "<INSTANCE a=\"\" a=\"\" ", kWhole},
    {"an empty class origin", "TYPE", "CLASSORIGIN=\"\" TYPE", kWhole},
    {"an empty embedded instance", kScalar, "TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE> </VALUE>",
     "EMBEDDEDOBJECT=\"instance\">\n</PROPERTY>"},
    {"the method in another case", "GetInstance", "getinstance", kWhole},
    {"raw control characters", "text",
     "a\x01\x1b"
     "b",
     "<VALUE>a&#1;&#27;b</VALUE>"},
    {"zeros and blanks at the end", "</CIM>\n", "</CIM>\n\0\0 "sv, kWhole},
    {"a line before the declaration", "<?xml", "\r\n<?xml", kWhole},
    {"US-ASCII", "utf-8", "US-ASCII", kWhole},
    {"ISO-8859-1", "utf-8", "ISO-8859-1", kWhole},
    {"an error's code with a zero", "<IRETURNVALUE>",
     "<ERROR CODE=\"06\"/></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM><!--", "error 6"},
    {"a raw line end and tab in an attribute", "<IRETURNVALUE>",
     "<ERROR CODE=\"6\" DESCRIPTION=\"a\n\tb\"/></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM><!--", "error 6 a\n\tb"},
    {"char16 0", kScalar, "TYPE=\"char16\"><VALUE>&#0;</VALUE>", "<VALUE>&#0;</VALUE>"},
    {"char16 0 in an array", kArray, "TYPE=\"char16\"><VALUE.ARRAY><VALUE>&#x00;</VALUE>", "<VALUE>&#0;</VALUE>"},

    {"blanks between comments", "text", "te<!-- 1 --> <!-- 2 -->xt", "<VALUE>te xt</VALUE>"},
    {"a section and a reference", "text", " <![CDATA[<a]]>&amp; ", "<VALUE>&lt;a&amp;</VALUE>"},
    {"'<' in an attribute that nobody reads", "<INSTANCE ", "<INSTANCE a=\"<\" ", "'<' in attribute \"a\""},
    {"attributes without a blank between", "TYPE=\"string\"", "a=\"1\"TYPE=\"string\"", "XmlError"},
    {"another end tag", "</VALUE></PROPERTY>", "</VALUE ></PROPERTYX>", "Start-end tags mismatch"},
    {"a second root element", "</CIM>\n", "</CIM><CIM/>", "a second root element"},
    {"character 0 in a string", "text", "a&#0;b", "Not well-formed: on line 2: a bad reference \"&#0\""},
    {"a null among strings", "<VALUE>x</VALUE>", "<VALUE.NULL/>", kNullInArray},
    {"a null among numbers", kArray, "TYPE=\"uint8\"><VALUE.ARRAY><VALUE>1</VALUE><VALUE.NULL/>", kNullInArray},
    {"a null among instances", kArray, "EmbeddedObject=\"instance\" TYPE=\"string\"><VALUE.ARRAY><VALUE.NULL/>",
     kNullInArray},
    {"an empty one among instances", kArray, "EmbeddedObject=\"instance\" TYPE=\"string\"><VALUE.ARRAY><VALUE/>",
     "XmlError"},
    {"more attributes than the limit", "<CIM ", "<CIM " MANY MANY MANY MANY, "more than 32 attributes in CIM element"},
    {"text after the end", "</CIM>\n", "</CIM>x", "XmlError"},
    {"an encoding of two bytes", "utf-8", "utf-16", "unsupported encoding \"utf-16\""},
};

} // namespace

TEST(OddAnswer, IsReadAsItWasMeantOrRefused)
{
    for (const OddRow& row : kRows) {
        std::string body = kAnswer;
        const std::size_t at = body.find(row.find);
        ASSERT_NE(at, std::string::npos) << row.name;
        body.replace(at, row.find.size(), row.put);
        const std::string bytes =
            "HTTP/1.1 200 OK\r\nContent-Length: " + std::to_string(body.size()) + "\r\n\r\n" + body;
        const std::string read = test::readAnswer({row.name, "1000", "GetInstance", true, bytes});
        EXPECT_NE(read.find(row.outcome), std::string::npos) << row.name << ": " << read;
        if (row.outcome == kWhole) {
            // The server reads a request when all of it has come, by the same rules.
            EXPECT_NO_THROW(Pegasus::wire::XmlDocument().parseMessage(body)) << row.name;
        }
    }
}

// Texts are looked through in blocks: each escape at each place of a text that ends within, at and after a block.
TEST(EscapedText, EveryPlaceInABlock)
{
    using Pegasus::wire::appendEscaped;
    using Pegasus::wire::Blanks;
    const std::vector<std::pair<std::string, std::string>> rows = {
        {"&", "&amp;"},  {"<", "&lt;"},     {">", "&gt;"},      {"\"", "&quot;"}, {"'", "&apos;"},
        {"\n", "&#10;"}, {"\x1f", "&#31;"}, {"\x7f", "&#127;"}, {"  ", " &#32;"}, {"\xc3\xa9", "\xc3\xa9"},
    };
    for (const auto& [text, written] : rows) {
        for (std::size_t at = 1; at < 40; ++at) {
            for (const std::size_t after : {1U, 14U, 15U, 16U, 17U}) {
                const std::string whole = std::string(at, 'a') + text + std::string(after, 'b');
                const std::string asIs =
                    std::string(at, 'a') + (text == "  " ? text : written) + std::string(after, 'b');
                std::string out, raw, unicode;
                appendEscaped(out, std::string_view(whole));
                appendEscaped(raw, std::string_view(whole), Blanks::kRaw);
                appendEscaped(unicode, Pegasus::String(whole.c_str()));
                EXPECT_EQ(out, std::string(at, 'a') + written + std::string(after, 'b'));
                EXPECT_EQ(raw, asIs);
                EXPECT_EQ(unicode, out);
            }
        }
    }
    for (std::size_t size = 0; size < 40; ++size) {
        std::string edges;
        appendEscaped(edges, " " + std::string(size, 'a') + " ");
        EXPECT_EQ(edges, "&#32;" + std::string(size, 'a') + "&#32;");
    }
}
