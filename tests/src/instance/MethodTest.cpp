// SPDX-License-Identifier: MIT
// Methods called through an instance and through a class.
#include "src/instance/TPEGASUSInstance.h"
#include "tests/src/schema/ServedNamespace.h"

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

using Pegasus::CIMName;
using Pegasus::CIMValue;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

std::size_t CountOf(const std::string& text, const std::string& part)
{
    std::size_t count = 0;
    for (auto at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) {
        ++count;
    }
    return count;
}

Pegasus::CIMParameter Parameter(const char* name, const std::vector<const char*>& qualifiers)
{
    Pegasus::CIMParameter parameter(CIMName(name), Pegasus::CIMTYPE_REFERENCE, false, 0, CIMName("CIM_Y"));
    for (const char* qualifier : qualifiers) {
        parameter.addQualifier(TrueQualifier(qualifier));
    }
    return parameter;
}

TCIMReference ReferenceTo(const std::string& path)
{
    TCIMReference reference;
    reference.SetPath(path);
    return reference;
}

class MethodTest : public ::testing::Test
{
  protected:
    MethodTest()
    {
        Pegasus::CIMClass source(CIMName("CIM_A"));
        Pegasus::CIMMethod method(CIMName("Go"), Pegasus::CIMTYPE_UINT32);
        method.addParameter(Parameter("None", {}))
            .addParameter(Parameter("OnlyIn", {"In"}))
            .addParameter(Parameter("OnlyOut", {"Out"}))
            .addParameter(Parameter("Both", {"In", "Out"}));
        source.addMethod(method);
        Pegasus::CIMInstance instance(CIMName("CIM_A"));
        instance.setPath(Pegasus::CIMObjectPath("CIM_A.K=\"1\""));
        fServed.fModel.addClass(kNsp, source).addInstance(kNsp, instance);
        fServed.fModel.addMethod(
            "Go", [this](const test::PeerRequest& request) { return test::methodAnswer(request, fReturn, fOutputs); });
        fClass = fServed.Class("CIM_A");
        fClass->EnumerateInstances(
            [&](const boost::shared_ptr<ICIMInstance>& got) {
                fInstance = got;
                return false;
            },
            true, {});
        fServed.Log();
    }

    std::string LastBody() const { return fServed.fPeer.requests().back().body; }

    TServedNamespace fServed;
    CIMValue fReturn{Pegasus::Uint32(7)};
    std::vector<Pegasus::CIMParamValue> fOutputs;
    boost::shared_ptr<TPEGASUSClass> fClass;
    boost::shared_ptr<ICIMInstance> fInstance;
};

TEST_F(MethodTest, AnInstanceSendsEveryParameterAsAReferenceOncePerDirection)
{
    const TCIMValue path(std::string("CIM_Y.Key=\"9\""));
    TCIMContext parameters = {{"none", path}, {"onlyin", path}, {"OnlyOut", path}, {"Both", path}};
    EXPECT_EQ(TCIMValue(7U), fInstance->InvokeMethod("go", parameters, {}));
    EXPECT_EQ(300000U, fServed.TimeoutMs());
    const std::string body = LastBody();
    EXPECT_EQ(0U, CountOf(body, "PARAMVALUE NAME=\"none\""));
    EXPECT_EQ(1U, CountOf(body, "PARAMVALUE NAME=\"onlyin\""));
    EXPECT_EQ(1U, CountOf(body, "PARAMVALUE NAME=\"OnlyOut\""));
    EXPECT_EQ(2U, CountOf(body, "PARAMVALUE NAME=\"Both\""));
    EXPECT_EQ(4U, CountOf(body, "PARAMTYPE=\"reference\""));
    EXPECT_EQ(4U, CountOf(body, "<INSTANCENAME CLASSNAME=\"CIM_Y\">"));
    EXPECT_LT(body.find("NAME=\"Both\""), body.find("NAME=\"OnlyOut\"")); // in the map's order
    EXPECT_THAT(body, HasSubstr("<INSTANCENAME CLASSNAME=\"CIM_A\">"));
    EXPECT_THAT(fServed.Log(), IsEmpty());
}

