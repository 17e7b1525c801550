// SPDX-License-Identifier: MIT
// How agents end, what becomes of everything else then, and what they leave.
#include "tests/pegasus/server/AgentFixture.h"
#include "tests/pegasus/server/HttpExchange.h"

#include <fstream>
#include <utility>

#include <signal.h>
#include <sys/resource.h>

namespace servertest {
namespace {

using namespace Pegasus;

TEST_F(AgentTest, aDeathIsReportedWithModuleAndCauseAndTheOthersGoOn)
{
    start();
    const std::pair<const char*, std::string> rows[] = {
        {"Crash",
         "CIM_ERR_FAILED: Lost connection with cimprovagt \"ProbeModule\". killed by signal 11 (Segmentation fault); "
         "its last output: lane 3 is dark | \\x1b[2Jgiving up"},
        // Its children, one of them in a session of its own, hold the agent's sockets: the caller must return while
        // they run.
        {"ForkAndCrash",
         "CIM_ERR_FAILED: Lost connection with cimprovagt \"ProbeModule\". killed by signal 11 (Segmentation fault)"},
        // The library's destructor, which would abort, is left out.
        {"Exit", "CIM_ERR_FAILED: Lost connection with cimprovagt \"ProbeModule\". exit status 3"},
    };
    const Uint32 other = call(fClient, "Probe_Other", "ProcessId");
    for (const auto& [method, text] : rows) {
        SCOPED_TRACE(method);
        EXPECT_EQ(errorOf([&, name = method] { call(fClient, "Probe_Bulk", name); }), text);
        EXPECT_GT(call(fClient, "Probe_Bulk", "ProcessId"), 0u) << "a new agent serves the next request";
        EXPECT_EQ(call(fClient, "Probe_Other", "ProcessId"), other);
    }
}

TEST_F(AgentTest, aModuleThatKeepsDyingIsLeftAloneForAWhile)
{
    start();
    const auto crash = [&] { return errorOf([&] { call(fClient, "Probe_Bulk", "Crash"); }); };
    for (int i = 0; i < 3; ++i) {
        EXPECT_NE(crash().find("Lost connection"), std::string::npos);
    }
    // A second at first, which a busy machine may let pass; then twice the time after each death.
    EXPECT_TRUE(eventually([&] { return crash().find("it is not started again yet") != std::string::npos; }));
    EXPECT_TRUE(eventually([&] { return errorOf([&] { call(fClient, "Probe_Bulk", "ProcessId"); }) == "no error"; }));
}

// A vendor's process that has left group, session and parent.
TEST_F(AgentTest, nothingThatAProviderStartsOutlivesItsAgent)
{
    using End = void (*)(const ServerTree&, CIMClient&);
    const std::pair<const char*, End> rows[] = {
        {"the agent crashes",
         [](const ServerTree&, CIMClient& client) { errorOf([&] { call(client, "Probe_Bulk", "Crash"); }); }},
        {"cimserver -s", [](const ServerTree& tree, CIMClient&) { tree.run("cimserver", {"-s"}); }},
        {"the server is killed", [](const ServerTree& tree, CIMClient&) { ::kill(tree.serverProcess(), SIGKILL); }},
    };
    for (const auto& [name, end] : rows) {
        SCOPED_TRACE(name);
        ServerTree tree;
        tree.start();
        tree.installProbe();
        CIMClient client;
        client.connect("127.0.0.1", tree.port(), String(), String());
        const int survivor = static_cast<int>(call(client, "Probe_Bulk", "LeaveChild"));
        EXPECT_TRUE(isRunning(survivor));
        end(tree, client);
        EXPECT_TRUE(eventually([pid = survivor] { return !isRunning(pid); }));
    }
}

TEST_F(AgentTest, anAgentKilledWhileIdleIsReplacedUnseen)
{
    start();
    for (int i = 0; i < 5; ++i) {
        const int agent = static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId"));
        ASSERT_EQ(::kill(agent, SIGKILL), 0);
        ASSERT_TRUE(eventually([&] { return childrenOf(fTree.serverProcess()).empty(); })) << "it stays a zombie";
        EXPECT_NE(static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId")), agent);
    }
}

TEST_F(AgentTest, killedInTheMiddleOfAnEnumeration)
{
    start();
    const int agent = static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId"));
    RawConnection endless(fTree.port());
    endless.send(intrinsicRequest("EnumerateInstances", "root/probe", classNameParameter("Probe_Endless")));
    const HttpAnswer begun = endless.receive(std::chrono::seconds(1));
    EXPECT_GT(begun.body.size(), 128u << 10); // several chunks
    EXPECT_FALSE(begun.isComplete);
    ASSERT_EQ(::kill(agent, SIGKILL), 0);
    EXPECT_FALSE(endless.isClosed(std::chrono::milliseconds(200))) << "the answer is ended properly";
    EXPECT_EQ(countOf("Probe_Other"), 1000u);
    EXPECT_EQ(fClient.enumerateInstances(kNamespace, "Probe_Stored").size(), 1u);
    EXPECT_TRUE(eventually([&] { return !isRunning(agent); }));
}

// Out of descriptors, a server answers on the connections that it has.
TEST_F(AgentTest, aRequestThatNeedsADescriptorTooManyIsAnswered)
{
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "the sanitizer looks at memory through a pipe, for which the server has no descriptors";
#endif
    start();
    call(fClient, "Probe_Bulk", "ProcessId");
    RawConnection endless(fTree.port());
    endless.send(intrinsicRequest("EnumerateInstances", "root/probe", classNameParameter("Probe_Endless")));
    EXPECT_EQ(endless.receive(std::chrono::seconds(1)).status, 200) << "it has the agent's only channel";
    const rlimit none = {3, 3};
    ASSERT_EQ(::prlimit(fTree.serverProcess(), RLIMIT_NOFILE, &none, nullptr), 0);
    EXPECT_EQ(errorOf([&] { call(fClient, "Probe_Bulk", "ProcessId"); }),
              "CIM_ERR_FAILED: cannot create a socket pair for an agent: Too many open files");
}

TEST_F(AgentTest, aClientThatLeavesEndsItsEnumeration)
{
    start();
    const int agent = static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId"));
    {
        RawConnection endless(fTree.port());
        endless.send(intrinsicRequest("EnumerateInstances", "root/probe", classNameParameter("Probe_Endless")));
        endless.receive(std::chrono::milliseconds(50));
    }
    // The agent's processor time stands still once the provider has been refused further instances.
    auto busy = [&, last = std::string()]() mutable {
        std::ifstream file("/proc/" + std::to_string(agent) + "/schedstat");
        std::string now;
        std::getline(file, now);
        const bool changed = now != last;
        last = now;
        return changed;
    };
    EXPECT_TRUE(eventually([&] { return !busy(); }));
    EXPECT_EQ(static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId")), agent);
}

TEST_F(AgentTest, idleAgentsEndAndStartAgain)
{
    start({"agentIdleTimeout=1"});
    const int agent = static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId"));
    EXPECT_TRUE(eventually([&] { return !isRunning(agent); }));
    EXPECT_NE(static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId")), agent);
}

TEST_F(AgentTest, noAgentOutlivesAnOrderlyEnd)
{
    start();
    const int agent = static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId"));
    const int server = fTree.serverProcess();
    EXPECT_EQ(fTree.run("cimserver", {"-s"}).out, "CIM Server stopped.\n");
    EXPECT_FALSE(isRunning(server));
    EXPECT_FALSE(isRunning(agent));
}

TEST_F(AgentTest, agentsEndWhenTheServerIsKilled)
{
    start();
    const int idle = static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId"));
    const int busy = static_cast<int>(call(fClient, "Probe_Other", "ProcessId"));
    RawConnection connection(fTree.port());
    connection.send(intrinsicRequest("EnumerateInstances", "root/probe", classNameParameter("Probe_Endless")));
    connection.receive(std::chrono::milliseconds(50));
    ASSERT_EQ(::kill(fTree.serverProcess(), SIGKILL), 0);
    EXPECT_TRUE(eventually([&] { return !isRunning(idle) && !isRunning(busy); }));
}

TEST_F(AgentTest, agentsAreNotCalledCimserverAndLeaveNoZombie)
{
    start();
    const int agent = static_cast<int>(call(fClient, "Probe_Bulk", "ProcessId"));
    std::ifstream name("/proc/" + std::to_string(agent) + "/comm");
    std::string text;
    std::getline(name, text);
    EXPECT_EQ(text, "cimprovagt");
    ASSERT_EQ(::kill(agent, SIGKILL), 0);
    EXPECT_TRUE(eventually([&] { return childrenOf(fTree.serverProcess()).empty(); }));
}

} // namespace
} // namespace servertest
