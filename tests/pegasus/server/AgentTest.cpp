// SPDX-License-Identifier: MIT
// What vendor code delivers through the server, and which libraries are loaded.
#include "tests/pegasus/server/AgentFixture.h"
#include "tests/pegasus/server/HttpExchange.h"

#include <cstdio>
#include <fstream>
#include <iterator>
#include <tuple>
#include <utility>

#include <sys/stat.h>

namespace servertest {
namespace {

using namespace Pegasus;

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
    const std::string names = "<IPARAMVALUE NAME=\"InstanceName\"><INSTANCENAME CLASSNAME=\"Probe_Bulk\"><KEYBINDING "
                              "NAME=\"Id\"><KEYVALUE>bulk-0000002</KEYVALUE></KEYBINDING></INSTANCENAME></IPARAMVALUE>"
                              "<IPARAMVALUE NAME=\"PropertyName\"><VALUE>T1</VALUE></IPARAMVALUE>";
    const auto ask = [&](const char* method, const std::string& more) {
        return exchange(fTree.port(), intrinsicRequest(method, "root/probe", names + more)).body;
    };
    EXPECT_NE(ask("GetProperty", "").find("<IRETURNVALUE>\n<VALUE>changed</VALUE>"), std::string::npos);
    const std::string set = ask("SetProperty", "<IPARAMVALUE NAME=\"NewValue\"><VALUE>set</VALUE></IPARAMVALUE>");
    EXPECT_EQ(set.find("<ERROR"), std::string::npos) << set;
    EXPECT_NE(ask("GetProperty", "").find("<VALUE>set</VALUE>"), std::string::npos);
    EXPECT_EQ(errorOf([&] { fClient.deleteInstance(kNamespace, path); }),
              "Unrecognized CIM status code \"99\": not this one");
}

// A registration can be created and deleted; a change would leave open what it holds for.
TEST_F(AgentTest, aRegistrationCannotBeChanged)
{
    fTree.start();
    fTree.compileBase();
    const std::string path = "<INSTANCENAME CLASSNAME=\"PG_ProviderModule\"><KEYBINDING NAME=\"Name\"><KEYVALUE "
                             "VALUETYPE=\"string\">M</KEYVALUE></KEYBINDING></INSTANCENAME>";
    const std::string modified = "<IPARAMVALUE NAME=\"ModifiedInstance\"><VALUE.NAMEDINSTANCE>" + path +
                                 "<INSTANCE CLASSNAME=\"PG_ProviderModule\"/></VALUE.NAMEDINSTANCE></IPARAMVALUE>";
    const std::string set = "<IPARAMVALUE NAME=\"InstanceName\">" + path +
                            "</IPARAMVALUE><IPARAMVALUE NAME=\"PropertyName\"><VALUE>Vendor</VALUE></IPARAMVALUE>"
                            "<IPARAMVALUE NAME=\"NewValue\"><VALUE>V</VALUE></IPARAMVALUE>";
    for (const auto& [method, parameters] : {std::pair("ModifyInstance", modified), {"SetProperty", set}}) {
        const HttpAnswer answer = exchange(fTree.port(), intrinsicRequest(method, "root/PG_InterOp", parameters, ""));
        EXPECT_NE(answer.body.find("<ERROR CODE=\"7\" DESCRIPTION=\"CIM_ERR_NOT_SUPPORTED: PG_ProviderModule: a "
                                   "registration is created and deleted, not changed\"/>"),
                  std::string::npos)
            << method << answer.body;
    }
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
    EXPECT_EQ(call(fClient, "Probe_Bulk", "ChangeProvidedByUpcall"), 6u) << "every step, in another module";
}

// A provider goes by the bits: a claim that does not hold fails at the customer's.
TEST_F(AgentTest, theBrokerClaimsWhatItServes)
{
    start();
    const Uint32 claimed = call(fClient, "Probe_Bulk", "ClaimedCapabilities");
    const Uint32 served = call(fClient, "Probe_Bulk", "ServedCapabilities");
    const std::pair<Uint32, const char*> bits[] = {{0x1, "reads"},
                                                   {0x2, "sets properties"},
                                                   {0x4, "creates, modifies and deletes instances"},
                                                   {0x8, "associations"},
                                                   {0x10, "queries"},
                                                   {0x20, "normal forms of queries"},
                                                   {0x40, "qualifiers"},
                                                   {0x80, "indications"},
                                                   {0x100, "threads and mutexes"},
                                                   {0x4000, "marks memory"},
                                                   {0x8000, "errors as objects"}};
    Uint32 named = 0;
    for (const auto& [bit, what] : bits) {
        EXPECT_EQ((claimed & bit) != 0, (served & bit) != 0) << what;
        named |= bit;
    }
    EXPECT_EQ(claimed & ~named, 0u) << "bits of CMPI 2.1 from a broker of 2.0";
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

} // namespace
} // namespace servertest
