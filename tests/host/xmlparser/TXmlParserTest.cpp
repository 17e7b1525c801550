// SPDX-License-Identifier: MIT
#include <host/TXmlParser.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <stdexcept>

#include <sys/mman.h>
#include <unistd.h>

namespace NKOLVRX20 {
namespace {

using testing::ElementsAre;

// Writes down each callback with the line that it is about.
class TRecordingParser : public TXmlParser
{
  public:
    void StartElement(const char* name, std::map<std::string, std::string>& attributes) override
    {
        std::string text = std::string("<") + name;
        for (const auto& attribute : attributes) {
            text += " " + attribute.first + "=" + attribute.second;
        }
        Record(text + ">");
        if (std::strcmp(name, "throw") == 0) {
            throw std::runtime_error("from a callback");
        }
    }
    void EndElement(const char* name) override { Record(std::string("</") + name + ">"); }
    void processingInstruction(const char* target, const char* data) override
    {
        Record(std::string("?") + target + " " + data);
    }
    void characters(const char* text, unsigned int length) override { Record("'" + std::string(text, length) + "'"); }
    void notationDecl(const char* name, const char* publicId, const char* systemId) override
    {
        Record(std::string("notation ") + name + " " + publicId + " " + systemId);
    }
    void FatalError(const char* message) override { Record(std::string("fatal: ") + message); }

    std::vector<std::string> fEvents;