TEST_F(MethodTest, OutputsReplaceWhatIsThereInBothRoutes)
{
    Pegasus::Array<Pegasus::Uint8> bytes;
    bytes.append(9);
    fOutputs = {Pegasus::CIMParamValue("Both", CIMValue(Pegasus::Uint16(2))),
                Pegasus::CIMParamValue("List", CIMValue(bytes)),
                Pegasus::CIMParamValue("New", CIMValue(Pegasus::String("n"))),
                Pegasus::CIMParamValue("Peer", CIMValue(Pegasus::CIMObjectPath("CIM_Y.Key=\"9\"")))};
    TCIMContext parameters = {{"Both", TCIMValue(std::string("CIM_Y.Key=\"9\""))}};
    fInstance->InvokeMethod("Go", parameters, {});
    TCIMReference peer = ReferenceTo("CIM_Y.Key=\"9\"");
    peer.SetNamespace(fServed.fNamespace);
    const TCIMContext expected = {
        {"Both", TCIMValue(static_cast<unsigned short>(2))},
        {"List", TCIMValue(TCIMValue::TCIMType::kUint8, 0, {TCIMValue(static_cast<unsigned char>(9))})},
        {"New", TCIMValue(std::string("n"))},
        {"Peer", TCIMValue(peer)}};
    EXPECT_EQ(expected, parameters);
    const std::string adding = "3|adding output param : ";
    EXPECT_THAT(fServed.Log(), ElementsAre(adding + "Both", adding + "List", adding + "New", adding + "Peer"));

    TCIMReference target = ReferenceTo("CIM_A.K=\"1\"");
    TCIMContext outputs = {{"Both", TCIMValue(1)}};
    EXPECT_EQ(TCIMValue(7U), fClass->InvokeMethod(target, "Go", {}, outputs, {}));
    EXPECT_EQ(expected, outputs);
    EXPECT_THAT(fServed.Log(), IsEmpty());
}

TEST_F(MethodTest, AClassSendsEveryParameterByItsOwnTypeAndLeavesTheTimeout)
{
    fServed.fNamespace->getPegClient()->setTimeout(4321);
    TCIMReference target = ReferenceTo("CIM_A.K=\"1\"");
    TCIMContext outputs;
    const TCIMContext inputs = {
        {"none", TCIMValue(5U)},
        {"Words", TCIMValue(TCIMValue::TCIMType::kUint16, 0, {TCIMValue(static_cast<unsigned short>(258))})}};
    EXPECT_EQ(TCIMValue(7U), fClass->InvokeMethod(target, "Go", inputs, outputs, {}));
    EXPECT_EQ(4321U, fServed.TimeoutMs());
    const std::string body = LastBody();
    EXPECT_EQ(1U, CountOf(body, "NAME=\"none\" PARAMTYPE=\"uint32\""));
    EXPECT_EQ(1U, CountOf(body, "NAME=\"Words\" PARAMTYPE=\"uint8\""));
    EXPECT_THAT(body, HasSubstr("<VALUE>2</VALUE>"));
}

TEST_F(MethodTest, AnInstanceSwallowsTheServersRefusalAndAClassPassesItOn)
{
    const auto refuse = [](const test::PeerRequest& request) {
        return test::errorAnswer(request, 1, "CIM_ERR_FAILED: no");
    };
    fServed.fModel.addFault("Go", refuse);
    TCIMContext parameters;
    EXPECT_TRUE(fInstance->InvokeMethod("Go", parameters, {}).IsNull());
    EXPECT_THAT(parameters, IsEmpty());
    EXPECT_THAT(fServed.Log(), ElementsAre("3|pegClient->invokeMethod returned exception: CIM_ERR_FAILED: no"));
    fServed.fModel.addFault("Go", refuse);
    TCIMReference target = ReferenceTo("CIM_A.K=\"1\"");
    EXPECT_THROW(fClass->InvokeMethod(target, "Go", {}, parameters, {}), Pegasus::CIMException);
    target.SetPath("not a path.");
    EXPECT_THROW(fClass->InvokeMethod(target, "Go", {}, parameters, {}), Pegasus::Exception);
    EXPECT_THAT(fServed.Log(), IsEmpty());
}

