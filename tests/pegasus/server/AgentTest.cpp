// SPDX-License-Identifier: MIT
// Vendor code under the server: what it delivers, and what becomes of everything else when it fails.
#include "pegasus/server/admin/Capabilities.h"
#include "tests/pegasus/server/HttpExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <Pegasus/Client/CIMClient.h>

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdio>
#include <fstream>
#include <map>
#include <memory>

#include <signal.h>
#include <sys/stat.h>
#include <unistd.h>

namespace servertest {
namespace {

using namespace Pegasus;
using server::CapabilitySet;
using server::parseCapabilities;

const CIMNamespaceName kNamespace("root/probe");

class AgentTest : public testing::Test
{
  protected:
    void start(const std::vector<std::string>& properties = {})
    {
        fTree.start(properties);
        fTree.installProbe();
        connect(fClient);
    }

    void connect(CIMClient& client) const { client.connect("127.0.0.1", fTree.port(), String(), String()); }

    static Uint32 call(CIMClient& client, const char* className, const char* method,
                       const Array<CIMParamValue>& in = Array<CIMParamValue>())
    {
        Array<CIMParamValue> out;
        Uint32 number = 0;
        client.invokeMethod(kNamespace, CIMObjectPath(className), method, in, out).get(number);
        return number;
    }

    // Returns: the error's text.
    template <typename Action> static std::string errorOf(const Action& action)
    {
        try {
            action();
        } catch (const Exception& error) {
            return std::string(error.getMessage().getCString());
        }
        return "no error";
    }

    // Returns: a set of capabilities in the text of /proc/PID/status.
    static CapabilitySet capabilitiesIn(const std::string& status, const std::string& name)
    {
        return std::stoull(status.substr(status.find(name) + name.size()), nullptr, 16);
    }

    static std::string ownStatus()
    {
        std::ifstream file("/proc/self/status");
        return {std::istreambuf_iterator<char>(file), {}};
    }

    Uint32 countOf(const char* className, Boolean deep = true)
    {
        return fClient.enumerateInstances(kNamespace, className, deep).size();
    }

    void setCount(Uint32 count)
    {
        Array<CIMParamValue> in;
        in.append(CIMParamValue("Count", CIMValue(count)));
        EXPECT_EQ(call(fClient, "Probe_Bulk", "SetCount", in), count);
    }