  private:
    void Record(const std::string& text) { fEvents.push_back(std::to_string(GetCurLine()) + " " + text); }
};

std::vector<std::string> EventsOf(const std::string& text, bool isWellFormed = true)
{
    TRecordingParser parser;
    EXPECT_EQ(parser.Parse(text.data(), text.size()), isWellFormed);
    return parser.fEvents;
}

TEST(TXmlParser, DeliversEveryKindOfCallbackWithItsLine)
{
    EXPECT_THAT(EventsOf("<?xml version='1.0'?>\n"
                         "<!DOCTYPE vrx [<!NOTATION gif PUBLIC 'p' 's'>]>\n"
                         "<vrx><?go on?>\n"
                         "<Class name='A &lt; &#233;' id=\"1\"/>t</vrx>"),
                ElementsAre("2 notation gif p s", "3 <vrx>", "3 ?go on", "3 '\n'", "4 <Class id=1 name=A < \xc3\xa9>",
                            "4 </Class>", "4 't'", "4 </vrx>"));
}

TEST(TXmlParser, ReadsOtherEncodings)
{
    EXPECT_THAT(EventsOf("<?xml version='1.0' encoding='ISO-8859-1'?><a b='\xe9'/>"),
                ElementsAre("1 <a b=\xc3\xa9>", "1 </a>"));
}

TEST(TXmlParser, AcceptsAnUnreadDtdAsLongAsNothingRefersToIt)
{
    EXPECT_THAT(EventsOf("<!DOCTYPE a SYSTEM 'a.dtd' [<!ATTLIST a b CDATA '&lt;'>"
                         "<!ELEMENT a ANY><!-- &x; -->%p;]>"
                         "<!-- &x; --><a c='&amp;&#38;'>&gt;<![CDATA[&x;]]><?p &x;?></a>"),
                ElementsAre("1 <a b=< c=&&>", "1 '>'", "1 '&x;'", "1 ?p &x;", "1 </a>"));
}

struct TBadRow
{
    const char* fName;
    const char* fText;
    std::vector<std::string> fEvents;
};

const TBadRow kBad[] = {
    {"empty", "", {"1 fatal: no element found"}},
    {"not XML", "hello", {"1 fatal: syntax error"}},
    {"ends early", "<a>\n<b", {"1 <a>", "1 '\n'", "2 fatal: unclosed token"}},
    {"wrong end tag", "<a>\n</b>", {"1 <a>", "1 '\n'", "2 fatal: mismatched tag"}},
    {"attribute twice", "<a b='1' b='2'/>", {"1 fatal: duplicate attribute"}},
    {"undefined entity", "<a>&x;</a>", {"1 <a>", "1 fatal: undefined entity"}},
    {"declared entity",
     "<!DOCTYPE a [<!ENTITY x 'y'>]>\n<a>&x;</a>",
     {"1 fatal: entity declarations are not accepted"}},
    {"external entity",
     "<!DOCTYPE a [<!ENTITY x SYSTEM 'file://etc/passwd'>]>\n<a>&x;</a>",
     {"1 fatal: entity declarations are not accepted"}},
    {"entity of an unread DTD",
     "<!DOCTYPE a SYSTEM 'a.dtd'>\n<a>b&x;c</a>",
     {"2 <a>", "2 'b'", "2 fatal: the entity &x; is not known: external DTDs and parameter entities are not read"}},
    {"entity of an unread public DTD",
     "<!DOCTYPE a PUBLIC 'p' 'a.dtd'><a>&x;</a>",
     {"1 <a>", "1 fatal: the entity &x; is not known: external DTDs and parameter entities are not read"}},
    {"entity after an unread parameter entity",
     "<!DOCTYPE a [%p;]><a>&x;</a>",
     {"1 <a>", "1 fatal: the entity &x; is not known: external DTDs and parameter entities are not read"}},
    {"entity of an unread DTD in an attribute",
     "<!DOCTYPE a SYSTEM 'a.dtd'><a><b c='&amp;1&#50;' d='&x;'/></a>",
     {"1 <a>", "1 fatal: the entity &x; is not known: external DTDs and parameter entities are not read"}},
    {"entity of an unread DTD in a default value",
     "<!DOCTYPE a SYSTEM 'a.dtd' [<!ATTLIST a b CDATA 'c&x;'>]><a/>",
     {"1 fatal: the entity &x; is not known: external DTDs and parameter entities are not read"}},
    {"entity of a standalone document",
     "<?xml version='1.0' standalone='yes'?><!DOCTYPE a SYSTEM 'a.dtd'><a b='&x;'/>",
     {"1 fatal: undefined entity"}},
};

TEST(TXmlParser, ReportsWhatIsWrongAndKeepsWhatCameBefore)
{
    for (const TBadRow& row : kBad) {
        SCOPED_TRACE(row.fName);
        EXPECT_EQ(EventsOf(row.fText, false), row.fEvents);
    }
}

std::string Nested(std::size_t depth)
{
    std::string text;
    for (std::size_t i = 0; i < depth; ++i) {
        text += "<a>";
    }
    for (std::size_t i = 0; i < depth; ++i) {
        text += "</a>";
    }
    return text;
}

TEST(TXmlParser, KeepsItsLimits)
{
    EXPECT_EQ(EventsOf(Nested(64)).size(), 128u);
    const auto tooDeep = EventsOf(Nested(65), false);
    EXPECT_EQ(tooDeep.size(), 65u);
    EXPECT_EQ(tooDeep.back(), "1 fatal: elements are nested deeper than 64 levels");
    EXPECT_THAT(EventsOf("<a>" + std::string(16 * 1024 * 1024, ' ') + "</a>", false),
                ElementsAre("1 fatal: the document is larger than 16 MiB"));
}

TEST(TXmlParser, ExceptionOfACallbackEndsTheParseAndLeavesIt)
{
    TRecordingParser parser;
    const std::string text = "<a><throw/><b/></a>";
    EXPECT_THROW(parser.Parse(text.data(), text.size()), std::runtime_error);
    EXPECT_THAT(parser.fEvents, ElementsAre("1 <a>", "1 <throw>"));
}

// The page after the text is unreadable, so one byte too many ends the test.
TEST(TXmlParser, NeverReadsPastTheText)
{
    const std::size_t page = static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
    char* const pages =
        static_cast<char*>(::mmap(nullptr, 2 * page, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0));
    ASSERT_NE(pages, MAP_FAILED);
    ASSERT_EQ(::mprotect(pages + page, page, PROT_NONE), 0);
    const std::string text = "<vrx><class name='A'/><!-- c --><![CDATA[x]]></vrx>";
    for (std::size_t length = 0; length <= text.size(); ++length) {
        char* const begin = pages + page - length;
        std::memcpy(begin, text.data(), length);
        TRecordingParser parser;
        EXPECT_EQ(parser.Parse(begin, length), length == text.size()) << length;
    }
    ::munmap(pages, 2 * page);
}

} // namespace
} // namespace NKOLVRX20
