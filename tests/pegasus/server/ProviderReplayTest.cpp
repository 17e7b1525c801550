// Recorded requests that a provider answered, against our server and a CMPI provider that has the recorded provider's
// data: it reads the files that this test writes from the recordings.
#include "pegasus/base/PercentCoding.h"
#include "tests/pegasus/server/ReplayFixture.h"

#include <filesystem>
#include <fstream>
#include <map>
#include <regex>
#include <set>

namespace servertest {
namespace {

// An exchange, and where its provider's instances come from.
struct ExchangeRow
{
    const char* name;
    const char* data; // the exchange that shows what the provider has; nullptr: this one
};

const char kMessage[] = "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n"
                        "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\">\n";
const char kMessageEnd[] = "</MESSAGE>\n</CIM>\n";

std::string firstMatch(const std::string& text, const std::string& pattern)
{
    std::smatch match;
    return std::regex_search(text, match, std::regex(pattern)) ? match[1].str() : std::string();
}

// A CLASS element with the properties and keys of the first instance in a body.
std::string classOf(const std::string& name, const std::string& body)
{
    const std::regex property("<(PROPERTY|PROPERTY.ARRAY) NAME=\"(\\w+)\" +TYPE=\"(\\w+)\"([^>]*)>");
    std::string declared = "<CLASS NAME=\"" + name + "\">\n";
    for (const std::string& instance : elementsOf(body.substr(0, body.find("</INSTANCE>\n") + 12), "INSTANCE")) {
        for (std::sregex_iterator at(instance.begin(), instance.end(), property), end; at != end; ++at) {
            const bool isKey = body.find("KEYBINDING NAME=\"" + (*at)[2].str() + "\"") != std::string::npos;
            declared +=
                "<" + (*at)[1].str() + " NAME=\"" + (*at)[2].str() + "\" TYPE=\"" + (*at)[3].str() + "\">\n" +
                (isKey ? "<QUALIFIER NAME=\"Key\" TYPE=\"boolean\">\n<VALUE>TRUE</VALUE>\n</QUALIFIER>\n" : "") + "</" +
                (*at)[1].str() + ">\n";
        }
    }
    return declared + "</CLASS>\n";
}

class ProviderReplayTest : public ReplayFixture
{
  protected:
    void SetUp() override
    {
        ReplayFixture::SetUp();
        if (IsSkipped()) {
            return;
        }
        fTree.compileBase();
        fFolder = fTree.home() + "/provider/lab/";
        std::filesystem::create_directories(fFolder);
        std::filesystem::copy_file(LAB_LIBRARY, fFolder + "liblab.so");
        ASSERT_EQ(fTree.run("cimconfig", {"-s", "providerDir=provider/lab:"}).exitStatus, 0);
        writeFile("lab.mof",
                  "instance of PG_ProviderModule { Name = \"LabModule\"; Vendor = \"Tests\"; Version = \"1\"; "
                  "InterfaceType = \"CMPI\"; InterfaceVersion = \"2.0.0\"; Location = \"lab\"; };\n"
                  "instance of PG_ProviderModule { Name = \"NoLibModule\"; Vendor = \"Tests\"; Version = "
                  "\"1\"; InterfaceType = \"CMPI\"; InterfaceVersion = \"2.0.0\"; Location = "
                  "\"NoSuchLibrary\"; };\n" +
                      provider("LabModule") + provider("NoLibModule"));
        fTree.compile("root/PG_InterOp", fFolder + "lab.mof");
    }

    void writeFile(const std::string& name, const std::string& text) const
    {
        std::ofstream(fFolder + name, std::ios::binary) << text;
    }

    static std::string provider(const std::string& module)
    {
        return "instance of PG_Provider { ProviderModuleName = \"" + module + "\"; Name = \"Lab\"; };\n";
    }

    void registerClass(const std::string& nameSpace, const std::string& name, const std::string& module = "LabModule")
    {
        if (!fRegistered.insert(nameSpace + ":" + name).second) {
            return;
        }
        writeFile("capabilities.mof", "instance of PG_ProviderCapabilities { ProviderModuleName = \"" + module +
                                          "\"; ProviderName = \"Lab\"; CapabilityID = \"" +
                                          std::to_string(fRegistered.size()) + "\"; ClassName = \"" + name +
                                          "\"; Namespaces = {\"" + nameSpace + "\"}; ProviderType = {2, 5}; };\n");
        fTree.compile("root/PG_InterOp", fFolder + "capabilities.mof");
    }

    // The classes of the recordings and their registrations.
    void createLab()
    {
        createRecordedSchema(Defaults::kLeftOut);
        createClasses("root/cimv2", "getclass-assoc");
        for (const char* name : {"Lab_AllTypes", "Lab_Child", "Lab_Emb", "Lab_Ref", "Lab_Bulk", "Lab_Slow", "Lab_Empty",
                                 "Lab_Assoc", "Lab_Fail", "Lab_Methods"})
        {
            registerClass("root/cimv2", name);
        }
        registerClass("root/cimv2", "Lab_NoLib", "NoLibModule");
    }

    // Gives the provider the instances that a recorded answer shows, and takes those of before away.
    void provideInstances(const std::string& body) const
    {
        std::map<std::string, std::string> classes;
        for (const auto& entry : std::filesystem::directory_iterator(fFolder)) {
            if (entry.path().extension() == ".xml") {
                std::filesystem::remove(entry);
            }
        }
        for (const std::string& element : elementsOf(body, "VALUE.NAMEDINSTANCE")) {
            classes[firstMatch(element, "CLASSNAME=\"(\\w+)\"")] += element;
        }
        for (const auto& [name, elements] : classes) {
            writeFile(name + ".xml", kMessage + elements + kMessageEnd);
        }
    }

