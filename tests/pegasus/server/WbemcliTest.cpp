// SPDX-License-Identifier: MIT
// A foreign client, Debian's wbemcli, against our server: every verb that it has. It lacks verbs for qualifier
// declarations (GetQualifier, EnumerateQualifiers, SetQualifier) and for CreateClass.
#include "tests/pegasus/server/ServerTree.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <memory>

namespace servertest {
namespace {

struct CliRow
{
    const char* name;
    std::string arguments;             // for the shell; %s stands for the server's address
    std::vector<std::string> expected; // pieces of the output
};

std::string outputOf(const std::string& command)
{
    std::string text;
    const std::unique_ptr<FILE, int (*)(FILE*)> pipe(::popen(command.c_str(), "r"), ::pclose);
    char part[4096];
    for (std::size_t n; (n = std::fread(part, 1, sizeof part, pipe.get())) > 0;) {
        text.append(part, n);
    }
    return text;
}

// `probe` is the address of the namespace, in an open quotation.
void expectNotSupported(const std::string& probe)
{
    const std::string stored = probe + ":Probe_Stored.Id=\"stored-1\"' ";
    for (const std::string& notSupported : std::vector<std::string>{"ai " + stored, "ain " + stored, "ri " + stored,
                                                                    "rin " + stored, "dc " + probe + ":Probe_Stored' "})
    {
        const std::string output = outputOf("wbemcli " + notSupported + " 2>&1");
        EXPECT_NE(output.find("CIM_ERR_NOT_SUPPORTED"), std::string::npos) << notSupported << ": " << output;
    }
}

TEST(WbemcliTest, everyOperation)
{
    if (std::system("command -v wbemcli >/dev/null") != 0) {
        GTEST_SKIP() << "wbemcli is not installed";
    }
    ServerTree tree;
    tree.start();
    tree.installProbe();
    const std::string probe = "'http://127.0.0.1:" + std::to_string(tree.port()) + "/root/probe";
    const std::string interop = "'http://127.0.0.1:" + std::to_string(tree.port()) + "/root/PG_InterOp";
    const CliRow rows[] = {
        {"GetClass", "-nl gc " + probe + ":Probe_Base'", {"root/probe:Probe_Base", "-Id=", "-T1="}},
        {"GetClass with its declarations",
         "-dx gcd " + probe + ":Probe_Stored'",
         {"<CLASS NAME=\"Probe_Stored\"  SUPERCLASS=\"Probe_Family\""}},
        {"EnumerateClasses", "ec " + probe + ":Probe_Record'", {":Probe_Bulk", ":Probe_Other"}},
        {"EnumerateClassNames", "ecn " + probe + "'", {":Probe_Base\n", ":Probe_Stored\n"}},
        {"EnumerateInstances of the repository",
         "-nl ei " + probe + ":Probe_Stored'",
         {":Probe_Stored.Id=\"stored-1\"", "-T1=\"one\"", "-Number=7"}},
        {"an embedded instance, compiled",
         "-dx ei " + probe + ":Probe_Embedding' 2>&1",
         {"EmbeddedObject=\"instance\"", "&lt;INSTANCE CLASSNAME=&quot;Probe_Stored&quot; &gt;",
          "&lt;VALUE&gt;within"}},
        {"EnumerateInstances of a provider", "ei " + probe + ":Probe_Bulk'", {"bulk-0000000", "bulk-0000999"}},
        {"EnumerateInstanceNames",
         "ein " + probe + ":Probe_Family'",
         {":Probe_Provided.Id=\"bulk-0000001\"", "stored-1"}},
        {"the namespaces", "ein " + interop + ":CIM_Namespace'", {"Name=\"root\"", "Name=\"root/probe\""}},
        {"one namespace's instance",
         "-nl ei " + interop + ":CIM_Namespace'",
         {"-CreationClassName=\"CIM_Namespace\"", "-Name=\"root/PG_Internal\""}},
        {"GetInstance",
         "-nl gi " + probe + ":Probe_Bulk.Id=\"bulk-0000007\"'",
         {"-Id=\"bulk-0000007\"", "-N1=7000021"}},
        {"CreateInstance", "ci " + probe + ":Probe_Stored.Id=\"new\"' Id=new,T1=two", {"Probe_Stored.Id=\"new\""}},
        {"SetProperty", "sp " + probe + ":Probe_Stored.Id=\"stored-1\"' Number=8 2>&1", {}},
        {"GetProperty", "gp " + probe + ":Probe_Stored.Id=\"stored-1\"' Number 2>&1", {"8"}},
        {"ModifyInstance", "mi " + probe + ":Probe_Stored.Id=\"stored-1\"' T1=three 2>&1", {}},
        {"what was modified", "-nl gi " + probe + ":Probe_Stored.Id=\"stored-1\"'", {"-T1=\"three\"", "-Number=8"}},
        {"DeleteInstance", "di " + probe + ":Probe_Stored.Id=\"new\"' 2>&1", {}},
        {"what was deleted", "gi " + probe + ":Probe_Stored.Id=\"new\"' 2>&1", {"CIM_ERR_NOT_FOUND"}},
        {"InvokeMethod", "cm " + probe + ":Probe_Bulk' 'Echo.Text=\"hello\"'", {"hello"}},
        {"InvokeMethod, outputs shown",
         "cmx " + probe + ":Probe_Bulk' 'Echo.Text=\"hello\"'",
         {"<PARAMVALUE NAME=\"Back\"", "hello"}},
        {"InvokeMethod, a number", "cm " + probe + ":Probe_Bulk' 'SetCount.Count=1200'", {"1200"}},
        {"InvokeMethod, a text for a number",
         "cm " + probe + ":Probe_Bulk' 'SetCount.Count=hello' 2>&1",
         {"CIM_ERR_INVALID_PARAMETER", "does not convert to uint32"}},
        {"an error", "gc " + probe + ":Nope' 2>&1", {"CIM_ERR_NOT_FOUND"}},
    };
    expectNotSupported(probe);
    for (const CliRow& row : rows) {
        SCOPED_TRACE(row.name);
        const std::string output = outputOf("wbemcli " + row.arguments);
        for (const std::string& piece : row.expected) {
            EXPECT_NE(output.find(piece), std::string::npos) << piece << "\nin: " << output.substr(0, 600);
        }
    }
}

} // namespace
} // namespace servertest
