#include "tests/pegasus/server/ReplayFixture.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <regex>
#include <set>

namespace servertest {

namespace {

enum class Body
{
    kSame,
    kOther
};

// An answer of ours that differs from the recorded one because it is better.
struct BetterRow
{
    const char* name;
    const char* ours; // what stands in ours
    Body body;
    const char* reason;
};

const BetterRow kBetter[] = {
    {"http-badxml", "the document ends inside a tag or section", Body::kSame,
     "says that the XML ends early, which is what is wrong with it"},
    {"http-get-root", "404 Not Found", Body::kOther, "404 with a length and without a page"},
    {"http-nocontentlength", "411 Length Required", Body::kSame, "at once, where the recorded server waits for ever"},
    {"cimmof-again-02-SetQualifier", "NAME=SetQualifier", Body::kSame,
     "the declaration is updated; the recorded server refuses and its compiler ignores that"},
    {"cimmof-again-03-SetQualifier", "NAME=SetQualifier", Body::kSame, "likewise"},
    {"cimmof-again-04-SetQualifier", "NAME=SetQualifier", Body::kSame, "likewise"},
    {"enuminst-deep-base", "cimstatuscodedescription: CIM_ERR_FAILED: File \"libNoSuchLibrary.so\"", Body::kSame,
     "the status by its name, and the text encoded: one provider of several failed"},
    {"enuminst-shallow-base", "cimstatuscodedescription: CIM_ERR_FAILED: File \"libNoSuchLibrary.so\"", Body::kSame,
     "likewise"},
    {"invoke-twice", "VALUE: again", Body::kOther, "CMPI keeps one argument of a name, the last"},
    {"invoke-embedded", "EmbeddedObject=instance EMBEDDEDOBJECT=instance NAME=oobj", Body::kOther,
     "CMPI has one type for an instance and an object, and nothing declares which one a parameter is"},
    {"cli-embedded", "INSTANCE CLASSNAME=Test_CLITestEmbedded1\n          PROPERTY", Body::kOther,
     "CMPI's instances have no qualifiers, embedded or not"},
};

} // namespace

void ReplayFixture::SetUp()
{
    if (recordingsFolder().empty()) {
        GTEST_SKIP() << "VRX_VECTORS_DIR is not set";
    }
    fTree.start();
}

void ReplayFixture::expectRecorded(const std::string& name, Order order) const
{
    SCOPED_TRACE(name);
    const HttpAnswer ours = replay(name);
    const HttpAnswer recorded = RecordedExchange(name).answer;
    const BetterRow* row = std::find_if(std::begin(kBetter), std::end(kBetter),
                                        [&](const BetterRow& candidate) { return name == candidate.name; });
    if (row == std::end(kBetter)) {
        EXPECT_EQ(firstDifference(canonical(ours, order), canonical(recorded, order)), "");
        return;
    }
    EXPECT_THAT(canonical(ours, order), testing::HasSubstr(row->ours)) << row->reason;
    EXPECT_NE(canonical(ours, order), canonical(recorded, order)) << "the row is of no use";
    if (row->body == Body::kSame) {
        EXPECT_EQ(firstDifference(canonicalBody(ours.body, order), canonicalBody(recorded.body, order)), "");
    }
}

void ReplayFixture::send(const std::string& method, const std::string& nameSpace, const std::string& parameters) const
{
    const HttpAnswer answer = exchange(fTree.port(), intrinsicRequest(method, nameSpace, parameters));
    EXPECT_EQ(answer.status, 200) << method << header(answer, "pgerrordetail") << parameters.substr(0, 300);
    EXPECT_EQ(answer.trailers.count("cimstatuscode"), 0u)
        << method << " " << answer.trailers.begin()->second << " " << answer.trailers.rbegin()->second;
}

void ReplayFixture::declareUsedQualifiers(const std::string& nameSpace, const std::string& body) const
{
    static const std::regex use(
        "<QUALIFIER NAME=\"(\\w+)\" TYPE=\"(\\w+)\"(?: PROPAGATED=\"true\")?([^>]*)>\n(<VALUE.ARRAY>)?");
    std::set<std::string> declared;
    for (std::sregex_iterator at(body.begin(), body.end(), use), end; at != end; ++at) {
        const std::smatch& match = *at;
        if (declared.insert(match[1]).second) {
            send("SetQualifier", nameSpace,
                 "<IPARAMVALUE NAME=\"QualifierDeclaration\">\n<QUALIFIER.DECLARATION NAME=\"" + match[1].str() +
                     "\" TYPE=\"" + match[2].str() + "\" ISARRAY=\"" + (match[4].matched ? "true" : "false") + "\"" +
                     match[3].str() +
                     ">\n<SCOPE CLASS=\"true\" ASSOCIATION=\"true\" REFERENCE=\"true\" PROPERTY=\"true\" "
                     "METHOD=\"true\" "
                     "PARAMETER=\"true\" INDICATION=\"true\"/>\n</QUALIFIER.DECLARATION>\n</IPARAMVALUE>\n");
        }
    }
}

void ReplayFixture::createNamespace(const std::string& name) const
{
    createInstance(name,
                   "<INSTANCE CLASSNAME=\"__NameSpace\">\n<PROPERTY NAME=\"Name\" TYPE=\"string\">\n<VALUE></VALUE>\n"
                   "</PROPERTY>\n</INSTANCE>\n");
}

void ReplayFixture::createInstance(const std::string& nameSpace, const std::string& instance) const
{
    send("CreateInstance", nameSpace, "<IPARAMVALUE NAME=\"NewInstance\">\n" + instance + "</IPARAMVALUE>\n");
}

void ReplayFixture::createInstances(const std::string& nameSpace, const std::string& recordedAnswer) const
{
    static const std::regex filledIn("<PROPERTY[^>]*PROPAGATED=[^>]*>\n(<VALUE>[^<]*</VALUE>\n)?</PROPERTY[^>]*>\n");
    for (const std::string& instance : elementsOf(RecordedExchange(recordedAnswer).answer.body, "INSTANCE")) {
        createInstance(nameSpace, std::regex_replace(instance, filledIn, ""));
    }
}

void ReplayFixture::createClass(const std::string& nameSpace, const std::string& cimClass) const
{
    send("CreateClass", nameSpace, "<IPARAMVALUE NAME=\"NewClass\">\n" + cimClass + "</IPARAMVALUE>\n");
}

void ReplayFixture::createClasses(const std::string& nameSpace, const std::string& recordedAnswer,
                                  Defaults defaults) const
{
    static const std::regex value("(<PROPERTY[^>]*>\n|</QUALIFIER>\n)(<VALUE>[^<]*</VALUE>\n|<VALUE.ARRAY>\n"
                                  "(?:<VALUE>[^<]*</VALUE>\n)*</VALUE.ARRAY>\n)(?=</PROPERTY)");
    for (const std::string& cimClass : elementsOf(RecordedExchange(recordedAnswer).answer.body, "CLASS")) {
        createClass(nameSpace, defaults == Defaults::kKept ? cimClass : std::regex_replace(cimClass, value, "$1"));
    }
}

void ReplayFixture::createRecordedSchema(Defaults defaults) const
{
    createNamespace("root/cimv2");
    declareQualifiers("root/cimv2");
    for (const char* source : {"getclass-base", "enumclasses", "getclass-localonly"}) {
        createClasses("root/cimv2", source, defaults);
    }
}

void ReplayFixture::declareQualifiers(const std::string& nameSpace) const
{
    for (const std::string& declaration :
         elementsOf(RecordedExchange("enumqualifiers").answer.body, "QUALIFIER.DECLARATION"))
    {
        send("SetQualifier", nameSpace,
             "<IPARAMVALUE NAME=\"QualifierDeclaration\">\n" + declaration + "</IPARAMVALUE>\n");
    }
}

} // namespace servertest
