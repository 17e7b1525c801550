// SPDX-License-Identifier: MIT
// Forms of the document, made of records and of what a class delivers.
#include "host/cli/collect/TCollector.h"
#include "host/cli/formats/HtmlText.h"
#include "host/cli/formats/IFormat.h"
#include "host/cli/model/Printable.h"
#include "host/inmem/TInmemClass.h"
#include "host/inmem/TInmemNamespace.h"

#include <host/TInmemInstance.h>

#include <gmock/gmock.h>

#include <algorithm>
#include <cstring>

#include <malloc.h>

namespace vrxhost {
namespace {

using namespace NKOLVRX20;
using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

TEST(HtmlText, LeavesNoMarkupAndNothingHidden)
{
    const std::vector<std::pair<std::string, std::string>> rows = {
        {"eth0 \xc3\xa9 \xe2\x82\xac \xf0\x9f\x92\xbe \xd7\xa9",
         "eth0 \xc3\xa9 \xe2\x82\xac \xf0\x9f\x92\xbe \xd7\xa9"},
        {"</script><b a='1' c=\"2\">&lt;", "&lt;/script&gt;&lt;b a=&#39;1&#39; c=&quot;2&quot;&gt;&amp;lt;"},
        {std::string("\0\x1b[31m\n\t\x7f", 9), "\\x00\\x1b[31m\\n\\t\\x7f"},
        {"\xe2\x80\xa8\xe2\x80\xae\xe2\x81\xa6\xd8\x9c\xef\xbb\xbf\xc2\x85\xf3\xa0\x81\x81",
         "\\u{2028}\\u{202e}\\u{2066}\\u{61c}\\u{feff}\\u{85}\\u{e0041}"},
        {"\xff\xc0\xbc\xed\xa0\x80\xe2\x82",
         "\\xff\\xc0\\xbc\\xed\\xa0\\x80\\xe2\\x82"}, // overlong "<", surrogate, cut off
    };
    for (const auto& [text, html] : rows) {
        EXPECT_EQ(HtmlText(text), html);
    }
    EXPECT_EQ(HtmlAttribute("id", "\" onclick=\""), " id=\"&quot; onclick=&quot;\"");
    EXPECT_EQ(Printable("\xc2\x9b"
                        "31m <b>"),
              "\\u{9b}31m <b>"); // as one character, a terminal's CSI
}

TPropertyRecord Text(const std::string& name, const std::string& text)
{
    return {name, TCIMValue(text), text};
}

TClassRecord Association(const std::vector<std::pair<std::string, std::string>>& links)
{
    TClassRecord association;
    association.fName = "X_Link";
    association.fIsAssociation = true;
    for (const char* end : {"GroupComponent", "PartComponent"}) {
        TPropertyDeclRecord declaration;
        declaration.fName = end;
        declaration.fType = "reference";
        association.fProperties.push_back(declaration);
    }
    for (const auto& [above, below] : links) {
        association.fInstances.push_back({"", {Text("GroupComponent", above), Text("PartComponent", below)}});
    }
    return association;
}

TEST(HtmlFormat, DevicesAreListsInListsAndLossesNameTheirCause)
{
    TDocument document;
    document.fHead.fHost = {"host<1>", "", "Maker & Co", ""};
    document.fProviders = {
        {"p", "libp", "", {Association({{"A.ID=\"1\"", "B.ID=\"2\""}, {"B.ID=\"2\"", "C.ID=\"<i>\""}})}}};
    TLoss loss = LossOf("class C & D");
    loss.fVendor = "fan";
    loss.fFile = "/v/fan/x.classes.xml";
    loss.fLog = {"<server>"};
    document.fLosses = {loss};
    document.fComplete = false;
    const std::string page = MakeHtmlFormat({}, nullptr)->Finish(document);
    EXPECT_THAT(
        page, HasSubstr("<ul id=\"devices\">\n<li>A 1\n<ul>\n<li>B 2\n<ul>\n<li>C &lt;i&gt;</li>\n</ul>\n</li>\n</ul>\n"
                        "</li>\n</ul>\n"));
    EXPECT_THAT(page, HasSubstr("<h1>host&lt;1&gt;</h1>"));
    EXPECT_THAT(page, HasSubstr("<p class=\"partial\">"));
    EXPECT_THAT(page, HasSubstr("class C &amp; D<br><small>vendor fan, file /v/fan/x.classes.xml</small><br>"
                                "<code>&lt;server&gt;</code></li>"));
}

// What is linked in a circle alone has no root, and what ends in the same words as a linked object is another one.
TEST(TreeFormat, EveryInstanceIsShownOnce)
{
    TDocument document;
    TClassRecord other;
    other.fInstances = {{"ABA.ID=\"1\"", {}}, {"A.ID=\"1\"", {}}};
    document.fProviders = {
        {"p",
         "libp",
         "",
         {other,
          Association({{"A.ID=\"1\"", "B.ID=\"2\""}, {"B.ID=\"2\"", "A.ID=\"1\""}, {"C.ID=\"3\"", "BA.ID=\"1\""}})}}};
    EXPECT_EQ(MakeTreeFormat({})->Finish(document), "C 3\n`-- BA 1\nA 1\n`-- B 2\n    `-- A 1\nABA 1\n");
}

TEST(HtmlFormat, PropertiesThatTheFirstRowsLackHaveAColumn)
{
    std::string page;
    const auto format = MakeHtmlFormat({}, [&page](const std::string& text) { page += text; });
    IInstanceSink* const sink = format->BeginStream({});
    TClassRecord each;
    each.fName = "X_Many";
    sink->BeginClass("p", each);
    for (int i = 0; i < 1000; ++i) {
        sink->Add(each, {"", {Text("Name", "n")}});
    }
    sink->Add(each, {"", {Text("Late", "<late>"), Text("Name", "last")}});
    sink->EndClass(each);
    page += format->Finish({});
    EXPECT_THAT(page, HasSubstr("<th scope=\"col\">Name</th><th scope=\"col\">Other properties</th>"));
    EXPECT_THAT(page, HasSubstr("<tr><th scope=\"row\">last</th><td>Late: &lt;late&gt;</td></tr>"));
}

// Up to 1000 rows are one table with their number above; more go out in tables of so many, with the number below.
TEST(TableFormat, StreamedRowsAppearInTablesOfAThousand)
{
    std::string text;
    const auto format = MakeTableFormat({}, [&text](const std::string& piece) { text += piece; });
    TDocumentHead head;
    head.fCommand = "inventory";
    IInstanceSink* const sink = format->BeginStream(head);
    const auto add = [&](const char* name, int count, bool isPartial) {
        TClassRecord each;
        each.fName = name;
        sink->BeginClass("p", each);
        for (each.fInstanceCount = 0; each.fInstanceCount < static_cast<std::size_t>(count); ++each.fInstanceCount) {
            sink->Add(each, {"", {Text("Name", "n" + std::to_string(each.fInstanceCount))}});
        }
        each.fIsPartial = isPartial;
        sink->EndClass(each);
    };
    TProviderRecord provider;
    provider.fName = "p";
    provider.fModule = "libp";
    sink->BeginProvider(provider, 2);
    add("X_Few", 1, true);
    add("X_Many", 2001, false);
    text += format->Finish({});
    EXPECT_THAT(text, StartsWith("Provider p (libp): 2 classes\n"
                                 "  X_Few: 1 instance, partial: the provider was given up\n    #1\n      Name  n0\n"
                                 "  X_Many: more than 1000 instances\n    Name\n    n0\n"));
    EXPECT_THAT(text, HasSubstr("    n999\n\n    Name\n    n1000\n"));
    EXPECT_THAT(text, EndsWith("    n1999\n\n    Name\n    n2000\n  X_Many: 2001 instances in all\n"));
}

constexpr int kInstances = 20000;

// Delivers instances that exist no longer than their visit, and watches the heap meanwhile.
class TPassingInstances : public TInmemClass
{
  public:
    using TInmemClass::TInmemClass;
    using TInmemClass::operator=;

