// Instances fetched from the server: what the host gets, how long the server has, and what the log says.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>

#include <boost/make_shared.hpp>

#include <host/ICIMProperty.h>
#include <host/TRootObject.h>

#include "src/instance/TPEGASUSInstance.h"
#include "src/schema/ServedNamespace.h"

namespace NKOLVRX20 {
namespace {

using Pegasus::CIMInstance;
using Pegasus::CIMName;
using Pegasus::CIMObjectPath;
using Pegasus::CIMValue;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

typedef TCIMValue::TCIMType TType;
typedef std::vector<boost::shared_ptr<TPEGASUSInstance>> TInstances;

CIMInstance Instance(const char* className, const std::string& path,
                     const std::vector<Pegasus::CIMProperty>& properties)
{
    CIMInstance instance{CIMName(className)};
    for (const Pegasus::CIMProperty& property : properties)
        instance.addProperty(property);
    instance.setPath(CIMObjectPath(Pegasus::String(path.c_str())));
    return instance;
}

class RetrievalTest : public ::testing::Test
{
  protected:
    // Returns: the class, whose log lines so far are forgotten.
    boost::shared_ptr<TPEGASUSClass> Serve(const char* name, const std::vector<CIMInstance>& instances,
                                           const std::string& timeout = "60")
    {
        fServed.fModel.addClass(kNsp, Pegasus::CIMClass(CIMName(name)));
        for (const CIMInstance& instance : instances)
            fServed.fModel.addInstance(kNsp, instance);
        const auto made = fServed.Class(name, timeout);
        fServed.Log();
        fServed.TakeRequests();
        return made;
    }

    static TInstances Enumerate(TPEGASUSClass& target, std::size_t limit = 99)
    {
        TInstances instances;
        target.EnumerateInstances(
            [&](const boost::shared_ptr<ICIMInstance>& instance) {
                instances.push_back(boost::dynamic_pointer_cast<TPEGASUSInstance>(instance));
                return instances.size() < limit;
            },
            true, {});
        return instances;
    }

    static TCIMValue ValueOf(const ICIMInstance& instance, const char* name)
    {
        return instance.GetProperty(name, {})->GetValue({});
    }

    static TCIMReference ReferenceTo(const std::string& path)
    {
        TCIMReference reference;
        reference.SetPath(path);
        return reference;
    }

    void FailNext(const char* operation, unsigned int code, const char* text)
    {
        fServed.fModel.addFault(
            operation, [=](const test::PeerRequest& request) { return test::errorAnswer(request, code, text); });
    }

