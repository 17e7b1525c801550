// SPDX-License-Identifier: MIT
// A recorded vendor and recorded probes of the broker, compiled from the folder of recordings and run in our server.
// The answers must be those of the recorded server, but for the rows of the tables, which say why ours differ.
#include "pegasus/base/PercentCoding.h"
#include "tests/pegasus/cmpi/replay/KnownDifferences.h"
#include "tests/pegasus/server/RecordedExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <fstream>
#include <iostream>
#include <regex>

#include <unistd.h>

namespace servertest {
namespace {

using nlohmann::json;

// Both libraries belong to one vendor folder.
const char kVendor[] = "provider/recorded";

class Tally
{
  public:
    // Judges one answer against the recorded one.
    void judge(const std::string& name, const std::string& ours, const std::string& recorded,
               const std::vector<KnownDifference>& known)
    {
        const auto row = std::find_if(known.begin(), known.end(),
                                      [&](const KnownDifference& candidate) { return name == candidate.name; });
        if (ours == recorded) {
            ++fEqual;
            EXPECT_TRUE(row == known.end()) << name << ": the row is of no use";
        } else if (row == known.end()) {
            ++fDifferent;
            ADD_FAILURE() << name << ": " << firstDifference(ours, recorded);
        } else {
            ++fReasoned;
            EXPECT_NE(ours.find(row->ours), std::string::npos) << name << ": " << row->reason << "\n" << ours;
        }
    }

    void print(const char* what) const
    {
        std::cout << what << ": " << fEqual << " equal, " << fReasoned << " reasoned, " << fDifferent << " different\n";
    }

  private:
    int fEqual = 0;
    int fReasoned = 0;
    int fDifferent = 0;
};

json readJson(const std::string& path)
{
    std::ifstream file(path);
    return json::parse(file);
}

HttpAnswer answerOf(const json& recorded)
{
    HttpAnswer answer;
    answer.statusLine = "HTTP/1.1 " + recorded["status"].get<std::string>();
    answer.headers = recorded["headers"].get<std::map<std::string, std::string>>();
    answer.trailers = recorded["trailers"].get<std::map<std::string, std::string>>();
    answer.body = recorded["body"].get<std::string>();
    return answer;
}

std::string requestOf(const json& recorded)
{
    const auto text = [&](const char* key) { return recorded[key].get<std::string>(); };
    return post((recorded["TE"].get<bool>() ? "TE: chunked, trailers\r\n" : "") +
                    ("CIMOperation: MethodCall\r\nCIMMethod: " + text("CIMMethod")) +
                    "\r\nCIMObject: " + text("CIMObject") + "\r\n",
                text("body"));
}

// Our machine's name as the recorded machine has it.
std::string withRecordedHost(std::string text)
{
    char name[256] = "";
    ::gethostname(name, sizeof name - 1);
    return std::regex_replace(text, std::regex("\\b" + std::string(name) + "\\b"), "vm");
}

// A body that is malformed, as the recorded server may send it, is compared as it is.
std::string comparable(const HttpAnswer& answer)
{
    try {
        return canonical(answer, Order::kAsSent);
    } catch (...) {
        return answer.statusLine + "\n" + answer.body;
    }
}

class VendorReplay : public testing::Test
{
  protected:
    void SetUp() override
    {
        if (!std::filesystem::exists(fRecordings)) {
            GTEST_SKIP() << "no recorded vendors: configure with -DVRX_VECTORS_DIR=<folder>";
        }
        fTree.start();
        fTree.compileBase();
        std::filesystem::create_directories(fTree.home() + "/" + kVendor);
        ASSERT_EQ(fTree.run("cimconfig", {"-s", std::string("providerDir=") + kVendor + ":"}).exitStatus, 0);
    }

    void install(const std::string& library, const std::string& name) const
    {
        std::filesystem::copy_file(library, fTree.home() + "/" + kVendor + "/lib" + name + ".so");
    }

    std::string probe(const std::string& name) const
    {
        const std::string body =
            "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n"
            "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\">\n<SIMPLEREQ>\n<METHODCALL NAME=\"Probe\">\n"
            "<LOCALCLASSPATH>\n<LOCALNAMESPACEPATH>\n<NAMESPACE NAME=\"root\"/>\n<NAMESPACE NAME=\"cimv2\"/>\n"
            "</LOCALNAMESPACEPATH>\n<CLASSNAME NAME=\"TST_Check\"/>\n</LOCALCLASSPATH>\n"
            "<PARAMVALUE NAME=\"Name\" PARAMTYPE=\"string\">\n<VALUE>" +
            name + "</VALUE>\n</PARAMVALUE>\n</METHODCALL>\n</SIMPLEREQ>\n</MESSAGE>\n</CIM>\n";
        const HttpAnswer answer = exchange(
            fTree.port(),
            post("CIMOperation: MethodCall\r\nCIMMethod: Probe\r\nCIMObject: root%2Fcimv2%3ATST_Check\r\n", body));
        std::smatch match;
        const std::string text = canonicalBody(answer.body, Order::kAsSent);
        if (std::regex_search(text, match, std::regex("RETURNVALUE[^\n]*\n +VALUE: ([^]*?)\n(?= *PARAMVALUE|$)"))) {
            return withRecordedHost(match[1]);
        }
        return "!! " + (std::regex_search(text, match, std::regex("ERROR [^\n]*")) ? match[0].str() : text);
    }

    std::string fRecordings = std::string(VECTORS_DIRECTORY) + "/cmpi";
    ServerTree fTree;
};

TEST_F(VendorReplay, exchanges)
{
    install(RECORDED_VENDOR_LIBRARY, "xt");
    fTree.compile("root/cimv2", fRecordings + "/xt/xt.properties.mof");
    fTree.compile("root/PG_InterOp", fRecordings + "/xt/xt.registration.mof");
    Tally tally;
    for (const json& recorded : readJson(fRecordings + "/xt/exchanges.json")) {
        const std::string name = recorded["name"];
        const HttpAnswer ours = exchange(fTree.port(), requestOf(recorded["request"]));
        tally.judge(name, withRecordedHost(comparable(ours)), comparable(answerOf(recorded["answer"])),
                    differencesOfVendor());
    }
    tally.print("exchanges");
}

TEST_F(VendorReplay, probes)
{
    install(RECORDED_PROBES_LIBRARY, "pb");
    install(CONFORMANCE_LIBRARY, "conformance");
    fTree.compile("root/cimv2", CONFORMANCE_MOF);
    fTree.compile("root/PG_InterOp", fRecordings + "/probes/probes.registration.mof");
    Tally tally;
    const json recordings = readJson(fRecordings + "/probes/real.json");
    for (const auto& [name, recorded] : recordings.items()) {
        tally.judge(name, probe(name), recorded.get<std::string>(), differencesOfProbes());
    }
    tally.print("probes");
}

} // namespace
} // namespace servertest
