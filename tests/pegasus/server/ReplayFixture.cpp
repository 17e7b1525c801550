// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/ReplayFixture.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/PercentCoding.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cstdio>
#include <regex>

namespace servertest {

using Pegasus::base::foldCase;

namespace {

enum class Body
{
    kSame,
    kOther
};

// An answer of ours that differs from the recorded one because it is better. A
// row is for a method (empty: any), and for a part of the recorded note,
// request or status.
struct BetterRow
{
    const char* method;
    const char* about;
    const char* ours; // what stands in ours
    Body body;
    const char* reason;
};

const BetterRow kBetter[] = {
    {"", "Body not well formed", "the document ends inside a tag or section", Body::kSame,
     "says that the XML ends early, which is what is wrong with it"},
    {"", "GET / (no CIM)", "404 Not Found", Body::kOther, "404 with a length and without a page"},
    {"", "POST without Content-Length", "411 Length Required", Body::kSame,
     "at once, where the recorded server waits for ever"},
    {"SetQualifier", "CIMStatusCode", "NAME=SetQualifier", Body::kSame,
     "the declaration is updated; the recorded server refuses and its compiler "
     "ignores that"},
    {"EnumerateInstances", "CIMStatusCodeDescription: File \"libNoSuchLibrary.so\"",
     "cimstatuscodedescription: CIM_ERR_FAILED: File \"libNoSuchLibrary.so\"", Body::kSame,
     "the status by its name, and the text encoded: one provider of several "
     "failed"},
    {"EnumerateInstances", "CIMStatusCodeDescription: lab failure",
     "cimstatuscodedescription: CIM_ERR_FAILED: File \"libNoSuchLibrary.so\"", Body::kSame, "likewise"},
    {"InOut", "sent twice", "VALUE: again", Body::kOther, "CMPI keeps one argument of a name, the last"},
    {"InOut", "sent as a reference value", "LOCALNAMESPACEPATH", Body::kOther,
     "a CMPI provider gets a reference with the request's namespace, and gives it back so"},
    {"EmbIn", "embedded instance", "EmbeddedObject=instance EMBEDDEDOBJECT=instance NAME=oobj", Body::kOther,
     "CMPI has one type for an instance and an object, and nothing declares "
     "which one a parameter is"},
    {"EnumerateInstances", "<CLASSNAME NAME=\"Test_CLITestEmbeddedClass\"",
     "INSTANCE CLASSNAME=Test_CLITestEmbedded1\n          PROPERTY", Body::kOther,
     "CMPI's instances have no qualifiers, embedded or not"},
};

const BetterRow* betterRow(const RecordedExchange& recorded)
{
    std::string about = recorded.note + recorded.request;
    if (recorded.answer.trailers.count("cimstatuscode") != 0) {
        about += "\nCIMStatusCode\nCIMStatusCodeDescription: " +
                 Pegasus::base::percentDecoded(recorded.answer.trailers.at("cimstatuscodedescription"));
    }
    const auto* row = std::find_if(std::begin(kBetter), std::end(kBetter), [&](const BetterRow& each) {
        return (*each.method == '\0' || recorded.method == each.method) && about.find(each.about) != std::string::npos;
    });
    return row == std::end(kBetter) ? nullptr : row;
}

// What became of each recording; printed at the end of the program.
class Tally : public testing::Environment
{
  public:
    void TearDown() override
    {
        if (fOutcomes.empty() && fReasons.empty()) {
            return;
        }
        std::size_t same = 0;
        std::size_t better = 0;
        for (const auto& [name, isBetter] : fOutcomes) {
            ++(isBetter ? better : same);
        }
        const std::size_t rest = recordings().size() - fOutcomes.size();
        std::printf("counted: of %zu recorded requests %zu get the recorded answer "
                    "and %zu a listed better one; %zu are "
                    "not evaluated\n",
                    recordings().size(), same, better, rest);
        for (const RecordedExchange& each : recordings()) {
            if (fOutcomes.count(each.name) == 0) {
                const auto reason = fReasons.find(each.name);
                std::printf("not evaluated: %s, %s: %s\n", each.name.c_str(), each.method.c_str(),
                            reason == fReasons.end() ? "no test is for it" : reason->second.c_str());
            }
        }
    }

