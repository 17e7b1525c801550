// SPDX-License-Identifier: MIT
// What an agent's process may use.
#include "pegasus/server/admin/Capabilities.h"
#include "tests/pegasus/server/AgentFixture.h"

#include <cerrno>
#include <fstream>
#include <iterator>

#include <unistd.h>

namespace servertest {
namespace {

using namespace Pegasus;
using server::CapabilitySet;
using server::parseCapabilities;

// Returns: a set of capabilities in the text of /proc/PID/status.
CapabilitySet capabilitiesIn(const std::string& status, const std::string& name)
{
    return std::stoull(status.substr(status.find(name) + name.size()), nullptr, 16);
}

std::string ownStatus()
{
    std::ifstream file("/proc/self/status");
    return {std::istreambuf_iterator<char>(file), {}};
}

TEST_F(AgentTest, aHangIsEnded)
{
    start({"providerTimeout=1"});
    const Uint32 agent = call(fClient, "Probe_Bulk", "ProcessId");
    EXPECT_EQ(errorOf([&] {
                  call(fClient, "Probe_Bulk", "Hang");
              }).rfind("CIM_ERR_FAILED: Lost connection with cimprovagt \"ProbeModule\".", 0),
              0u);
    EXPECT_FALSE(isRunning(static_cast<int>(agent)));
    EXPECT_NE(call(fClient, "Probe_Bulk", "ProcessId"), agent);
}

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__) // which need more than any limit allows
TEST_F(AgentTest, memoryIsLimited)
{
    start({"agentMemoryMegabytes=300"});
    EXPECT_EQ(errorOf([&] { call(fClient, "Probe_Bulk", "Grow"); }), "CIM_ERR_FAILED: no more memory");
    EXPECT_EQ(countOf("Probe_Bulk"), 1000u);
    EXPECT_EQ(call(fClient, "Probe_Bulk", "Reserve"), 1u) << "addresses are free";
}
#endif

// What a provider sees of its own process.
TEST_F(AgentTest, anAgentIsHeldToItsLimits)
{
    struct Row
    {
        const char* name;
        std::vector<std::string> properties;
        std::vector<const char*> lines;
        CapabilitySet capabilities;
    };
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__) // see above
    const char* const defaultData = "data=-1\n";
    const char* const lowerData = defaultData;
#else
    const char* const defaultData = "data=4294967296\n";
    const char* const lowerData = "data=1048576000\n";
#endif
    const Row rows[] = {
        {"defaults",
         {},
         {"NoNewPrivs:\t1\n", defaultData, "file=4294967296\n", "core=0\n", "address=-1\n"},
         *parseCapabilities("chown,dac_override,dac_read_search,fowner,fsetid,kill,setgid,setuid,net_bind_service,"
                            "net_broadcast,net_admin,net_raw,ipc_lock,ipc_owner,sys_rawio,sys_chroot,sys_ptrace,"
                            "sys_admin,sys_nice,mknod,audit_write,syslog")},
        {"changed",
         {"agentMemoryMegabytes=1000", "agentFileMegabytes=7", "agentNewPrivileges=true", "agentCapabilities=net_raw"},
         {"NoNewPrivs:\t0\n", lowerData, "file=7340032\n"},
         *parseCapabilities("net_raw")},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.name);
        ServerTree tree;
        tree.start(row.properties);
        tree.installProbe();
        CIMClient client;
        client.connect("127.0.0.1", tree.port(), String(), String());
        Array<CIMParamValue> out;
        const CIMValue value =
            client.invokeMethod(kNamespace, CIMObjectPath("Probe_Bulk"), "Confinement", Array<CIMParamValue>(), out);
        const std::string text(value.toString().getCString());
        for (const char* line : row.lines) {
            EXPECT_NE(text.find(line), std::string::npos) << line << " in:\n" << text;
        }
        for (const std::string set : {"CapPrm:", "CapEff:", "CapBnd:"}) {
            const bool mayDrop = set != "CapBnd:" || ::geteuid() == 0; // others have nothing that the set could bound
            EXPECT_EQ(capabilitiesIn(text, set),
                      capabilitiesIn(ownStatus(), set) & (mayDrop ? row.capabilities : server::kAllCapabilities))
                << set;
        }
    }
}

TEST_F(AgentTest, aFloodOfOutputCostsTheLogALittle)
{
    start();
    EXPECT_EQ(call(fClient, "Probe_Bulk", "Flood"), 60'000u);
    EXPECT_EQ(call(fClient, "Probe_Bulk", "WriteToClosedPipe"), static_cast<Uint32>(EPIPE)) << "it lives";
    ASSERT_TRUE(eventually([&] { return fTree.log().find("0000099 the probe has") != std::string::npos; }));
    const std::string log = fTree.log();
    EXPECT_NE(log.find("info: provider module \"ProbeModule\" wrote: 0000000 the probe has"), std::string::npos);
    EXPECT_LT(log.size(), 40'000u);
}

} // namespace
} // namespace servertest
