// SPDX-License-Identifier: MIT
// The values of an instance: names, the two special properties, references.
#include "tests/src/instance/RetrievalFixture.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

using Pegasus::CIMName;
using Pegasus::CIMObjectPath;
using Pegasus::CIMValue;
using ::testing::ElementsAre;

class InstanceValuesTest : public TRetrievalFixture
{
};

TEST_F(InstanceValuesTest, NamesAreTestedInTheServersSpelling)
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

TEST_F(InstanceValuesTest, ASlotsNumberIsAlways16BitsWide)
{
    const auto slot = [](const char* name, const CIMValue& value) {
        return Instance("OMC_ProcessorSlot", "OMC_ProcessorSlot.K=1", {Property(name, value)});
    };
    const auto target = Serve("OMC_ProcessorSlot", {slot("Number", CIMValue(Pegasus::Uint32(70000))),
                                                    slot("Number", CIMValue(Pegasus::Uint8(3))),
                                                    slot("number", CIMValue(Pegasus::Uint32(70000))),
                                                    slot("Number", CIMValue(Pegasus::CIMTYPE_UINT32, false)),
                                                    slot("NumberOfPins", CIMValue(Pegasus::Uint32(70000)))});
    const auto instances = Enumerate(*target);
    ASSERT_EQ(5U, instances.size());
    EXPECT_EQ(TCIMValue(70000U), ValueOf(*instances[4], "NumberOfPins"));
    EXPECT_EQ(TCIMValue(static_cast<unsigned short>(4464)), ValueOf(*instances[0], "Number"));
    EXPECT_EQ(TCIMValue(static_cast<unsigned short>(3)), ValueOf(*instances[1], "Number"));
    EXPECT_EQ(TCIMValue(70000U), ValueOf(*instances[2], "Number"));
    EXPECT_TRUE(ValueOf(*instances[3], "Number").IsNull());
    EXPECT_THAT(fServed.fRig.fLog.LinesWith("3|4"),
                ElementsAre("3|4TPEGASUSClass::EnumerateInstances - Unable to retrieve property: number"));
}

TEST_F(InstanceValuesTest, EachInstanceHasItsOwnValuesWhateverTheFirstOneHas)
{
    const auto words = [](const char* last) {
        Pegasus::Array<Pegasus::String> array;
        array.append("a");
        array.append(last);
        return CIMValue(array);
    };
    const CIMValue null(Pegasus::CIMTYPE_STRING, false);
    const std::string noon = "20261122120000.000000+000";
    const std::string sameNoon = "20261122130000.000000+060"; // in another time zone
    const auto time = [](const std::string& text) { return Pegasus::CIMDateTime(Pegasus::String(text.c_str())); };
    struct
    {
        const char* fName;
        std::vector<CIMValue> fServed; // one for each instance
        std::vector<std::string> fTexts;
    } const rows[] = {
        {"Text", {null, Pegasus::String("x"), Pegasus::String("xy"), Pegasus::String("x")}, {"", "x", "xy", "x"}},
        {"Words", {words("b"), words("b"), words("c"), null}, {"a, b", "a, b", "a, c", ""}},
        {"Number", {Pegasus::Uint8(7), Pegasus::Uint8(7), Pegasus::Uint8(8), Pegasus::Uint8(7)}, {"7", "7", "8", "7"}},
        {"Other",
         {Pegasus::Uint8(7), Pegasus::Uint16(7), CIMValue(true), Pegasus::String("7")},
         {"7", "7", "true", "7"}},
        {"Zero", {0.0, -0.0, 0.0, -0.0}, {"0", "-0", "0", "-0"}},
        {"When", {time(noon), time(sameNoon), null, time(noon)}, {noon, sameNoon, "", noon}},
    };
    std::vector<Pegasus::CIMInstance> served;
    for (std::size_t i = 0; i < 4; ++i) {
        std::vector<Pegasus::CIMProperty> properties;
        for (const auto& row : rows) {
            properties.push_back(Property(row.fName, row.fServed[i]));
        }
        served.push_back(Instance("CIM_A", "CIM_A.K=" + std::to_string(i), properties));
    }
    const auto instances = Enumerate(*Serve("CIM_A", served));
    ASSERT_EQ(4U, instances.size());
    TCIMValue changed = ValueOf(*instances[0], "Words");
    static_cast<std::vector<TCIMValue>&>(changed)[0] = TCIMValue("changed");
    for (const auto& row : rows) {
        for (std::size_t i = 0; i < 4; ++i) {
            const TCIMValue got = ValueOf(*instances[i], row.fName);
            EXPECT_EQ(row.fTexts[i], got.ToString(10)) << row.fName << " of instance " << i;
            if (!got.IsNull()) {
                EXPECT_EQ(int(row.fServed[i].getType()) + 1, int(got.GetType())) << row.fName << " of instance " << i;
            }
        }
    }
}

TEST_F(InstanceValuesTest, AReferenceKnowsItsClassWhenThePathSpellsItOut)
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
        {"no colon after it", "CIM_L.Antecedent=\"CIM_Y\"", nullptr},
        {"no dot after it", "CIM_L.Antecedent=\"root/cimv2:CIM_Y\"", nullptr},
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

TEST_F(InstanceValuesTest, WhatFailsInOnePropertyCostsThatOneAndABadClassNameNotEvenThat)
{
    const auto target = Serve("CIM_L", {});
    fServed.fModel.addFault("GetClass", [](const test::PeerRequest& request) { // asked for before the instances
        return test::classAnswer(request, Pegasus::CIMClass(CIMName("CIM_L")));
    });
    fServed.fModel.addFault("GetClass", [](const test::PeerRequest&) { return test::notHttp(); }); // of "Silent"
    fServed.fModel.addFault("EnumerateInstances", [&](const test::PeerRequest& request) {
        return test::instancesAnswer(
            request, {Instance("CIM_L", "CIM_L.Antecedent=\"a:1b.c\",Silent=\"a:CIM_Y.K\"",
                               {Property("Antecedent", CIMObjectPath("CIM_Y.Key=\"1\"")),
                                Property("Silent", CIMObjectPath("CIM_Y.Key=\"1\"")),
                                Property("Gr\xC3\xB6n", CIMValue(true)), Property("Other", CIMValue(true))})});
    });
    const auto instances = Enumerate(*target);
    ASSERT_EQ(1U, instances.size());
    const TCIMValue kept = ValueOf(*instances[0], "Antecedent");
    EXPECT_EQ("CIM_Y.Key=\"1\"", static_cast<TCIMReference>(kept).GetPath());
    EXPECT_FALSE(kept.GetReferencedClass());
    EXPECT_EQ(TCIMValue(true), ValueOf(*instances[0], "Other"));
    const std::string line = "3|4TPEGASUSClass::EnumerateInstances - Unable to retrieve property: ";
    EXPECT_THAT(fServed.fRig.fLog.LinesWith("3|4"), ElementsAre(line + "silent", line + "Gr\xC3\xB6n"));
    EXPECT_THAT(fServed.fRig.fLog.LinesWith("3|TPEGASUSClass::EnumerateInstances keeps"),
                ElementsAre("3|TPEGASUSClass::EnumerateInstances keeps reference property Antecedent of CIM_L without "
                            "its class: \"1b\" is not a class name"));
}

} // namespace
} // namespace NKOLVRX20