    std::map<std::string, bool> fOutcomes; // name to whether ours is the better one
    std::map<std::string, std::string> fReasons;
};

Tally& tally()
{
    static Tally* const kTally = dynamic_cast<Tally*>(testing::AddGlobalTestEnvironment(new Tally));
    return *kTally;
}

// The environment has to be there before the first test runs.
[[maybe_unused]] const Tally& kRegistered = tally();

// The text of a CLASS element shows the class's own elements only, as a creator
// has to give them.
bool isLocal(const RecordedExchange& recorded, const std::string& cimClass)
{
    const bool isWhole = recorded.flag("IncludeQualifiers", true) && !recorded.hasParameter("PropertyList");
    const bool hasSuper = cimClass.substr(0, cimClass.find('>')).find("SUPERCLASS=") != std::string::npos;
    return isWhole && (!hasSuper || recorded.flag("LocalOnly", true));
}

struct LocalClass
{
    std::string name;
    std::string super;
    std::string text;
};

// The classes of a namespace that can be created, in the order of the answers
// that show the most.
std::vector<LocalClass> localClasses(const std::string& nameSpace)
{
    std::vector<const RecordedExchange*> sources;
    std::set<std::string> seen;
    for (const RecordedExchange& each : recordings()) {
        if (each.nameSpace != nameSpace || each.isRaw || !each.session.empty()) {
            continue;
        }
        if (each.method == "CreateClass") {
            seen.insert(foldCase(firstMatch(each.request, "<CLASS NAME=\"(\\w+)\"")));
        } else if (each.method == "GetClass" || each.method == "EnumerateClasses") {
            sources.push_back(&each);
        }
    }
    std::stable_sort(sources.begin(), sources.end(), [](const auto* x, const auto* y) {
        return elementsOf(x->answer.body, "CLASS").size() > elementsOf(y->answer.body, "CLASS").size();
    });
    std::vector<LocalClass> classes;
    for (const RecordedExchange* source : sources) {
        for (const std::string& text : elementsOf(source->answer.body, "CLASS")) {
            const std::string start = text.substr(0, text.find('>'));
            const std::string name = foldCase(firstMatch(start, " NAME=\"(\\w+)\""));
            if (isLocal(*source, text) && seen.insert(name).second) {
                classes.push_back({name, foldCase(firstMatch(start, "SUPERCLASS=\"(\\w+)\"")), text});
            }
        }
    }
    return classes;
}

std::string withoutDefaults(const std::string& cimClass)
{
    static const std::regex value("(<PROPERTY[^>]*>\n|</QUALIFIER>\n)(<VALUE>[^<]*</"
                                  "VALUE>\n|<VALUE.ARRAY>\n"
                                  "(?:<VALUE>[^<]*</VALUE>\n)*</VALUE.ARRAY>\n)(?=</PROPERTY)");
    return std::regex_replace(cimClass, value, "$1");
}

} // namespace

void ReplayFixture::SetUp()
{
    if (recordings().empty()) {
        GTEST_SKIP() << "VRX_VECTORS_DIR is not set";
    }
    fTree.start();
}

void ReplayFixture::expectRecorded(const RecordedExchange& recorded, Order order) const
{
    SCOPED_TRACE(recorded.name + ": " + recorded.note.substr(0, 120));
    const HttpAnswer ours = replay(recorded);
    const std::string difference = firstDifference(canonical(ours, order), canonical(recorded.answer, order));
    const BetterRow* row = difference.empty() ? nullptr : betterRow(recorded);
    tally().fOutcomes[recorded.name] = row != nullptr;
    if (row == nullptr) {
        EXPECT_EQ(difference, "");
        return;
    }
    EXPECT_THAT(canonical(ours, order), testing::HasSubstr(row->ours)) << row->reason;
    if (row->body == Body::kSame) {
        EXPECT_EQ(firstDifference(canonicalBody(ours.body, order), canonicalBody(recorded.answer.body, order)), "");
    }
}

void ReplayFixture::skip(const RecordedExchange& recorded, const std::string& reason)
{
    tally().fReasons[recorded.name] = reason;
}

bool ReplayFixture::send(const std::string& method, const std::string& nameSpace, const std::string& parameters) const
{
    const HttpAnswer answer = exchange(fTree.port(), intrinsicRequest(method, nameSpace, parameters));
    EXPECT_EQ(answer.status, 200) << method << header(answer, "pgerrordetail") << parameters.substr(0, 300);
    return answer.trailers.count("cimstatuscode") == 0;
}

void ReplayFixture::declareQualifiers(const std::string& nameSpace, const std::string& body) const
{
    for (const RecordedExchange& each : recordings()) {
        if (each.method != "EnumerateQualifiers" || each.nameSpace != nameSpace || each.hasFailed()) {
            continue;
        }
        for (const std::string& declaration : elementsOf(each.answer.body, "QUALIFIER.DECLARATION")) {
            EXPECT_TRUE(send("SetQualifier", nameSpace,
                             "<IPARAMVALUE NAME=\"QualifierDeclaration\">\n" + declaration + "</IPARAMVALUE>\n"));
        }
        return;
    }
    static const std::regex use("<QUALIFIER NAME=\"(\\w+)\" TYPE=\"(\\w+)\"(?: "
                                "PROPAGATED=\"true\")?([^>]*)>\n(<VALUE.ARRAY>)?");
    std::set<std::string> declared;
    for (std::sregex_iterator at(body.begin(), body.end(), use), end; at != end; ++at) {
        const std::smatch& match = *at;
        if (declared.insert(match[1]).second) {
            send("SetQualifier", nameSpace,
                 "<IPARAMVALUE "
                 "NAME=\"QualifierDeclaration\">\n<QUALIFIER.DECLARATION NAME=\"" +
                     match[1].str() + "\" TYPE=\"" + match[2].str() + "\" ISARRAY=\"" +
                     (match[4].matched ? "true" : "false") + "\"" + match[3].str() +
                     ">\n<SCOPE CLASS=\"true\" ASSOCIATION=\"true\" "
                     "REFERENCE=\"true\" PROPERTY=\"true\" "
                     "METHOD=\"true\" "
                     "PARAMETER=\"true\" "
                     "INDICATION=\"true\"/>\n</QUALIFIER.DECLARATION>\n</"
                     "IPARAMVALUE>\n");
        }
    }
}

void ReplayFixture::createNamespace(const std::string& name) const
{
    send("CreateInstance", name,
         "<IPARAMVALUE NAME=\"NewInstance\">\n<INSTANCE "
         "CLASSNAME=\"__NameSpace\">\n<PROPERTY NAME=\"Name\" "
         "TYPE=\"string\">\n<VALUE></VALUE>\n</PROPERTY>\n</INSTANCE>\n</"
         "IPARAMVALUE>\n");
}

void ReplayFixture::createInstances(const RecordedExchange& recorded) const
{
    static const std::regex filledIn("<PROPERTY[^>]*PROPAGATED=[^>]*>\n(<VALUE>[^"
                                     "<]*</VALUE>\n)?</PROPERTY[^>]*>\n");
    for (const std::string& instance : elementsOf(recorded.answer.body, "INSTANCE")) {
        send("CreateInstance", recorded.nameSpace,
             "<IPARAMVALUE NAME=\"NewInstance\">\n" + std::regex_replace(instance, filledIn, "") + "</IPARAMVALUE>\n");
    }
}

bool ReplayFixture::createClass(const std::string& nameSpace, const std::string& cimClass) const
{
    return send("CreateClass", nameSpace, "<IPARAMVALUE NAME=\"NewClass\">\n" + cimClass + "</IPARAMVALUE>\n");
}

void ReplayFixture::createRecordedSchema(Defaults defaults)
{
    std::set<std::string> nameSpaces;
    for (const RecordedExchange& each : recordings()) {
        if (!each.isRaw && each.session.empty() && !isServersOwn(each.nameSpace) && each.status() != 3) {
            nameSpaces.insert(each.nameSpace);
        }
    }
    for (const std::string& nameSpace : nameSpaces) {
        createNamespace(nameSpace);
        std::vector<LocalClass> classes = localClasses(nameSpace);
        std::string text;
        for (const LocalClass& each : classes) {
            text += each.text;
        }
        declareQualifiers(nameSpace, text);
        std::set<std::string>& created = fClasses[nameSpace];
        for (std::size_t before = 0; before != classes.size();) { // superclasses first
            before = classes.size();
            for (auto at = classes.begin(); at != classes.end();) {
                if (!at->super.empty() && created.count(at->super) == 0) {
                    ++at;
                    continue;
                }
                EXPECT_TRUE(createClass(nameSpace, defaults == Defaults::kKept ? at->text : withoutDefaults(at->text)))
                    << at->name;
                created.insert(at->name);
                at = classes.erase(at);
            }
        }
    }
}

bool ReplayFixture::isCreated(const std::string& nameSpace, const std::string& name) const
{
    const auto found = fClasses.find(nameSpace);
    return found != fClasses.end() && found->second.count(foldCase(name)) != 0;
}

bool isServersOwn(const std::string& nameSpace)
{
    return nameSpace == "root" || nameSpace.rfind("root/PG_", 0) == 0;
}

const std::map<std::string, Registration>& registeredClasses()
{
    static const std::map<std::string, Registration> kAll = [] {
        std::map<std::string, Registration> all;
        for (const RecordedExchange& each : recordings()) {
            if (each.className != "PG_ProviderCapabilities" || each.method != "EnumerateInstances") {
                continue;
            }
            for (const std::string& instance : elementsOf(each.answer.body, "INSTANCE")) {
                const auto valueOf = [&instance](const std::string& property) {
                    return firstMatch(instance,
                                      "NAME=\"" + property + "\"[^>]*>\\s*(?:<VALUE.ARRAY>\\s*)?<VALUE>([^<]*)");
                };
                all[foldCase(valueOf("Namespaces") + ":" + valueOf("ClassName"))] = {
                    valueOf("Namespaces"), valueOf("ClassName"), valueOf("ProviderModuleName")};
            }
        }
        return all;
    }();
    return kAll;
}

bool isRegistered(const RecordedExchange& recorded)
{
    return registeredClasses().count(foldCase(recorded.nameSpace + ":" + recorded.className)) != 0;
}

bool isOfProviders(const RecordedExchange& recorded)
{
    if (isRegistered(recorded)) {
        return true;
    }
    const std::string shown = firstMatch(recorded.answer.body, "<INSTANCE CLASSNAME=\"(\\w+)\"");
    return registeredClasses().count(foldCase(recorded.nameSpace + ":" + shown)) != 0;
}

} // namespace servertest