    ServerTree fTree;
    CIMClient fClient;
};

TEST_F(AgentTest, aLargeAnswerIsPassedOnWhole)
{
    start();
    setCount(20'000);           // many times the size of any buffer on the way
    fClient.setTimeout(60'000); // a sanitizer's time
    const Array<CIMInstance> bulk = fClient.enumerateInstances(kNamespace, "Probe_Bulk");
    ASSERT_EQ(bulk.size(), 20'000u);
    for (Uint32 i = 0; i < bulk.size(); i += 1999) {
        char path[64];
        std::snprintf(path, sizeof path, "Probe_Bulk.Id=\"bulk-%07u\"", i);
        EXPECT_EQ(bulk[i].getPath().toString(), String(path));
        EXPECT_EQ(bulk[i].getPropertyCount(), 17u);
    }
    // A client that lacks support for trailers gets the same, with its length in front.
    const std::string request =
        intrinsicRequest("EnumerateInstances", "root/probe", classNameParameter("Probe_Bulk"), "");
    RawConnection withoutTrailers(fTree.port());
    withoutTrailers.send(request);
    const HttpAnswer whole = withoutTrailers.receive(std::chrono::seconds(60)); // nothing leaves before all is there
    EXPECT_TRUE(whole.isComplete);
    EXPECT_GT(whole.body.size(), 20'000'000u);
    EXPECT_EQ(fTree.run("cimconfig", {"-s", "maxBufferedAnswerBytes=100000"}).exitStatus, 0);
    EXPECT_NE(exchange(fTree.port(), request).body.find("<ERROR CODE=\"27\""), std::string::npos);
}

TEST_F(AgentTest, aFamilyComesFromProvidersAndTheRepositoryTogether)
{
    start();
    setCount(2);
    const Array<CIMInstance> deep = fClient.enumerateInstances(kNamespace, "Probe_Family", true);
    ASSERT_EQ(deep.size(), 1003u) << "two, a thousand of the other module, one stored";
    const Array<CIMInstance> shallow = fClient.enumerateInstances(kNamespace, "Probe_Family", false);
    ASSERT_EQ(shallow.size(), 1003u);
    for (Uint32 i = 0; i < shallow.size(); ++i) {
        EXPECT_EQ(shallow[i].getPropertyCount(), 3u) << "cut down to the named class";
        EXPECT_NE(shallow[i].getClassName(), CIMName("Probe_Family"));
    }
    EXPECT_EQ(deep[0].getPropertyCount(), 4u);
    EXPECT_EQ(fClient.enumerateInstanceNames(kNamespace, "Probe_Family").size(), 1003u);
}

TEST_F(AgentTest, enumeratesNamesGetsAndInvokes)
{
    start();
    setCount(3);
    EXPECT_EQ(fClient.enumerateInstanceNames(kNamespace, "Probe_Other").size(), 1000u) << "its agent has its own count";
    CIMObjectPath path("Probe_Bulk.Id=\"bulk-0000002\"");
    const CIMInstance instance = fClient.getInstance(kNamespace, path, false);
    EXPECT_EQ(instance.getPropertyCount(), 17u);
    path = CIMObjectPath("Probe_Bulk.Id=\"bulk-0000003\"");
    EXPECT_EQ(errorOf([&] { fClient.getInstance(kNamespace, path, false); }), "CIM_ERR_NOT_FOUND: no such probe");

    Array<CIMParamValue> in;
    Array<CIMParamValue> out;
    in.append(CIMParamValue("Text", CIMValue(String("<caf\xc3\xa9> "))));
    fClient.invokeMethod(kNamespace, CIMObjectPath("Probe_Bulk"), "Echo", in, out);
    ASSERT_EQ(out.size(), 1u);
    EXPECT_EQ(out[0].getValue().toString(), String("<caf\xc3\xa9> "));
    EXPECT_EQ(errorOf([&] { call(fClient, "Probe_Bulk", "Nope"); }), "CIM_ERR_METHOD_NOT_AVAILABLE: Nope");
    EXPECT_EQ(errorOf([&] { call(fClient, "Probe_Stored", "Nope"); }), "CIM_ERR_METHOD_NOT_AVAILABLE: Nope");
    EXPECT_EQ(errorOf([&] { call(fClient, "Nope", "Nope"); }), "CIM_ERR_NOT_FOUND: Nope");
    EXPECT_EQ(errorOf([&] { countOf("Nope"); }), "CIM_ERR_INVALID_CLASS: Nope");
}

// The macros of <cmpi/cmpimacs.h> make entry points and tables that work, from C and from C++.
TEST_F(AgentTest, theExampleVendorServesInstancesAndItsMethod)
{
    const CIMNamespaceName nameSpace("root/cimv2");
    for (const char* library : {LAMPS_C, LAMPS_CPP}) {
        SCOPED_TRACE(library);
        ServerTree tree;
        tree.start();
        tree.compileBase();
        ASSERT_EQ(tree.run("cimconfig", {"-s", std::string("providerDir=") + LAMPS_DIRECTORY + ":"}).exitStatus, 0);
        tree.compile("root/cimv2", LAMPS_SOURCES "/lamps.properties.mof");
        std::ifstream file(LAMPS_SOURCES "/lamps.registration.mof");
        std::string registration{std::istreambuf_iterator<char>(file), {}};
        registration.replace(registration.find("\"lamps\""), 7, '"' + std::string(library) + '"');
        std::ofstream(tree.home() + "/registration.mof") << registration;
        tree.compile("root/PG_InterOp", tree.home() + "/registration.mof");
        CIMClient client;
        client.connect("127.0.0.1", tree.port(), String(), String());
        EXPECT_EQ(client.enumerateInstanceNames(nameSpace, "LAMP_Lamp").size(), 2u);
        const CIMObjectPath disk("LAMP_Lamp.Name=\"disk\"");
        Array<CIMParamValue> in;
        Array<CIMParamValue> out;
        in.append(CIMParamValue("Frequency", CIMValue(Uint32(9))));
        EXPECT_EQ(client.invokeMethod(nameSpace, disk, "Blink", in, out).toString(), String("0"));
        ASSERT_EQ(out.size(), 1u);
        EXPECT_EQ(out[0].getValue().toString(), String("5"));
        const CIMInstance lamp = client.getInstance(nameSpace, disk, false);
        EXPECT_EQ(lamp.getProperty(lamp.findProperty("Frequency")).getValue().toString(), String("9"));
        EXPECT_EQ(errorOf([&] { client.getInstance(nameSpace, CIMObjectPath("LAMP_Lamp.Name=\"x\"")); }),
                  "CIM_ERR_NOT_FOUND: there is no such lamp");
    }
}

TEST_F(AgentTest, changesReachTheProviderThatHasThem)
{
    start();
    setCount(2);
    CIMInstance instance("Probe_Bulk");
    instance.addProperty(CIMProperty("T1", CIMValue(String("changed"))));
    EXPECT_EQ(fClient.createInstance(kNamespace, instance).toString(), String("Probe_Bulk.Id=\"bulk-0000002\""));
    EXPECT_EQ(countOf("Probe_Bulk"), 3u);
    CIMObjectPath path("Probe_Bulk.Id=\"bulk-0000002\"");
    instance.setPath(path);
    EXPECT_EQ(errorOf([&] { fClient.modifyInstance(kNamespace, instance); }), "no error") << "T1 is all that it has";
    instance.addProperty(CIMProperty("T2", CIMValue(String("changed"))));
    EXPECT_EQ(errorOf([&] { fClient.modifyInstance(kNamespace, instance); }),
              "CIM_ERR_NOT_SUPPORTED: only T1 can be changed");
    Array<CIMName> t1;
    t1.append("T1");
    fClient.modifyInstance(kNamespace, instance, false, CIMPropertyList(t1));
    const auto valueOf = [&] {
        const std::string names =
            "<IPARAMVALUE NAME=\"InstanceName\"><INSTANCENAME CLASSNAME=\"Probe_Bulk\"><KEYBINDING "
            "NAME=\"Id\"><KEYVALUE>bulk-0000002</KEYVALUE></KEYBINDING></INSTANCENAME></IPARAMVALUE>"
            "<IPARAMVALUE NAME=\"PropertyName\"><VALUE>T1</VALUE></IPARAMVALUE>";
        return exchange(fTree.port(), intrinsicRequest("GetProperty", "root/probe", names)).body;
    };
    EXPECT_NE(valueOf().find("<IRETURNVALUE>\n<VALUE>changed</VALUE>"), std::string::npos) << valueOf();
    EXPECT_EQ(errorOf([&] { fClient.deleteInstance(kNamespace, path); }),
              "Unrecognized CIM status code \"99\": not this one");
}

TEST_F(AgentTest, aPropertyListReachesTheProvider)
{
    start();
    Array<CIMName> wanted;
    wanted.append("N3");
    const Array<CIMInstance> listed =
        fClient.enumerateInstances(kNamespace, "Probe_Other", true, true, false, false, CIMPropertyList(wanted));
    ASSERT_EQ(listed.size(), 1000u);
    EXPECT_EQ(listed[0].getPropertyCount(), 1u);
}

TEST_F(AgentTest, anUpcallIsServedWhileTheRequestWaits)
{
    start();
    setCount(5);
    EXPECT_EQ(call(fClient, "Probe_Bulk", "CountByUpcall"), 5u) << "into the agent that makes the call";
    EXPECT_EQ(call(fClient, "Probe_Other", "CountByUpcall"), 5u);
    EXPECT_EQ(call(fClient, "Probe_Bulk", "ChangeByUpcall"), 7u) << "every step";
}

TEST_F(AgentTest, anErrorLeavesNothingDelivered)
{
    start();
    EXPECT_EQ(errorOf([&] { countOf("Probe_FailAfter"); }), "CIM_ERR_ACCESS_DENIED: the probe says no: \xc3\xa9");
    EXPECT_EQ(errorOf([&] { countOf("Probe_NoLibrary"); }),
              "CIM_ERR_FAILED: File \"libNoSuchLibrary.so\" was not found for provider module \"NoLibModule\".");
    EXPECT_EQ(errorOf([&] { countOf("Probe_Cpp"); }), "CIM_ERR_FAILED: Provider module \"CppModule\" has the interface "
                                                      "type C++Default; this server loads CMPI modules only.");
    const HttpAnswer answer = exchange(
        fTree.port(), intrinsicRequest("EnumerateInstances", "root/probe", classNameParameter("Probe_FailAfter")));
    EXPECT_EQ(answer.body.find("IRETURNVALUE"), std::string::npos);
    EXPECT_EQ(answer.trailers.at("cimstatuscodedescription"),
              "CIM_ERR_ACCESS_DENIED%3A%20the%20probe%20says%20no%3A%20%C3%A9");
}

// Whoever can change a library, or the folder that it is taken from, would run as the server's user.
TEST_F(AgentTest, aLibraryThatOthersCanChangeIsNotLoaded)
{
    for (const bool strict : {true, false}) {
        SCOPED_TRACE(strict ? "strict" : "strictOwners=false");
        ServerTree tree;
        tree.start({strict ? "strictOwners=true" : "strictOwners=false"});
        tree.installProbe();
        CIMClient client;
        client.connect("127.0.0.1", tree.port(), String(), String());
        const std::string folder = tree.home() + "/provider/probe";
        const auto load = [&] { return errorOf([&] { call(client, "Probe_Bulk", "ProcessId"); }); };
        for (const auto& [path, open, closed] :
             {std::tuple(folder + "/libprobe.so", 0666u, 0644u), {folder, 0777u, 0755u}})
        {
            ASSERT_EQ(::chmod(path.c_str(), open), 0);
            char mode[8];
            std::snprintf(mode, sizeof mode, "%04o", open);
            const std::string said = load();
            const std::string refusal = "CIM_ERR_FAILED: Provider module \"ProbeModule\" is not loaded: " + path;
            EXPECT_EQ(said.rfind(strict ? refusal : "no error", 0), 0u) << said;
            EXPECT_EQ(said.find(std::string(", mode ") + mode + ") can be changed by users other") != std::string::npos,
                      strict);
            ASSERT_EQ(::chmod(path.c_str(), closed), 0);
        }
        EXPECT_EQ(load(), "no error");
    }
}

// What works here and fails on OpenPegasus: each kind is carried out and reported once; strict providers are refused.
TEST_F(AgentTest, whatFailsOnOpenPegasusIsReportedOnceOrRefused)
{
    const std::map<std::string, std::string> traps{
        {"chars in string array", "a CMPI_chars element in an array of CMPI_string"},
        {"string in chars array", "a CMPI_string element in an array of CMPI_chars"},
        {"element released early", "an array keeps the string or datetime"},
        {"null element", "setElementAt without a value"},
        {"null datetime element", "a null datetime in an array"},
        {"untyped null", "a null value of type CMPI_null"},
        {"key of other type", "a key of another type"},
        {"null key", "addKey with a null value"},
        {"", "keys that are set on the path alone"}, // in an enumeration
        {"embedded as text", "text for an embedded instance"},
        {"text not UTF-8", "text that is not UTF-8"},
        {"real not normal", "a real that is not a number"},
        {"half surrogate", "half of a surrogate pair"},
        {"no returnDone", "a method that ends without returnDone"},
        {"no attach", "an upcall of a thread without attachThread"},
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
            EXPECT_EQ(spring(kind) == "no error", !strict) << kind;
            EXPECT_EQ(spring(kind) == "no error", !strict) << kind;
        }
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
    for (int i = 0; i < 3; ++i) {
        EXPECT_NE(errorOf([&] { call(fClient, "Probe_Bulk", "Crash"); }).find("Lost connection"), std::string::npos);
    }
    EXPECT_NE(errorOf([&] { call(fClient, "Probe_Bulk", "Crash"); }).find("it is not started again yet"),
              std::string::npos);
    EXPECT_TRUE(eventually([&] { return errorOf([&] { call(fClient, "Probe_Bulk", "ProcessId"); }) == "no error"; }));
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
    EXPECT_GT(begun.body.size(), 256u << 10); // several chunks
    EXPECT_FALSE(begun.isComplete);
    ASSERT_EQ(::kill(agent, SIGKILL), 0);
    EXPECT_FALSE(endless.isClosed(std::chrono::milliseconds(200))) << "the answer is ended properly";
    EXPECT_EQ(countOf("Probe_Other"), 1000u);
    EXPECT_EQ(fClient.enumerateInstances(kNamespace, "Probe_Stored").size(), 1u);
    EXPECT_TRUE(eventually([&] { return !isRunning(agent); }));
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
