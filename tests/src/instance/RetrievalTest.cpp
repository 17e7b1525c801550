// SPDX-License-Identifier: MIT
// Instances fetched from the server: who is asked, for what, with which timeout, and which instance matches.
#include "tests/src/instance/RetrievalFixture.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>

namespace NKOLVRX20 {
namespace {

using Pegasus::CIMName;
using Pegasus::CIMObjectPath;
using Pegasus::CIMValue;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

class RetrievalTest : public TRetrievalFixture
{
};

TEST_F(RetrievalTest, EveryInstanceIsHandedOverInTheServersOrder)
{
    const auto target = Serve("CIM_A", {Instance("CIM_A", "CIM_A.Id=\"2\"", {Property("Id", Pegasus::String("2"))}),
                                        Instance("CIM_A", "CIM_A.Id=\"1\"",
                                                 {Property("Id", Pegasus::String("1")),
                                                  Property("N", CIMValue(Pegasus::CIMTYPE_UINT32, false))})});
    const auto instances = Enumerate(*target);
    EXPECT_THAT(fServed.Log(), ElementsAre("3|TPEGASUSClass::EnumerateInstances CIM_A",
                                           "3|TPEGASUSClass:EnumerateInstances. Calling NSP =  root/cimv2",
                                           "3|DEBUG: TPEGASUSClass:EnumerateInstances get instance of CIM_A count: 2",
                                           "3|TPEGASUSClass::EnumerateInstances nsp=root/cimv2",
                                           "3|TPEGASUSClass::EnumerateInstances nsp=root/cimv2"));
    EXPECT_THAT(fServed.TakeRequests(), ElementsAre("GetClass CIM_A", "EnumerateInstances CIM_A"));
    ASSERT_EQ(2U, instances.size());
    EXPECT_EQ("2", ValueOf(*instances[0], "Id").ToString(10));
    EXPECT_EQ("1", ValueOf(*instances[1], "ID").ToString(10));
    EXPECT_TRUE(ValueOf(*instances[1], "n").IsNull());
    EXPECT_EQ("root/cimv2", instances[0]->GetPegasusNSPStr());
    EXPECT_EQ(target, instances[0]->GetClass({}));
    EXPECT_FALSE(instances[0]->instReadytoUse());
    instances[0]->finishGettingInst();
    EXPECT_TRUE(instances[0]->instReadytoUse());
    for (const std::size_t visits : {1U, 2U}) // the visitor's false ends it
    {
        EXPECT_EQ(visits, Enumerate(*target, visits).size());
    }
}

TEST_F(RetrievalTest, TheRequestSaysWhatTheCallerWants)
{
    const auto target = Serve("CIM_A", {});
    const auto bodyOf = [&](bool deep) {
        target->EnumerateInstances([](const auto&) { return true; }, deep, {});
        return fServed.fPeer.requests().back().body;
    };
    const std::string shallow = bodyOf(false);
    const auto deepAt = shallow.find("DeepInheritance");
    ASSERT_NE(std::string::npos, deepAt);
    EXPECT_EQ(deepAt, shallow.find("DeepInheritance\">\n<VALUE>FALSE"));
    EXPECT_THAT(bodyOf(true), ::testing::Not(HasSubstr("DeepInheritance\">\n<VALUE>FALSE")));
    EXPECT_THAT(shallow, ::testing::Not(HasSubstr("LocalOnly\">\n<VALUE>FALSE")));
    EXPECT_THAT(shallow, ::testing::Not(HasSubstr("<VALUE>TRUE"))); // what is left out is false
    EXPECT_THAT(shallow, ::testing::Not(HasSubstr("PropertyList")));
}

TEST_F(RetrievalTest, TheTimeoutFollowsTheClassName)
{
    struct
    {
        const char* fClass;
        unsigned int fMs;
    } const rows[] = {
        {"CIM_A", 77000},
        {"X_AvailableDiagnosticServiceY", 199000},
        {"X_SoftwareIdentityY", 301000},
        {"X_SoftwareIdentityAvailableDiagnosticService", 199000},
        {"X_softwareidentity", 77000},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fClass);
        const auto target = Serve(row.fClass, {}, "77");
        EXPECT_EQ(5000U, fServed.TimeoutMs()); // as fetching the class left it
        Enumerate(*target);
        EXPECT_EQ(row.fMs, fServed.TimeoutMs());
        target->GetInstance(ReferenceTo("x"), {});
        EXPECT_EQ(77000U, fServed.TimeoutMs());
        const auto provider = fServed.MakeProvider();
        target->SetProvider(provider);
        Enumerate(*target);
        EXPECT_EQ(row.fMs, provider->getPegClient()->getTimeout());
        target->GetInstanceWithNsp(ReferenceTo("x"), {});
        EXPECT_EQ(77000U, provider->getPegClient()->getTimeout());
        EXPECT_EQ(77000U, fServed.TimeoutMs()); // not touched again
        target->SetProvider(nullptr);
    }
}

TEST_F(RetrievalTest, AProvidersClassIsAskedInTheProvidersNamespaceOnItsOwnConnection)
{
    const auto target = Serve("CIM_A", {});
    fServed.fModel.addClass("root/vendor", Pegasus::CIMClass(CIMName("CIM_A")));
    const auto before = fServed.fPeer.connectionCount();
    target->SetProvider(fServed.MakeProvider("root/vendor"));
    Enumerate(*target);
    EXPECT_EQ(before + 1, fServed.fPeer.connectionCount());
    const auto requests = fServed.fPeer.requests();
    EXPECT_EQ("root/vendor", requests.back().object());
    EXPECT_EQ("root/vendor", requests[requests.size() - 2].object());
    EXPECT_THAT(fServed.Log(), ::testing::Contains("3|TPEGASUSClass:EnumerateInstances. Calling NSP =  root/vendor"));
    // One instance by path alone is looked for in the class's own namespace.
    target->GetInstance(ReferenceTo("x"), {});
    EXPECT_EQ("root/cimv2", fServed.fPeer.requests().back().object());
    target->GetInstanceWithNsp(ReferenceTo("x"), {});
    EXPECT_EQ("root/vendor", fServed.fPeer.requests().back().object());
}

TEST_F(RetrievalTest, AClassOfAnotherServerNamespaceIsServedFromThereInEverything)
{
    const std::string path = "V.Peer=\"root/vendor:V_Peer.K=1\"";
    fServed.fModel.addClass("root/vendor", Pegasus::CIMClass(CIMName("V")))
        .addClass("root/vendor", Pegasus::CIMClass(CIMName("V_Peer")))
        .addInstance("root/vendor", Instance("V", path, {Property("Peer", CIMObjectPath("V_Peer.K=1"))}))
        .addMethod("Go", [](const test::PeerRequest& request) { return test::methodAnswer(request, CIMValue(true)); });
    const auto lastNamespace = [&] { return fServed.fPeer.requests().back().object(); };
    const auto found = fServed.fNamespace->GetInstance(ReferenceTo(path), {{"nsp", "root/vendor"}, {"timeout", "9"}});
    EXPECT_TRUE(found);
    EXPECT_EQ("root/vendor", lastNamespace());
    const auto target = fServed.Class("V"); // from the cache
    EXPECT_EQ(9000U, target->GetDefaultTimeoutMs());
    const auto instances = Enumerate(*target);
    ASSERT_EQ(1U, instances.size());
    const auto peer = ValueOf(*instances[0], "Peer").GetReferencedClass();
    EXPECT_EQ("V_Peer", peer ? peer->GetName({}) : "none");
    TCIMContext none;
    EXPECT_EQ(TCIMValue(true), instances[0]->InvokeMethod("Go", none, {}));
    EXPECT_EQ(0U, lastNamespace().find("root/vendor"));
    EXPECT_EQ(TCIMValue(true), target->InvokeMethod(ReferenceTo("V.K=1"), "Go", {}, none, {}));
    EXPECT_EQ(0U, lastNamespace().find("root/vendor"));
}

TEST_F(RetrievalTest, TheRecordClassLogsWhatItJoins)
{
    const char* name = "CIM_RecordAppliesToElement";
    const auto target = Serve(
        name, {Instance(name, std::string(name) + ".K=1", {Property("Antecedent", CIMObjectPath("CIM_Y.Key=\"1\""))})});
    Enumerate(*target);
    const auto lines = fServed.Log();
    ASSERT_EQ(5U, lines.size());
    EXPECT_EQ("3|TPEGASUSClass::EnumerateInstances Antecedent = CIM_Y.Key=\"1\" Dependent", lines[3]);
    ASSERT_TRUE(target->GetInstanceWithNsp(ReferenceTo(std::string(name) + ".K=1"), {{"nsp", std::string("n")}}));
    EXPECT_EQ(std::vector<std::string>(
                  {std::string("3|Entering TPEGASUSClass::GetInstanceWithNsp class = ") + name + " nsp = n",
                   "3|TPEGASUSClass:GetInstanceWithNsp. Calling NSP =  root/cimv2",
                   std::string("3|DEBUG: TPEGASUSClass:GetInstanceWithNsp get instance of ") + name,
                   std::string("3|objPath from Pegasus : ") + name + ".K=1",
                   std::string("3|TPEGASUSClass:GetInstanceWithNsp ObjectPath matched : ") + name + ".K=1",
                   "3|TPEGASUSClass::GetInstanceWithNsp Antecedent = CIM_Y.Key=\"1\" Dependent",
                   "3|TPEGASUSClass::GetInstanceWithNsp nsp="}),
              fServed.Log());
}

// The path of the server's instance and the path that the host makes of the keys are the same text.
TEST_F(RetrievalTest, AnInstanceIsFoundByItsOwnReference)
{
    const std::pair<const char*, CIMValue> keys[] = {
        {"bText", Pegasus::String("a\"b")},
        {"Aletter", Pegasus::Char16(0xe9)},
        {"dReal", Pegasus::Real64(0.1)},
        {"Csingle", Pegasus::Real32(0.1F)},
        {"fFlag", true},
        {"Enumber", Pegasus::Sint64(-5)},
        {"_g", Pegasus::Uint64(1) << 63},
        {"H1", CIMValue(Pegasus::CIMDateTime("00000003040506.000000:000"))},
    };
    Pegasus::CIMClass keyed{CIMName("CIM_A")};
    Pegasus::CIMInstance instance{CIMName("CIM_A")};
    for (const auto& [name, value] : keys) {
        keyed.addProperty(Property(name, CIMValue(value.getType(), false), "Key"));
        instance.addProperty(Property(name, value));
    }
    instance.setPath(instance.buildPath(keyed));
    fServed.fModel.addClass(kNsp, keyed);
    fServed.fModel.addInstance(kNsp, instance);
    const auto target = fServed.Class("CIM_A");
    const auto instances = Enumerate(*target);
    ASSERT_EQ(1U, instances.size());
    const TCIMReference reference = instances[0]->GetReference({});
    EXPECT_TRUE(target->GetInstance(reference, {})) << reference.GetPath();
}

TEST_F(RetrievalTest, OneInstanceIsTheFirstWhosePathMatchesToTheLetter)
{
    const auto target =
        Serve("CIM_A", {Instance("CIM_A", "CIM_A.A=1,B=2", {Property("P", CIMValue(Pegasus::Uint8(1)))}),
                        Instance("CIM_A", "CIM_A.A=3", {Property("P", CIMValue(Pegasus::Uint8(2)))}),
                        Instance("CIM_A", "CIM_A.A=3", {Property("P", CIMValue(Pegasus::Uint8(3)))})});
    struct
    {
        const char* fPath;
        int fValue; // 0: none
    } const rows[] = {{"CIM_A.A=1,B=2", 1},
                      {"CIM_A.B=2,A=1", 0},
                      {"cim_a.A=1,B=2", 0},
                      {"CIM_A.a=1,B=2", 0},
                      {"root/cimv2:CIM_A.A=1,B=2", 0},
                      {"CIM_A.A=3", 2},
                      {"CIM_A.A=\"3\"", 0},
                      {"", 0}};
    const std::function<boost::shared_ptr<ICIMInstance>(const TCIMReference&)> routes[] = {
        [&](const TCIMReference& reference) { return target->GetInstance(reference, {}); },
        [&](const TCIMReference& reference) { return target->GetInstanceWithNsp(reference, {}); },
    };
    for (const auto& row : rows) {
        for (const auto& route : routes) {
            SCOPED_TRACE(row.fPath);
            const auto got = route(ReferenceTo(row.fPath));
            EXPECT_EQ(row.fValue, got ? static_cast<int>(ValueOf(*got, "P")) : 0);
        }
    }
    fServed.Log();
    const auto got = target->GetInstance(ReferenceTo("CIM_A.A=3"), {});
    EXPECT_EQ("", got->GetPegasusNSPStr());
    auto lines = fServed.Log();
    ASSERT_EQ(6U, lines.size());
    EXPECT_EQ("3|TPEGASUSClass::GetInstance : CIM_A\nWith path = CIM_A.A=3", lines[0]);
    EXPECT_THAT(lines[1], ::testing::MatchesRegex("3.DEBUG: TPEGASUSClass:GetInstance pegclient object before "
                                                  "GetInstance call \\(0x[0-9a-f]+\\)\n"));
    EXPECT_EQ("3|DEBUG: TPEGASUSClass:GetInstance get instance of CIM_A instance size 3", lines[2]);
    EXPECT_EQ("3|objPath from Pegasus : CIM_A.A=1,B=2", lines[3]);
    EXPECT_EQ("3|objPath from Pegasus : CIM_A.A=3", lines[4]);
    EXPECT_EQ("3|TPEGASUSClass:GetInstance ObjectPath matched : CIM_A.A=3", lines[5]);
    TCIMReference viaNamespace = ReferenceTo("CIM_A.A=3");
    EXPECT_TRUE(fServed.fNamespace->GetInstance(viaNamespace, {}));
}

} // namespace
} // namespace NKOLVRX20