    TServedNamespace fServed;
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
    EXPECT_EQ(1U, Enumerate(*target, 1).size()); // the visitor's false ends it
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

TEST_F(RetrievalTest, NamesAreTestedInTheServersSpelling)
{
    const CIMValue null(Pegasus::CIMTYPE_STRING, false);
    const auto target = Serve(
        "CIM_A",
        {Instance("CIM_A", "CIM_A.K=1",
                  {Property("InstanceID", null), Property("MyInstanceIDs", null), Property("instanceid2", null),
                   Property("InstanceID3", Pegasus::String("x")), Property("InstanceID4", CIMValue(Pegasus::Uint8(4))),
                   Property("Number", CIMValue(Pegasus::Uint32(70000)))})});
    const auto instances = Enumerate(*target);
    ASSERT_EQ(1U, instances.size());
    const ICIMInstance& got = *instances[0];
    for (const char* name : {"InstanceID", "MyInstanceIDs"}) {
        EXPECT_EQ(TCIMValue(std::string()), ValueOf(got, name)) << name;
    }
    EXPECT_TRUE(ValueOf(got, "instanceid2").IsNull());
    EXPECT_EQ(TCIMValue(std::string("x")), ValueOf(got, "InstanceID3"));
    EXPECT_EQ(TCIMValue(static_cast<unsigned char>(4)), ValueOf(got, "InstanceID4"));
    EXPECT_EQ(TCIMValue(70000U), ValueOf(got, "Number")); // only of slots
}

TEST_F(RetrievalTest, ASlotsNumberIsAlways16BitsWide)
{
    const auto slot = [](const char* name, const CIMValue& value) {
        return Instance("OMC_ProcessorSlot", "OMC_ProcessorSlot.K=1", {Property(name, value)});
    };
    const auto target = Serve("OMC_ProcessorSlot", {slot("Number", CIMValue(Pegasus::Uint32(70000))),
                                                    slot("Number", CIMValue(Pegasus::Uint8(3))),
                                                    slot("number", CIMValue(Pegasus::Uint32(70000))),
                                                    slot("Number", CIMValue(Pegasus::CIMTYPE_UINT32, false))});
    const auto instances = Enumerate(*target);
    ASSERT_EQ(4U, instances.size());
    EXPECT_EQ(TCIMValue(static_cast<unsigned short>(4464)), ValueOf(*instances[0], "Number"));
    EXPECT_EQ(TCIMValue(static_cast<unsigned short>(3)), ValueOf(*instances[1], "Number"));
    EXPECT_EQ(TCIMValue(70000U), ValueOf(*instances[2], "Number"));
    EXPECT_TRUE(ValueOf(*instances[3], "Number").IsNull());
    EXPECT_THAT(fServed.fRig.fLog.LinesWith("3|4"),
                ElementsAre("3|4TPEGASUSClass::EnumerateInstances - Unable to retrieve property: number"));
}

TEST_F(RetrievalTest, AReferenceKnowsItsClassWhenThePathSpellsItOut)
{
    fServed.fModel.addClass(kNsp, Pegasus::CIMClass(CIMName("CIM_Y")));
    const std::string reference = "\"root/cimv2:CIM_Y.Key=\\\"1\\\"\"";
    struct
    {
        const char* fName;
        std::string fPath;
        const char* fClass; // null: none
    } const rows[] = {
        {"spelt out", "CIM_L.Antecedent=" + reference, "CIM_Y"},
        {"two keys", "CIM_L.Antecedent=" + reference + ",Z=\"a:b.c\"", "CIM_Y"},
        {"a colon before it", "CIM_L.Aa=\"x:y\",Antecedent=" + reference, "CIM_Y"},
        {"property not in the path", "CIM_L.Dependent=" + reference, nullptr},
        {"no colon behind it", "CIM_L.Antecedent=\"CIM_Y\"", nullptr},
        {"no dot behind it", "CIM_L.Antecedent=\"root/cimv2:CIM_Y\"", nullptr},
        {"other case in the path", "CIM_L.antecedent=" + reference, nullptr},
        {"class not on the server", "CIM_L.Antecedent=\"root/cimv2:CIM_Gone.Key=\\\"1\\\"\"", nullptr},
    };
    const CIMObjectPath value("root/other:CIM_Y.Key=\"1\"");
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        const auto target = Serve("CIM_L", {});
        fServed.fModel.addFault("EnumerateInstances", [&](const test::PeerRequest& request) {
            return test::instancesAnswer(request, {Instance("CIM_L", row.fPath, {Property("Antecedent", value)})});
        });
        const auto instances = Enumerate(*target);
        ASSERT_EQ(1U, instances.size());
        const TCIMValue got = ValueOf(*instances[0], "Antecedent");
        const auto referenced = got.GetReferencedClass();
        EXPECT_EQ(row.fClass ? row.fClass : "", referenced ? referenced->GetName({}) : "");
        EXPECT_EQ("root/other:CIM_Y.Key=\"1\"", static_cast<TCIMReference>(got).GetPath());
        EXPECT_EQ(fServed.fNamespace, static_cast<TCIMReference>(got).GetNamespace());
    }
}

TEST_F(RetrievalTest, AReferenceToAClassWithABadNameCostsOnlyItself)
{
    const auto target = Serve("CIM_L", {});
    fServed.fModel.addFault("EnumerateInstances", [&](const test::PeerRequest& request) {
        return test::instancesAnswer(
            request, {Instance("CIM_L", "CIM_L.Antecedent=\"a:1b.c\"",
                               {Property("Antecedent", CIMObjectPath("CIM_Y.Key=\"1\"")),
                                Property("Gr\xC3\xB6n", CIMValue(true)), Property("Other", CIMValue(true))})});
    });
    const auto instances = Enumerate(*target);
    ASSERT_EQ(1U, instances.size());
    EXPECT_EQ(15U, StatusOf([&] { ValueOf(*instances[0], "Antecedent"); }));
    EXPECT_EQ(TCIMValue(true), ValueOf(*instances[0], "Other"));
    const std::string line = "3|4TPEGASUSClass::EnumerateInstances - Unable to retrieve property: ";
    EXPECT_THAT(fServed.fRig.fLog.LinesWith("3|4"), ElementsAre(line + "antecedent", line + "Gr\xC3\xB6n"));
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

TEST_F(RetrievalTest, ATimeoutSaysWhatMayBeLost)
{
    struct
    {
        const char* fClass;
        const char* fWarning;
    } const rows[] = {
        {"CIM_A", ""},
        {"VMware_HypervisorSoftwareIdentity", "(may cause 'Operating System' table lost)"},
        {"OMC_IpmiLogRecord", "(may cause 'IPMI Event' page  lost)"},
        {"VMware_ComponentSoftwareIdentity", "(may cause 'Installed Applications' page  lost)"},
        {"KOL_StandardMessageLogEntry", "(may cause 'Chassis Event log' page  lost)"},
        {"OMC_IpmiLogRecordX", ""},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fClass);
        const auto target = Serve(row.fClass, {});
        // While the client waits for the class, its next question's time is cut.
        fServed.fModel.addFault("GetClass", [&](const test::PeerRequest& request) {
            fServed.fNamespace->getPegClient()->setTimeout(50);
            return test::classAnswer(request, Pegasus::CIMClass(CIMName(row.fClass)));
        });
        fServed.fModel.addFault("EnumerateInstances", [](const test::PeerRequest&) { return test::noAnswer(); });
        EXPECT_THAT(Enumerate(*target), IsEmpty());
        EXPECT_EQ(std::string("0|Get Instances for: ") + row.fClass +
                      " returned ConnectionTimeoutException: connection timed out" + row.fWarning,
                  fServed.Log().back());
    }
}

TEST_F(RetrievalTest, AFailedCallIsLoggedByItsKindAndYieldsNothing)
{
    const std::function<test::PeerAnswer(const test::PeerRequest&)> cimError = [](const test::PeerRequest& request) {
        return test::errorAnswer(request, 1, "CIM_ERR_FAILED: no");
    };
    const std::function<test::PeerAnswer(const test::PeerRequest&)> closed = [](const test::PeerRequest&) {
        return test::notHttp();
    };
    const char* const operations[] = {"EnumerateInstances", "GetInstance", "GetInstanceWithNsp"};
    const auto target = Serve("CIM_A", {});
    for (const std::string operation : operations) {
        for (const bool isCimError : {true, false}) {
            SCOPED_TRACE(operation + (isCimError ? " CIM error" : " not HTTP"));
            fServed.fModel.addFault("EnumerateInstances", isCimError ? cimError : closed);
            fServed.Log();
            if (operation == "EnumerateInstances")
                EXPECT_THAT(Enumerate(*target), IsEmpty());
            else if (operation == "GetInstance")
                EXPECT_FALSE(target->GetInstance(ReferenceTo("x"), {}));
            else
                EXPECT_FALSE(target->GetInstanceWithNsp(ReferenceTo("x"), {}));
            EXPECT_EQ(isCimError ? "3|DEBUG1:TPEGASUSClass::" + operation +
                                       " from Pegasus for: CIM_A returned exception: CIM_ERR_FAILED: no"
                                 : "3|TPEGASUSClass::" + operation + " from Pegasus for: CIM_A returned exception: " +
                                       "Malformed HTTP response message.",
                      fServed.Log().back());
        }
    }
}

TEST_F(RetrievalTest, AClassThatTheServerLostIsNotEnumerated)
{
    const auto target = Serve("CIM_A", {});
    for (const std::string operation : {"EnumerateInstances", "GetInstanceWithNsp"}) {
        FailNext("GetClass", 6, "CIM_ERR_NOT_FOUND: CIM_A");
        if (operation == "EnumerateInstances")
            EXPECT_THAT(Enumerate(*target), IsEmpty());
        else
            EXPECT_FALSE(target->GetInstanceWithNsp(ReferenceTo("x"), {}));
        EXPECT_EQ("0|TPEGASUSClass:" + operation +
                      ". NSP :root/cimv2 Do not have class CIM_Awith pegasus exeption: CIM_ERR_NOT_FOUND: CIM_A",
                  fServed.Log().back());
    }
    EXPECT_THAT(fServed.TakeRequests(), ElementsAre("GetClass CIM_A", "GetClass CIM_A"));
}

TEST_F(RetrievalTest, WithoutATimeASingleInstanceIsNotWaitedFor)
{
    const auto target = Serve("CIM_A", {}, "0");
    EXPECT_FALSE(target->GetInstance(ReferenceTo("x"), {}));
    EXPECT_EQ("3|TPEGASUSClass::GetInstance from Pegasus for: CIM_A returned exception: connection timed out",
              fServed.Log().back());
}

TEST_F(RetrievalTest, WithoutAConnectionEveryOperationAnswersAsForAFailedCall)
{
    const auto target = Serve("CIM_A", {});
    target->SetProvider(boost::make_shared<TPEGASUSProvider>()); // never connected: it has no client
    EXPECT_THAT(Enumerate(*target), IsEmpty());
    EXPECT_EQ("3|TPEGASUSClass::EnumerateInstances from Pegasus for: CIM_A returned exception: not connected",
              fServed.Log().back());
    const auto unconnected = fServed.fRig.MakeNamespace();
    const auto orphan = boost::make_shared<TPEGASUSClass>(unconnected, "CIM_A", nullptr);
    EXPECT_FALSE(orphan->GetInstance(ReferenceTo("x"), {}));
    EXPECT_EQ("3|TPEGASUSClass::GetInstance from Pegasus for: CIM_A returned exception: not connected",
              fServed.Log().back());
    EXPECT_EQ(42U, StatusOf([&] { orphan->Initialize(kNsp, "60", nullptr); }));
    EXPECT_THAT(fServed.TakeRequests(), IsEmpty());
}

// Is the core logger and throws when a property is lost: the way in which a whole instance can fail.
class TFailingLogger : public ILogger
{
  public:
    explicit TFailingLogger(std::function<void()> failure) : fFailure(std::move(failure))
    {
        fReplaced = TRootObject::SetCoreLogger(this);
    }
    ~TFailingLogger() override { TRootObject::SetCoreLogger(fReplaced); }
    TFailingLogger(const TFailingLogger&) = delete;
    TFailingLogger& operator=(const TFailingLogger&) = delete;

