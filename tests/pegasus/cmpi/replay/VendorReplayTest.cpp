// SPDX-License-Identifier: MIT
// Recorded vendors and recorded probes of the broker, compiled from the folders of recordings and run in our server.
// The answers must be those of the recorded server, but for the parts that the tables of known differences name.
#include "tests/pegasus/cmpi/replay/KnownDifferences.h"
#include "tests/pegasus/server/RecordedExchange.h"
#include "tests/pegasus/server/ServerTree.h"
#include "tests/support/VectorsFolder.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <map>
#include <optional>
#include <regex>

#include <unistd.h>

namespace servertest {
namespace {

using nlohmann::json;
using std::filesystem::path;

// The library belongs to one vendor folder.
const char kVendor[] = "provider/recorded";

class Tally
{
  public:
    // Judges one answer against the recorded one.
    void judge(const std::string& name, std::string ours, std::string recorded, const KnownDifferences& known)
    {
        const KnownDifference* row = findDifference(known, name);
        if (ours == recorded) {
            ++fEqual;
            EXPECT_EQ(row, nullptr) << name << ": the row is of no use";
            return;
        }
        const std::string missing = row != nullptr ? reconcile(*row, ours, recorded) : std::string();
        EXPECT_EQ(missing, "") << name << ": the row does not describe the difference";
        if (row == nullptr || ours != recorded) {
            ++fDifferent;
            ADD_FAILURE() << name << ": " << firstDifference(ours, recorded);
            return;
        }
        ++fReasons[nameOf(row->why)];
    }

    void print(const std::string& what) const
    {
        std::cout << what << ": " << fEqual << " equal, " << fDifferent << " different";
        for (const auto& [reason, count] : fReasons) {
            std::cout << ", " << reason << " " << count;
        }
        std::cout << "\n";
    }

