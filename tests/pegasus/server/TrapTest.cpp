// SPDX-License-Identifier: MIT
// What works on this server and fails on OpenPegasus 2.14.
#include "tests/pegasus/server/AgentFixture.h"

#include <fstream>
#include <map>
#include <utility>

namespace servertest {
namespace {

using namespace Pegasus;

// What works here and fails on OpenPegasus: each kind is carried out and reported once; strict providers are refused.
TEST_F(AgentTest, whatFailsOnOpenPegasusIsReportedOnceOrRefused)
{
    const std::map<std::string, std::string> traps{
        {"chars in string array", "a CMPI_chars element in an array of CMPI_string"},
        {"element released early", "an array keeps the string or datetime"},
        {"null element", "setElementAt without a value"},
        {"null datetime element", "a null datetime in an array"},
        {"untyped null", "a null value of type CMPI_null"},
        {"", "keys that are set on the path alone"}, // in an enumeration
        {"embedded as text", "text for an embedded instance"},
        {"embedded array", "an array of embedded instances"},
        {"text not UTF-8", "text that is not UTF-8"},
        {"infinite real", "a real that is not a number"},
        {"real not a number", "a real that is not a number"},
        {"denormal real", "a real that is not a number"},
        {"half surrogate", "half of a surrogate pair"},
        {"no returnDone", "a method that ends without returnDone"},
        {"no attach", "an upcall of a thread without attachThread"},
        {"nested 3", "upcalls into the own module, nested three deep"},
    };
    for (const bool strict : {false, true}) {
        SCOPED_TRACE(strict ? "strict" : "kind");
        ServerTree tree;
        tree.start();
        tree.installProbe(); // its MOF does not compile on OpenPegasus either
        ASSERT_EQ(tree.run("cimconfig", {"-s", strict ? "strictProviders=true" : "strictProviders=false"}).exitStatus,
                  0);
        CIMClient client;
        client.connect("127.0.0.1", tree.port(), String(), String());
        const auto spring = [&](const std::string& kind) {
            Array<CIMParamValue> in;
            in.append(CIMParamValue("Kind", CIMValue(String(kind.c_str()))));
            return errorOf([&] {
                kind.empty() ? client.enumerateInstances(kNamespace, "Probe_Trap").size()
                             : call(client, "Probe_Trap", "Trap", in);
            });
        };
        for (const auto& [kind, reported] : traps) {
            const std::string first = spring(kind);
            EXPECT_EQ(first, spring(kind)) << kind;
            EXPECT_EQ(first == "no error", !strict) << kind;
            EXPECT_EQ(first.find(reported) != std::string::npos, strict && kind != "no attach")
                << kind << ": " << first;
        }
        EXPECT_EQ(spring("nested 2"), "no error");
        const std::string log = tree.log();
        for (const auto& [kind, reported] : traps) {
            const std::string who = kind == "no attach" ? "" : "provider Probe: "; // such a thread has no provider
            const std::string line =
                "provider module \"ProbeModule\": " + who + "works here, fails on OpenPegasus 2.14: " + reported;
            const std::size_t first = log.find(line);
            EXPECT_NE(first, std::string::npos) << line;
            EXPECT_EQ(log.find(line, first + 1), std::string::npos) << "twice: " << line;
        }
    }
}

// The compiler's warnings of this kind reach the log with their places, each kind once for a file.
TEST_F(AgentTest, mofThatFailsOnOpenPegasusIsReported)
{
    fTree.start();
    fTree.compileBase();
    const std::string first = fTree.home() + "/first.mof";
    const std::string second = fTree.home() + "/second.mof";
    std::ofstream(first) << "\xEF\xBB\xBFQualifier EmbeddedInstance : string = null, Scope(property);\n"
                            "Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride); "
                            "Qualifier Key : boolean = false, Scope(property);\n"
                            "[Association] class L { No ref a; No2 ref b; };\n"
                            "class X { [EmbeddedInstance(\"No\")] string a; uint32 m(string Ref); };\n"
                            "#pragma include (\""
                         << second << "\")\n";
    std::ofstream(second) << "Class I {};\nclass J { [Key] string k; [EmbeddedInstance(\"I\")] string a; };\n"
                             "instance of J { k = \"k\"; a = \"instance of I {};\"; };\n";
    EXPECT_EQ(fTree.run("cimmof", {"-n", "root/portable", "-w", first}).err, "");
    EXPECT_EQ(fTree.log().find("works here"), std::string::npos) << "warnings are hidden";
    EXPECT_EQ(fTree.run("cimmof", {"-n", "root/traps", first}).exitStatus, 0);
    const std::string log = fTree.log();
    const std::pair<std::string, const char*> rows[] = {
        {first + ":1:1", "a byte-order mark"},
        {first + ":3:25", "a reference to a class that is not declared yet"},
        {first + ":4:36", "EmbeddedInstance of a class that is not declared yet"},
        {first + ":4:62", "a parameter named Ref"},
        {first + ":5:18", "an absolute include path"},
        {second + ":1:1", "the word \"class\" in other letters than small ones"},
        {second + ":3:30", "an instance with a value of an embedded property"},
    };
    for (const auto& [place, kind] : rows) {
        EXPECT_NE(log.find(" warning: " + place + ": works here, fails on OpenPegasus 2.14: " + kind + "\n"),
                  std::string::npos)
            << place << "\n"
            << log;
    }
}

} // namespace
} // namespace servertest
