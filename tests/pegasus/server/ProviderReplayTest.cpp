// SPDX-License-Identifier: MIT
// Recorded requests that a provider answered, against our server and a CMPI
// provider that has the recorded provider's data: it reads the files that this
// test writes from the recordings.
#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/PercentCoding.h"
#include "tests/pegasus/server/ReplayFixture.h"

#include <filesystem>
#include <fstream>
#include <map>
#include <regex>
#include <set>

namespace servertest {
namespace {

const char kMessage[] = "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM "
                        "CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n"
                        "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\">\n";
const char kMessageEnd[] = "</MESSAGE>\n</CIM>\n";

// A CLASS element with the properties and keys of the first instance in a body.
std::string classOf(const std::string& name, const std::string& body)
{
    const std::regex property("<(PROPERTY|PROPERTY.ARRAY) NAME=\"(\\w+)\" +TYPE=\"(\\w+)\"([^>]*)>");
    std::string declared = "<CLASS NAME=\"" + name + "\">\n";
    for (const std::string& instance : elementsOf(body.substr(0, body.find("</INSTANCE>\n") + 12), "INSTANCE")) {
        for (std::sregex_iterator at(instance.begin(), instance.end(), property), end; at != end; ++at) {
            const bool isKey = body.find("KEYBINDING NAME=\"" + (*at)[2].str() + "\"") != std::string::npos;
            declared += "<" + (*at)[1].str() + " NAME=\"" + (*at)[2].str() + "\" TYPE=\"" + (*at)[3].str() + "\">\n" +
                        (isKey ? "<QUALIFIER NAME=\"Key\" "
                                 "TYPE=\"boolean\">\n<VALUE>TRUE</VALUE>\n</QUALIFIER>\n"
                               : "") +
                        "</" + (*at)[1].str() + ">\n";
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
        writeFile("lab.mof", "instance of PG_ProviderModule { Name = "
                             "\"LabModule\"; Vendor = \"Tests\"; Version = \"1\"; "
                             "InterfaceType = \"CMPI\"; InterfaceVersion = "
                             "\"2.0.0\"; Location = \"lab\"; };\n"
                             "instance of PG_ProviderModule { Name = "
                             "\"NoLibModule\"; Vendor = \"Tests\"; Version = "
                             "\"1\"; InterfaceType = \"CMPI\"; InterfaceVersion = "
                             "\"2.0.0\"; Location = "
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

    // The classes of the recordings, and their registrations. Of some classes the
    // recordings show the instances only.
    void createLab(const std::vector<const RecordedExchange*>& exchanges)
    {
        createRecordedSchema(Defaults::kLeftOut);
        std::set<std::string> madeUp;
        std::string failures;
        for (const RecordedExchange* each : exchanges) {
            failures += statusLine(each->answer);
            if (!isCreated(each->nameSpace, each->className) &&
                madeUp.insert(each->nameSpace + ":" + each->className).second)
            {
                declareQualifiers(each->nameSpace, "<QUALIFIER NAME=\"Key\" TYPE=\"boolean\">\n<VALUE>");
                EXPECT_TRUE(createClass(each->nameSpace, classOf(each->className, each->answer.body)))
                    << each->className;
            }
        }
        std::string capabilities;
        for (const auto& [key, each] : registeredClasses()) {
            const bool lacksLibrary = failures.find("provider module \"" + each.module + "\"") != std::string::npos;
            capabilities += std::string("instance of PG_ProviderCapabilities { ProviderModuleName = \"") +
                            (lacksLibrary ? "NoLibModule" : "LabModule") +
                            "\"; ProviderName = \"Lab\"; CapabilityID = \"" + key + "\"; ClassName = \"" +
                            each.className + "\"; Namespaces = {\"" + each.nameSpace +
                            "\"}; ProviderType = {2, 5}; };\n";
        }
        writeFile("capabilities.mof", capabilities);
        fTree.compile("root/PG_InterOp", fFolder + "capabilities.mof");
    }

    // Gives the provider the instances that a recorded answer shows, and takes
    // those of before away.
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

    // The provider's word in a recorded status: what follows the symbol that the
    // server puts first.
    static std::string statusLine(const HttpAnswer& answer)
    {
        const auto code = answer.trailers.find("cimstatuscode");
        if (code == answer.trailers.end()) {
            return "";
        }
        const std::string text = Pegasus::base::percentDecoded(answer.trailers.at("cimstatuscodedescription"));
        return code->second + " " + std::regex_replace(text, std::regex("^(CIM_ERR_\\w+|Unrecognized.*\"): "), "");
    }

    // The provider of a class fails with what is recorded. An enumeration of a
    // class above it has that of one below.
    void provideStatus(const RecordedExchange& recorded) const
    {
        const std::string status = statusLine(recorded.answer);
        const bool isThrown = recorded.note.find("throws a C++") != std::string::npos;
        for (const std::string& name : isRegistered(recorded) ? std::set<std::string>{recorded.className} : fFailing) {
            writeFile(name + ".status", isThrown ? "throw" : status);
        }
    }

    // Gives the provider the answer of a method. Outputs with the names of
    // inputs, maybe after an "o", are echoes.
    void provideMethod(const RecordedExchange& recorded) const
    {
        std::set<std::string> inputs;
        for (const std::string& element : elementsOf(recorded.request, "PARAMVALUE")) {
            inputs.insert(firstMatch(element, "NAME=\"(\\w+)\""));
        }
        std::string elements;
        for (const std::string& element : elementsOf(recorded.answer.body, "RETURNVALUE")) {
            elements += element;
        }
        std::set<std::string> prefixes;
        for (const std::string& element : elementsOf(recorded.answer.body, "PARAMVALUE")) {
            const std::string output = firstMatch(element, "NAME=\"(\\w+)\"");
            if (inputs.count(output) != 0) {
                prefixes.insert("");
            } else if (output[0] == 'o' && inputs.count(output.substr(1)) != 0) {
                prefixes.insert("o");
            } else {
                elements += element;
            }
        }
        const std::string& method = recorded.method;
        writeFile(method + ".xml", kMessage + elements + kMessageEnd);
        writeFile(method + ".status", statusLine(recorded.answer));
        writeFile(method + ".echo", prefixes.empty() ? "" : *prefixes.begin() + "\n");
    }

    std::set<std::string> fFailing; // classes whose providers only failed
    std::string fFolder;
};

// What a provider has: the recorded enumeration of the class that shows the
// most of it.
const RecordedExchange* dataFor(const RecordedExchange& recorded)
{
    const RecordedExchange* best = nullptr;
    for (const RecordedExchange& each : recordings()) {
        const bool isPlain = !each.flag("IncludeClassOrigin", false) && !each.flag("IncludeQualifiers", false) &&
                             !each.hasParameter("PropertyList") && each.session.empty() && !each.isRaw;
        if (isPlain && each.method == "EnumerateInstances" && each.nameSpace == recorded.nameSpace &&
            each.className == recorded.className && (!best || each.answer.body.size() > best->answer.body.size()))
        {
            best = &each;
        }
    }
    return best;
}

bool isReplayed(const RecordedExchange& recorded)
{
    if (recorded.isRaw || !recorded.session.empty() || isServersOwn(recorded.nameSpace)) {
        return false;
    }
    const bool isMethod = recorded.request.find("<METHODCALL ") != std::string::npos;
    return (isMethod || recorded.method == "EnumerateInstances" || recorded.method == "GetInstance" ||
            recorded.method == "DeleteInstance") &&
           isOfProviders(recorded);
}

TEST_F(ProviderReplayTest, everyRecordedExchange)
{
    std::vector<const RecordedExchange*> exchanges;
    for (const RecordedExchange& each : recordings()) {
        if (isReplayed(each)) {
            exchanges.push_back(&each);
        }
    }
    for (const RecordedExchange* each : exchanges) {
        const RecordedExchange* data = dataFor(*each);
        if (isRegistered(*each) && data && elementsOf(data->answer.body, "INSTANCE").empty() && data->hasFailed()) {
            fFailing.insert(each->className);
        }
    }
    createLab(exchanges);
    for (const RecordedExchange* each : exchanges) {
        if (each->request.find("<METHODCALL ") != std::string::npos) {
            provideMethod(*each);
            expectRecorded(*each);
            continue;
        }
        if (const RecordedExchange* data = dataFor(*each)) {
            provideInstances(data->answer.body);
        }
        provideStatus(*each);
        expectRecorded(*each, each->hasFailed() && isRegistered(*each) ? Order::kAsSent : Order::kSorted);
        for (const auto& entry : std::filesystem::directory_iterator(fFolder)) {
            if (entry.path().extension() == ".status") {
                std::filesystem::remove(entry);
            }
        }
    }
}

} // namespace
} // namespace servertest