    void Log(EVRXLogSeverity severity, const std::string& text) override
    {
        if (text.find("Unable to retrieve property") != std::string::npos)
            fFailure();
        fLines.push_back(std::to_string(severity) + "|" + text);
    }

    std::vector<std::string> fLines;

  private:
    const std::function<void()> fFailure;
    ILogger* fReplaced;
};

TEST_F(RetrievalTest, AnInstanceThatCannotBeBuiltIsSkipped)
{
    const auto good = [](const char* path) { return Instance("CIM_A", path, {Property("P", CIMValue(true))}); };
    const auto target =
        Serve("CIM_A", {good("CIM_A.K=0"), Instance("CIM_A", "CIM_A.K=1", {Property("Gr\xC3\xB6n", CIMValue(true))}),
                        good("CIM_A.K=2")});
    struct
    {
        const char* fName;
        std::function<void()> fFailure;
        const char* fLine;
    } const rows[] = {
        {"Pegasus", [] { throw Pegasus::CIMException(Pegasus::CIM_ERR_FAILED, "bad"); },
         "3|DEBUG3:TPEGASUSClass::EI Error from Pegasus for: CIM_A, pegInst 1 returned exception: bad"},
        {"host", [] { throw TVRXException(14); }, "3|DEBUG2:TPEGASUSClass::EI VRX Error for: CIM_A, pegInst 1"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        TFailingLogger log(row.fFailure);
        EXPECT_EQ(2U, Enumerate(*target).size());
        EXPECT_THAT(log.fLines, ::testing::Contains(row.fLine));
        EXPECT_FALSE(target->GetInstance(ReferenceTo("CIM_A.K=1"), {}));
        EXPECT_TRUE(target->GetInstance(ReferenceTo("CIM_A.K=2"), {}));
        EXPECT_EQ(2, std::count(log.fLines.begin(), log.fLines.end(), row.fLine));
    }
}

TEST_F(RetrievalTest, TheVisitorsOwnExceptionReachesTheHost)
{
    const auto target = Serve("CIM_A", {Instance("CIM_A", "CIM_A.K=1", {}), Instance("CIM_A", "CIM_A.K=2", {})});
    int visits = 0;
    EXPECT_EQ(77U, StatusOf([&] {
                  target->EnumerateInstances(
                      [&](const auto&) -> bool {
                          ++visits;
                          throw TVRXException(77);
                      },
                      true, {});
              }));
    EXPECT_EQ(1, visits);
}

TEST_F(RetrievalTest, AnInstanceHeldByTheHostOutlivesTheNamespaceAndDoesNotKeepIt)
{
    auto target =
        Serve("CIM_A", {Instance("CIM_A", "CIM_A.K=1", {Property("Antecedent", CIMObjectPath("CIM_Y.Key=\"1\""))})});
    const auto instances = Enumerate(*target);
    ASSERT_EQ(1U, instances.size());
    const boost::weak_ptr<TPEGASUSNamespace> watched(fServed.fNamespace);
    fServed.fNamespace.reset();
    EXPECT_TRUE(watched.expired());
    const TCIMValue held = ValueOf(*instances[0], "Antecedent");
    EXPECT_EQ("CIM_Y.Key=\"1\"", held.ToString(10));
    EXPECT_FALSE(static_cast<TCIMReference>(held).GetNamespace());
    TCIMContext none;
    EXPECT_THROW(instances[0]->InvokeMethod("Go", none, {}), boost::bad_weak_ptr);
}

} // namespace
} // namespace NKOLVRX20
