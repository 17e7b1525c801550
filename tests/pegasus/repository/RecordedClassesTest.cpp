#include "pegasus/repository/Repository.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/ElementEncoder.h"
#include "tests/pegasus/mof/TemporaryDirectory.h"

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

// Classes that a real OpenPegasus server returned. Their local forms are created here; the answers in every form must
// be equal to the real server's, byte by byte.

using namespace Pegasus;
using namespace Pegasus::repository;

namespace {

const std::string kFolder = VRX_VECTORS_DIR;
const CIMNamespaceName kNamespace("root/cimv2");

std::string answerOf(const std::string& exchange)
{
    std::ifstream file(kFolder + "/wire/" + exchange + "/response.http", std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

// Returns: the CLASS elements of an answer, each with the line feed after it.
std::vector<std::string> classesIn(const std::string& answer)
{
    static const std::string kEnd = "</CLASS>\n";
    std::vector<std::string> found;
    for (std::size_t at = answer.find("<CLASS "); at != std::string::npos; at = answer.find("<CLASS ", at + 1)) {
        found.push_back(answer.substr(at, answer.find(kEnd, at) + kEnd.size() - at));
    }
    return found;
}

CIMClass decode(std::string text)
{
    wire::XmlDocument document;
    wire::ElementDecoder decoder;
    return decoder.decodeClass(document.parseElement(text.data(), text.size(), {}));
}

std::string encode(const CIMConstClass& cimClass)
{
    std::string text;
    wire::appendClass(text, cimClass);
    return text;
}

// The recorded classes have effective flavors, so a use shows the flavors of its declaration.
template <typename Owner> void declareQualifiers(Repository& repository, const Owner& owner)
{
    for (Uint32 i = 0; i < owner.getQualifierCount(); ++i) {
        const CIMConstQualifier use = owner.getQualifier(i);
        const CIMValue none(use.getType(), use.isArray());
        repository.setQualifier(kNamespace, CIMQualifierDecl(use.getName(), none, CIMScope::ANY, use.getFlavor()));
    }
}

void create(Repository& repository, const std::string& text)
{
    const CIMClass local = decode(text);
    declareQualifiers(repository, local);
    for (Uint32 i = 0; i < local.getPropertyCount(); ++i) {
        declareQualifiers(repository, CIMConstClass(local).getProperty(i));
    }
    for (Uint32 i = 0; i < local.getMethodCount(); ++i) {
        const CIMConstMethod method = CIMConstClass(local).getMethod(i);
        declareQualifiers(repository, method);
        for (Uint32 j = 0; j < method.getParameterCount(); ++j) {
            declareQualifiers(repository, method.getParameter(j));
        }
    }
    repository.createClass(kNamespace, local);
}

} // namespace

TEST(RecordedClasses, ComeBackAsTheRealServerGaveThemOut)
{
    if (kFolder.empty()) {
        GTEST_SKIP() << "no recorded exchanges: set VRX_VECTORS_DIR";
    }
    const mof_test::TemporaryDirectory directory;
    Repository repository(directory.path());
    repository.createNamespace(kNamespace);
    for (const char* exchange : {"getclass-base", "enumclasses", "getclass-localonly", "getclass-assoc"}) {
        for (const std::string& text : classesIn(answerOf(exchange))) {
            create(repository, text);
        }
    }

    Array<CIMName> list;
    list.append(CIMName("U8"));
    list.append(CIMName("Nope"));
    struct Row
    {
        const char* exchange;
        const char* className;
        ClassOptions options; // localOnly, includeQualifiers, includeClassOrigin, propertyList
    };
    const Row rows[] = {
        {"getclass-base", "Lab_Base", {false, true, false, {}}},
        {"getclass-alltypes", "Lab_AllTypes", {false, true, false, {}}},
        {"getclass-plugin", "Lab_Child", {false, true, false, {}}},
        {"getclass-case", "LAB_CHILD", {false, true, false, {}}},
        {"getclass-localonly", "Lab_Child", {true, true, false, {}}},
        {"getclass-noqual", "Lab_Child", {false, false, false, {}}},
        {"getclass-proplist", "Lab_Child", {false, true, false, CIMPropertyList(list)}},
        {"enumclasses-deep", "Lab_Child", {false, true, true, {}}},
        {"getclass-methods", "Lab_Methods", {false, true, false, {}}},
        {"getclass-embedded", "Lab_Emb", {false, true, false, {}}},
        {"getclass-assoc", "Lab_Assoc", {false, true, false, {}}},
    };
    for (const Row& row : rows) {
        const std::vector<std::string> recorded = classesIn(answerOf(row.exchange));
        ASSERT_EQ(recorded.size(), 1u) << row.exchange;
        EXPECT_EQ(encode(repository.getClass(kNamespace, CIMName(row.className), row.options)), recorded[0])
            << row.exchange;
    }
}
