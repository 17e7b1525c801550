// SPDX-License-Identifier: MIT
#include "host/inmem/TInmemClass.h"
#include "host/inmem/TInmemNamespace.h"
#include "host/inmem/TInmemProperty.h"

#include <host/ICIMProperty.h>
#include <host/TInmemInstance.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <map>

namespace NKOLVRX20 {
namespace {

using TType = TCIMValue::TCIMType;
using testing::ElementsAre;

boost::shared_ptr<TInmemClass> FanClass()
{
    const auto fan = boost::make_shared<TInmemClass>("CIM_Fan");
    fan->Declare("SystemName", TType::kString, true);
    fan->Declare("DeviceID", TType::kUint16, true);
    fan->Declare("Speed", TType::kUint32);
    return fan;
}

boost::shared_ptr<TInmemInstance> Fan(const boost::shared_ptr<ICIMClass>& fanClass, unsigned short id)
{
    const auto fan = boost::make_shared<TInmemInstance>(fanClass, TCIMContext());
    fan->SetPropertyValue("systemname", TCIMValue("a\"b\\c"), TCIMContext());
    fan->SetPropertyValue("DEVICEID", TCIMValue(id), TCIMContext());
    return fan;
}

TEST(TInmemInstance, NamesAreMatchedWithoutCaseAndOverwritten)
{
    const auto fan = Fan(FanClass(), 1);
    const auto property = fan->GetProperty("DeviceId", TCIMContext());
    fan->SetPropertyValue("deviceID", TCIMValue(static_cast<unsigned short>(9)), TCIMContext());
    EXPECT_EQ(property->GetValue(TCIMContext()), TCIMValue(static_cast<unsigned short>(9)));
    EXPECT_EQ(property->GetDeclaration(TCIMContext())->GetName(TCIMContext()), "DeviceID");
    std::vector<std::string> names;
    fan->EnumerateProperties(
        [&](boost::shared_ptr<ICIMProperty> each) {
            names.push_back(each->GetDeclaration(TCIMContext())->GetName(TCIMContext()));
            return true;
        },
        TCIMContext());
    EXPECT_THAT(names, ElementsAre("DeviceID", "SystemName"));
}

TEST(TInmemInstance, UnknownPropertiesAreKeptAndMissingOnesThrow)
{
    const auto fan = Fan(FanClass(), 1);
    fan->SetPropertyValue("Undeclared", TCIMValue(1), TCIMContext());
    EXPECT_FALSE(fan->GetProperty("undeclared", TCIMContext())->GetDeclaration(TCIMContext()));
    EXPECT_THROW(fan->GetProperty("Speed", TCIMContext()), TVRXException);
    EXPECT_THROW(fan->SetPropertyValue("1st", TCIMValue(1), TCIMContext()), TVRXException);
    EXPECT_THROW(fan->GetProperty("1st", TCIMContext()), TVRXException) << "a refused name left a property";
}

using TTexts = std::map<std::string, std::string>; // value by name

TTexts TextsOf(const ICIMInstance& instance)
{
    TTexts texts;
    instance.EnumerateProperties(
        [&](boost::shared_ptr<ICIMProperty> each) {
            texts[TInmemProperty::NameOf(*each)] = each->ToString();
            return true;
        },
        TCIMContext());
    return texts;
}

// Whatever the instances of a class share, each has the names that it was given, in any order, and its own values.
TEST(TInmemInstance, InstancesOfAClassDisturbNoOther)
{
    const struct
    {
        std::vector<std::string> fGiven;
        TTexts fExpected;
    } rows[] = {
        {{"systemname", "deviceid"}, {{"SystemName", "0"}, {"DeviceID", "1"}}},
        {{"deviceid", "systemname"}, {{"SystemName", "1"}, {"DeviceID", "0"}}},
        {{"deviceid", "DeviceID"}, {{"DeviceID", "1"}}},
        {{"Other", "speed", "systemname"}, {{"Other", "0"}, {"Speed", "1"}, {"SystemName", "2"}}},
        {{"systemname", "other"}, {{"SystemName", "0"}, {"other", "1"}}},
        {{"Other"}, {{"Other", "0"}}},
        {{}, {}},
    };
    const auto fan = FanClass();
    std::vector<boost::shared_ptr<TInmemInstance>> instances;
    for (const auto& row : rows) {
        instances.push_back(boost::make_shared<TInmemInstance>(fan, TCIMContext()));
        int value = 0;
        for (const std::string& name : row.fGiven) {
            instances.back()->SetPropertyValue(name, TCIMValue(value++), TCIMContext());
        }
    }
    for (std::size_t i = 0; i < instances.size(); ++i) {
        EXPECT_EQ(TextsOf(*instances[i]), rows[i].fExpected) << "instance " << i;
    }
}

// The second instance begins with the layout of the first: its properties lie together.
TEST(TInmemInstance, AVisitorMaySetValuesAndGiveTheInstanceOtherOnes)
{
    const auto fan = FanClass();
    const auto first = Fan(fan, 1);
    const auto second = Fan(fan, 2);
    second->SetPropertyValue("Undeclared", TCIMValue(2), TCIMContext());
    std::vector<boost::shared_ptr<ICIMProperty>> visited;
    second->EnumerateProperties(
        [&](boost::shared_ptr<ICIMProperty> each) {
            visited.push_back(each);
            second->SetPropertyValue("a" + std::to_string(visited.size()), TCIMValue(3), TCIMContext());
            second->SetPropertyValue("systemname", TCIMValue("set"), TCIMContext());
            if (visited.size() == 2) {
                *static_cast<ICIMInstance*>(second.get()) = *static_cast<const ICIMInstance*>(first.get());
            }
            return true;
        },
        TCIMContext());
    std::vector<std::string> texts;
    for (const auto& property : visited) {
        texts.push_back(property->ToString());
    }
    EXPECT_THAT(texts, ElementsAre("2", "set", "2"));
    EXPECT_EQ(TextsOf(*second), (TTexts{{"SystemName", "set"}, {"DeviceID", "1"}, {"a3", "3"}}));
    EXPECT_EQ(TextsOf(*first), (TTexts{{"SystemName", "a\"b\\c"}, {"DeviceID", "1"}}));
}

TEST(TInmemInstance, ADeclarationHoldsFromTheNextInstanceOn)
{
    const auto fan = FanClass();
    std::vector<boost::shared_ptr<TInmemInstance>> instances;
    const auto add = [&] {
        instances.push_back(boost::make_shared<TInmemInstance>(fan, TCIMContext()));
        instances.back()->SetPropertyValue("late", TCIMValue(1), TCIMContext());
    };
    add();
    const auto declaration = fan->Declare("LATE", TType::kSint32);
    add();
    EXPECT_FALSE(instances[0]->GetProperty("late", TCIMContext())->GetDeclaration(TCIMContext()));
    EXPECT_EQ(instances[1]->GetProperty("late", TCIMContext())->GetDeclaration(TCIMContext()), declaration);
    *static_cast<ICIMInstance*>(instances[1].get()) = *boost::make_shared<TInmemInstance>(nullptr, TCIMContext());
    EXPECT_EQ(TextsOf(*instances[1]), TTexts());
    EXPECT_EQ(TextsOf(*instances[0]), (TTexts{{"late", "1"}}));
}

TEST(TInmemInstance, PathHoldsTheKeysInTheOrderOfTheClass)
{
    const auto fanClass = FanClass();
    const auto ns = boost::make_shared<TInmemNamespace>();
    fanClass->SetNamespace(ns);
    const TCIMReference reference = Fan(fanClass, 7)->BuildPath(TCIMContext());
    EXPECT_EQ(reference.GetPath(), "CIM_Fan.SystemName=\"a\\\"b\\\\c\",DeviceID=7");
    EXPECT_EQ(reference.GetNamespace(), ns);
    EXPECT_EQ(reference.GetClassName(), "CIM_Fan");
    EXPECT_EQ(reference.GetKeys().at("DeviceID"), TCIMValue(static_cast<unsigned short>(7)));
}

struct TKeyRow
{
    const char* fName;
    TType::ECIMType fDeclared;
    TCIMValue fValue;
    const char* fText;
};

const TKeyRow kKeys[] = {
    {"boolean", TType::kBoolean, TCIMValue(true), "TRUE"},
    {"boolean set as text", TType::kBoolean, TCIMValue("false"), "FALSE"},
    {"lowest integer", TType::kSint64, TCIMValue(LONG_MIN), "-9223372036854775808"},
    {"integer of another width", TType::kUint8, TCIMValue(7), "7"},
    {"integer set as text", TType::kUint8, TCIMValue("7"), "7"},
    {"integer that does not convert", TType::kUint8, TCIMValue(300), "300"},
    {"text in a numeric key", TType::kUint8, TCIMValue("x y"), "\"x y\""},
    {"text of digits", TType::kString, TCIMValue(7), "\"7\""},
    {"real64", TType::kReal64, TCIMValue(0.1), "1.0000000000000001e-01"},
    {"real32", TType::kReal32, TCIMValue(0.5F), "5.0000000000000000e-01"},
    {"real set as integer", TType::kReal64, TCIMValue(-3), "-3.0000000000000000e+00"},
    {"longest real", TType::kReal64, TCIMValue(-1.7976931348623157e308), "-1.7976931348623157e+308"},
    {"char16", TType::kChar16, TCIMValue(TCIMChar16(0x41)), "\"A\""},
    {"char16 beyond ASCII", TType::kChar16, TCIMValue(TCIMChar16(0xe9)), "\"\xc3\xa9\""},
    {"datetime", TType::kDatetime, TCIMValue(TCIMDateTime("00000003040506.000000:000")),
     "\"00000003040506.000000:000\""},
    {"null", TType::kString, TCIMValue(), "\"\""},
};

TEST(TInmemInstance, PathHoldsEachKeyInItsDeclaredType)
{
    for (const TKeyRow& row : kKeys) {
        SCOPED_TRACE(row.fName);
        const auto keyed = boost::make_shared<TInmemClass>("CIM_A");
        keyed->Declare("K", row.fDeclared, true);
        const auto instance = boost::make_shared<TInmemInstance>(keyed, TCIMContext());
        instance->SetPropertyValue("k", row.fValue, TCIMContext());
        EXPECT_EQ(instance->GetReference(TCIMContext()).GetPath(), std::string("CIM_A.K=") + row.fText);
    }
}

TEST(TInmemInstance, EntersAndLeavesItsClass)
{
    const auto fanClass = FanClass();
    const auto fan = Fan(fanClass, 1);
    fan->AddToNamespace(TCIMContext());
    const auto served = [&fanClass] {
        std::vector<boost::shared_ptr<ICIMInstance>> instances;
        fanClass->EnumerateInstances(
            [&](boost::shared_ptr<ICIMInstance> each) { return instances.push_back(each), true; }, false, {});
        return instances;
    };
    EXPECT_THAT(served(), ElementsAre(fan));
    fan->Delete(TCIMContext());
    EXPECT_THAT(served(), ElementsAre());
}

struct TWithoutNamespace : TInmemInstance
{
    using TInmemInstance::TInmemInstance;
    using TInmemInstance::operator=;
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext) const override { throw boost::bad_weak_ptr(); }
};

TEST(TInmemInstance, ComparesAndCopiesByClassAndValues)
{
    const auto fanClass = FanClass();
    const auto one = Fan(fanClass, 1), same = Fan(fanClass, 1), two = Fan(fanClass, 2);
    two->SetPropertyValue("Undeclared", TCIMValue(1), TCIMContext());
    EXPECT_TRUE(*static_cast<ICIMInstance*>(one.get()) == *same);
    EXPECT_TRUE(*static_cast<ICIMInstance*>(one.get()) < *two);
    EXPECT_FALSE(*static_cast<ICIMInstance*>(two.get()) < *one);
    *static_cast<ICIMInstance*>(one.get()) = *static_cast<const ICIMInstance*>(two.get());
    EXPECT_TRUE(*static_cast<ICIMInstance*>(one.get()) == *two);
    same->ModifyInstance(two, TCIMContext());
    EXPECT_TRUE(*static_cast<ICIMInstance*>(same.get()) == *two);

    const auto orphan = boost::make_shared<TWithoutNamespace>(fanClass, TCIMContext());
    EXPECT_THROW(*static_cast<ICIMInstance*>(one.get()) = *orphan, boost::bad_weak_ptr);
    EXPECT_TRUE(*static_cast<ICIMInstance*>(one.get()) == *two);
}

TEST(TInmemProperty, OutlivesItsClassWithPlainText)
{
    boost::shared_ptr<ICIMProperty> property;
    {
        const auto fan = boost::make_shared<TInmemClass>("CIM_Fan");
        fan->Declare("X", TType::kSint32)->SetQualifier("Units", TCIMValue("Bytes"));
        const auto instance = boost::make_shared<TInmemInstance>(fan, TCIMContext());
        instance->SetPropertyValue("X", TCIMValue(1), TCIMContext());
        property = instance->GetProperty("X", TCIMContext());
        EXPECT_EQ(property->ToString(), "1 Bytes");
    }
    EXPECT_EQ(property->ToString(), "1");
    EXPECT_FALSE(property->GetDeclaration(TCIMContext()));
}

TEST(TInmemProperty, RemembersThePreviousValueAndTheDefault)
{
    const auto fan = boost::make_shared<TInmemClass>("CIM_Fan");
    fan->Declare("X", TType::kSint32)->SetDefaultValue(TCIMValue(1), TCIMContext());
    const auto instance = boost::make_shared<TInmemInstance>(fan, TCIMContext());
    instance->SetPropertyValue("X", TCIMValue(1), TCIMContext());
    const auto property = instance->GetProperty("X", TCIMContext());
    EXPECT_TRUE(property->IsDefaultValue(TCIMContext()));
    property->SetPrevValue();
    EXPECT_FALSE(property->IsPrevValueDifferent());
    property->SetValue(TCIMValue(2), TCIMContext());
    EXPECT_TRUE(property->IsPrevValueDifferent());
    EXPECT_FALSE(property->IsDefaultValue(TCIMContext()));
    EXPECT_EQ(property->PrevValueToString(), "1");
    EXPECT_EQ(property->GetPrevValue(), TCIMValue(1));
}

TEST(TInmemNamespace, ServesAsRepository)
{
    TInmemNamespace ns;
    const auto fanClass = FanClass();
    const auto fan = Fan(fanClass, 7);
    ns.AddClass(fanClass);
    ns.AddInstance(fan);
    const TCIMReference reference = fan->GetReference(TCIMContext());
    TCIMReference other;
    other.SetPath("CIM_Fan.DeviceID=8");
    EXPECT_EQ(ns.GetClass("cim_FAN", TCIMContext()), fanClass);
    EXPECT_FALSE(ns.GetClass("CIM_None", TCIMContext()));
    EXPECT_EQ(ns.GetInstance(reference, TCIMContext()), fan);
    EXPECT_FALSE(ns.GetInstance(other, TCIMContext()));
    ns.ModifyInstance(reference, {{"Speed", TCIMValue(5u)}}, TCIMContext());
    EXPECT_EQ(fan->GetProperty("speed", TCIMContext())->GetValue(TCIMContext()), TCIMValue(5u));
    EXPECT_THROW(ns.ModifyInstance(other, {}, TCIMContext()), TVRXException);
    EXPECT_THROW(ns.DeleteInstance(other, TCIMContext()), TVRXException);
    ns.DeleteInstance(reference, TCIMContext());
    EXPECT_FALSE(ns.GetInstance(reference, TCIMContext()));
    EXPECT_FALSE(ns.GetQualifierDecl("Key", TCIMContext()));
}

} // namespace
} // namespace NKOLVRX20