  private:
    int fEqual = 0;
    int fDifferent = 0;
    std::map<std::string, int> fReasons;
};

json readJson(const path& name)
{
    std::ifstream file(name);
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

// A refusal was recorded without its header.
HttpAnswer asRecorded(HttpAnswer ours, const HttpAnswer& recorded)
{
    if (recorded.headers.empty()) {
        ours.headers.clear();
    }
    return ours;
}

// Returns: the answer in canonical form; null for a body that is malformed, as the recorded server may send it.
std::optional<std::string> canonicalOf(const HttpAnswer& answer)
{
    try {
        return canonical(answer, Order::kAsSent);
    } catch (...) {
        return std::nullopt;
    }
}

// Returns: the answer as it was sent, with NULs that can be read.
std::string asSent(const HttpAnswer& answer)
{
    std::string text = answer.statusLine + "\n" + answer.body;
    for (std::size_t at = 0; (at = text.find('\0', at)) != std::string::npos;) {
        text.replace(at, 1, "\\0");
    }
    return text;
}

class VendorReplay : public testing::Test
{
  protected:
    // Calls the test with each folder of recordings that has the file.
    template <typename Body> void forEach(const char* file, const Body& body)
    {
        const path recordings = path(test::vectorsFolder(VECTORS_DIRECTORY)) / "cmpi";
        if (!std::filesystem::exists(recordings)) {
            GTEST_SKIP() << "no recorded vendors: configure with -DVRX_VECTORS_DIR=<folder>";
        }
        for (const auto& entry : std::filesystem::directory_iterator(recordings)) {
            if (std::filesystem::exists(entry.path() / file)) {
                SCOPED_TRACE(entry.path());
                ServerTree tree;
                tree.start();
                tree.compileBase();
                body(tree, entry.path());
            }
        }
    }

    // Compiles the folder's source into the library that its registration names first.
    static void install(const ServerTree& tree, const path& folder)
    {
        const std::string vendor = tree.home() + "/" + kVendor;
        std::filesystem::create_directories(vendor);
        ASSERT_EQ(tree.run("cimconfig", {"-s", std::string("providerDir=") + kVendor + ":"}).exitStatus, 0);
        std::ifstream registration(only(folder, ".registration.mof"));
        const std::string text{std::istreambuf_iterator<char>(registration), {}};
        const std::string command = COMPILE_VENDOR " -o " + vendor + "/lib" +
                                    firstMatch(text, "Location *= *\"(\\w+)\"") + ".so " + only(folder, ".c").string() +
                                    " -lm";
        ASSERT_EQ(std::system(command.c_str()), 0) << command; // NOLINT(cert-env33-c): the build's own compiler
    }

    // Returns: the folder's file whose name ends so.
    static path only(const path& folder, const std::string& end)
    {
        for (const auto& entry : std::filesystem::directory_iterator(folder)) {
            const std::string name = entry.path().filename();
            if (name.size() > end.size() && name.compare(name.size() - end.size(), end.size(), end) == 0) {
                return entry.path();
            }
        }
        throw std::runtime_error("no file *" + end + " in " + folder.string());
    }

    static std::string probe(const ServerTree& tree, const std::string& name)
    {
        const std::string body =
            "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n"
            "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\">\n<SIMPLEREQ>\n<METHODCALL NAME=\"Probe\">\n"
            "<LOCALCLASSPATH>\n<LOCALNAMESPACEPATH>\n<NAMESPACE NAME=\"root\"/>\n<NAMESPACE NAME=\"cimv2\"/>\n"
            "</LOCALNAMESPACEPATH>\n<CLASSNAME NAME=\"TST_Check\"/>\n</LOCALCLASSPATH>\n"
            "<PARAMVALUE NAME=\"Name\" PARAMTYPE=\"string\">\n<VALUE>" +
            name + "</VALUE>\n</PARAMVALUE>\n</METHODCALL>\n</SIMPLEREQ>\n</MESSAGE>\n</CIM>\n";
        const HttpAnswer answer = exchange(
            tree.port(),
            post("CIMOperation: MethodCall\r\nCIMMethod: Probe\r\nCIMObject: root%2Fcimv2%3ATST_Check\r\n", body));
        std::smatch match;
        const std::string text = canonicalBody(answer.body, Order::kAsSent);
        if (std::regex_search(text, match, std::regex("RETURNVALUE[^\n]*\n +VALUE: ([^]*?)\n(?= *PARAMVALUE|$)"))) {
            return withRecordedHost(match[1]);
        }
        return "!! " + (std::regex_search(text, match, std::regex("ERROR [^\n]*")) ? match[0].str() : text);
    }
};

TEST_F(VendorReplay, exchanges)
{
    forEach("exchanges.json", [](ServerTree& tree, const path& folder) {
        install(tree, folder);
        tree.compile("root/cimv2", only(folder, ".properties.mof"));
        tree.compile("root/PG_InterOp", only(folder, ".registration.mof"));
        Tally tally;
        for (const json& exchanged : readJson(folder / "exchanges.json")) {
            const HttpAnswer recorded = answerOf(exchanged["answer"]);
            const HttpAnswer ours = asRecorded(exchange(tree.port(), requestOf(exchanged["request"])), recorded);
            const auto [left, right] = std::pair(canonicalOf(ours), canonicalOf(recorded));
            tally.judge(exchanged["name"], withRecordedHost(left && right ? *left : asSent(ours)),
                        left && right ? *right : asSent(recorded), differencesOfVendor());
        }
        tally.print(folder.filename());
    });
}

TEST_F(VendorReplay, probes)
{
    forEach("real.json", [](ServerTree& tree, const path& folder) {
        install(tree, folder);
        std::filesystem::copy_file(CONFORMANCE_LIBRARY, tree.home() + "/" + kVendor + "/libconformance.so");
        tree.compile("root/cimv2", CONFORMANCE_MOF);
        tree.compile("root/PG_InterOp", only(folder, ".registration.mof"));
        Tally tally;
        const json answers = readJson(folder / "real.json");
        for (const auto& [name, recorded] : answers.items()) {
            tally.judge(name, probe(tree, name), recorded.get<std::string>(), differencesOfProbes());
        }
        tally.print(folder.filename());
    });
}

} // namespace
} // namespace servertest