    // The provider's word in a recorded status: what follows the symbol that the server puts first.
    static std::string statusLine(const HttpAnswer& answer)
    {
        const auto code = answer.trailers.find("cimstatuscode");
        if (code == answer.trailers.end()) {
            return "";
        }
        const std::string text = Pegasus::base::percentDecoded(answer.trailers.at("cimstatuscodedescription"));
        return code->second + " " + std::regex_replace(text, std::regex("^(CIM_ERR_\\w+|Unrecognized.*\"): "), "");
    }

    // Gives the provider the answer of a method. Its inputs come back in `echo`'s way; null turns that off.
    void provideMethod(const std::string& name, const char* echo) const
    {
        const RecordedExchange recorded(name);
        const std::string method = firstMatch(recorded.request, "<METHODCALL NAME=\"(\\w+)\"");
        std::string elements;
        for (const std::string& element : elementsOf(recorded.answer.body, "RETURNVALUE")) {
            elements += element;
        }
        for (const std::string& element : elementsOf(recorded.answer.body, "PARAMVALUE")) {
            if (echo == nullptr || firstMatch(element, "NAME=\"(\\w+)\"") == "count") {
                elements += element;
            }
        }
        writeFile(method + ".xml", kMessage + elements + kMessageEnd);
        writeFile(method + ".status", statusLine(recorded.answer));
        writeFile(method + ".echo", echo == nullptr ? "" : std::string(echo) + "\n");
    }

    std::string fFolder;
    std::set<std::string> fRegistered;
};

TEST_F(ProviderReplayTest, instances)
{
    createLab();
    const ExchangeRow rows[] = {
        {"enuminst-assoc", nullptr},
        {"enuminst-bulk1000", nullptr},
        {"enuminst-deep", nullptr},
        {"enuminst-shallow", "enuminst-deep"},
        {"enuminst-deep-base", nullptr},
        {"enuminst-shallow-base", "enuminst-deep-base"},
        {"enuminst-embedded", nullptr},
        {"enuminst-empty", nullptr},
        {"enuminst-nolib", nullptr},
        {"enuminst-plugin", nullptr},
        {"enuminst-origin", "enuminst-plugin"},
        {"enuminst-qualifiers", "enuminst-plugin"},
        {"enuminst-proplist", "enuminst-plugin"},
        {"enuminst-ref", nullptr},
        {"getinstance", "enuminst-deep"},
    };
    writeFile("Lab_Fail.status", statusLine(RecordedExchange("enuminst-deep-base").answer));
    for (const ExchangeRow& row : rows) {
        provideInstances(RecordedExchange(row.data == nullptr ? row.name : row.data).answer.body);
        expectRecorded(row.name, Order::kSorted);
    }
    writeFile("Lab_AllTypes.status", statusLine(RecordedExchange("getinstance-notfound").answer));
    expectRecorded("getinstance-notfound");
}

TEST_F(ProviderReplayTest, failures)
{
    createLab();
    for (const auto& entry : std::filesystem::directory_iterator(recordingsFolder())) {
        const std::string name = entry.path().filename().string();
        if (name.rfind("enuminst-fail", 0) != 0) {
            continue;
        }
        writeFile("Lab_Fail.status",
                  name == "enuminst-fail-foreign" ? "throw" : statusLine(RecordedExchange(name).answer));
        expectRecorded(name);
    }
}

TEST_F(ProviderReplayTest, methods)
{
    createLab();
    for (const auto& entry : std::filesystem::directory_iterator(recordingsFolder())) {
        const std::string name = entry.path().filename().string();
        if (name.rfind("invoke-", 0) != 0 || name == "invoke-noprovider" || name == "invoke-badns") {
            continue;
        }
        const std::string method = firstMatch(RecordedExchange(name).request, "<METHODCALL NAME=\"(\\w+)\"");
        provideMethod(name, method.rfind("Echo", 0) == 0 ? "o" : method == "InOut" ? "" : nullptr);
        expectRecorded(name);
    }
}

// Providers of other vendors: of most of their classes the recordings show the instances only.
TEST_F(ProviderReplayTest, otherVendors)
{
    std::set<std::string> namespaces;
    for (const char* name :
         {"cli-enum", "cli-embedded", "ptypes-enum", "sample-enum", "sample-sayhello", "mtest-identity"})
    {
        const RecordedExchange recorded(name);
        const std::string nameSpace =
            Pegasus::base::percentDecoded(firstMatch(recorded.request, "CIMObject: ([\\w%]+?)(%3A|\r)"));
        if (namespaces.insert(nameSpace).second) {
            createNamespace(nameSpace);
            declareQualifiers(nameSpace);
        }
        const std::string className =
            firstMatch(recorded.request, "(?:<INSTANCENAME CLASSNAME|<CLASSNAME NAME)=\"(\\w+)\"");
        if (std::filesystem::exists(recordingsFolder() + name + "-getclass")) {
            createClasses(nameSpace, name + std::string("-getclass"));
            expectRecorded(name + std::string("-getclass"));
        } else {
            createClass(nameSpace, classOf(className, recorded.answer.body));
        }
        registerClass(nameSpace, className);
        provideInstances(recorded.answer.body);
        if (recorded.request.find("<METHODCALL") != std::string::npos) {
            provideMethod(name, nullptr);
        }
        expectRecorded(name, Order::kSorted);
    }
}

} // namespace
} // namespace servertest