    void EnumerateInstances(TInstanceVisitor visitor, bool, TCIMContext) override
    {
        for (int i = 0; i < kInstances; ++i) {
            const auto instance = boost::make_shared<TInmemInstance>(shared_from_this(), TCIMContext());
            instance->SetPropertyValue("Number", TCIMValue(i), TCIMContext());
            instance->SetPropertyValue("Text", TCIMValue(std::string(200, 'x')), TCIMContext());
            fKept += fLast.lock() ? 1 : 0;
            fLast = instance;
            visitor(instance);
            Measure(i);
        }
    }

    int fKept = 0; // instances that outlived their visit
    std::size_t fGrowth = 0;

  private:
    void Measure(int i)
    {
        if (i % 2000 != 1999) {
            return;
        }
        const std::size_t used = ::mallinfo2().uordblks;
        fUsed = fUsed == 0 ? used : fUsed;
        fGrowth = std::max(fGrowth, used - std::min(used, fUsed));
    }

    boost::weak_ptr<ICIMInstance> fLast;
    std::size_t fUsed = 0; // after the first 2,000, when buffers have their size
};

// 18,000 instances of 200 bytes and more would take 3.6 MB at least. A tree keeps their names until the end.
TEST(StreamedFormats, MemoryDoesNotGrowWithTheNumberOfInstances)
{
    constexpr std::size_t kMaxGrowth = 1024 * 1024;
    for (const std::string& name : FormatNames()) {
        std::size_t written = 0;
        const auto format = MakeFormat(name, {}, [&written](const std::string& text) { written += text.size(); });
        TInmemNamespace ns;
        TLossLog losses("/");
        TCollector collector(ns, losses, [] { return false; });
        TDocumentHead head;
        head.fCommand = "instances";
        collector.SetSink(format->BeginStream(head), false);
        const auto owner = boost::make_shared<TPassingInstances>("X_Passing");
        TDocument document;
        document.fProviders = {{"", "", "", {collector.ReadClass(*owner, EDetail::kInstances)}}};
        EXPECT_EQ(document.fProviders.front().fClasses.front().fInstanceCount, std::size_t{kInstances});
        EXPECT_EQ(owner->fKept, 0) << name;
        EXPECT_LE(owner->fGrowth, kMaxGrowth) << name;
        const std::string end = format->Finish(document);
        if (name == "tree") {
            EXPECT_EQ(end.size(), kInstances * std::strlen("X_Passing\n"));
        } else {
            EXPECT_GT(written, 4000000u) << name;
            EXPECT_LT(end.size(), 10000u) << name;
        }
    }
}

} // namespace
} // namespace vrxhost