TEST_F(MethodTest, WhatIsNotDeclaredIsRefusedBeforeAnythingIsSent)
{
    fServed.TakeRequests();
    TCIMContext unknown = {{"Other", TCIMValue(1)}};
    EXPECT_EQ(6U, StatusOf([&] { fInstance->InvokeMethod("Go", unknown, {}); }));
    EXPECT_EQ(6U, StatusOf([&] { fInstance->InvokeMethod("Undeclared", unknown, {}); }));
    EXPECT_THAT(fServed.Log(),
                ElementsAre("0|TPEGASUSInstance::InvokeMethod failed: CIM_A.Go declares no parameter Other",
                            "0|TPEGASUSInstance::InvokeMethod failed: CIM_A.Undeclared is not declared"));
    TCIMContext none;
    EXPECT_TRUE(fClass->InvokeMethod("Go", none, {}).IsNull()); // without a target nothing is called
    EXPECT_THAT(fServed.TakeRequests(), IsEmpty());
}

TEST_F(MethodTest, AParameterThatDoesNotConvertIsRefusedBeforeAnythingIsSent)
{
    struct
    {
        const char* fName;
        bool fThroughInstance;
        TCIMValue fValue;
    } const rows[] = {
        {"instance: a number", true, TCIMValue(5)},
        {"instance: an empty text", true, TCIMValue(std::string())},
        {"instance: a null", true, TCIMValue()},
        {"instance: no path", true, TCIMValue(std::string("not a path."))},
        {"class: a typed null", false, TCIMValue(TCIMValue::TCIMType::kUint8, 0)},
        {"class: a reference that is not a path", false, TCIMValue(ReferenceTo("not a path."))},
        {"class: an empty reference", false, TCIMValue(ReferenceTo(""))},
    };
    fServed.TakeRequests();
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        TCIMContext parameters = {{"OnlyIn", row.fValue}}, outputs;
        EXPECT_EQ(14U, StatusOf([&] {
                      row.fThroughInstance
                          ? fInstance->InvokeMethod("Go", parameters, {})
                          : fClass->InvokeMethod(ReferenceTo("CIM_A.K=\"1\""), "Go", parameters, outputs, {});
                  }));
        EXPECT_THAT(fServed.Log(), ElementsAre(::testing::StartsWith(
                                       std::string(row.fThroughInstance ? "0|TPEGASUSInstance" : "0|TPEGASUSClass") +
                                       "::InvokeMethod failed: Go: parameter OnlyIn does not convert: ")));
    }
    EXPECT_THAT(fServed.TakeRequests(), IsEmpty());
}

TEST_F(MethodTest, ANullResultIsNullAndAnUnconnectedNamespaceAFailedCall)
{
    fReturn = CIMValue(Pegasus::CIMTYPE_UINT32, false);
    TCIMContext none;
    EXPECT_TRUE(fInstance->InvokeMethod("Go", none, {}).IsNull());
    const auto orphan = boost::make_shared<TPEGASUSClass>(fServed.fRig.MakeNamespace(), "CIM_A", nullptr);
    const auto ns = fServed.fRig.MakeNamespace();
    const auto unconnected = boost::make_shared<TPEGASUSClass>(ns, "CIM_A", nullptr);
    EXPECT_TRUE(unconnected->AllocateInstance({})->InvokeMethod("Go", none, {}).IsNull());
    EXPECT_EQ("3|pegClient->invokeMethod returned exception: not connected", fServed.Log().back());
    TCIMReference target = ReferenceTo("CIM_A.K=\"1\"");
    EXPECT_THROW(unconnected->InvokeMethod(target, "Go", none, none, {}), Pegasus::NotConnectedException);
    EXPECT_THROW(orphan->InvokeMethod(target, "Go", none, none, {}), boost::bad_weak_ptr);
}

} // namespace
} // namespace NKOLVRX20
