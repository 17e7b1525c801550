// SPDX-License-Identifier: MIT
// The declaration elements and their qualifiers, and the texts of a property.
#include "src/schema/TPEGASUSProperty.h"
#include "src/schema/TPEGASUSQualifierDecl.h"
#include "tests/src/schema/ServedNamespace.h"

#include <host/ICIMMethodDecl.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

using TType = TCIMValue::TCIMType;
using TDecl = ICIMQualifierDecl;

class DeclarationTest : public ::testing::Test
{
  protected:
    DeclarationTest() : fClass(boost::make_shared<TPEGASUSClass>(fNamespace, "CIM_A", nullptr)) {}

    boost::shared_ptr<ICIMQualifierDecl> QualifierDecl(const char* name, const TCIMValue& value)
    {
        return fNamespace->AllocateQualifierDecl(name, value, TDecl::kScopeAny, TDecl::kFlavorOverridable, {});
    }

    void Qualify(ICIMNamedElement& element, const char* name, const TCIMValue& value)
    {
        element.AllocateQualifier(QualifierDecl(name, value), value, {})->AddToClassOrProperty({});
    }

    static TCIMValue Texts(const std::vector<std::string>& texts)
    {
        return TCIMValue(TType::kString, 0, std::vector<TCIMValue>(texts.begin(), texts.end()));
    }

    TNamespaceRig fRig;
    boost::shared_ptr<TPEGASUSNamespace> fNamespace = fRig.MakeNamespace();
    boost::shared_ptr<TPEGASUSClass> fClass;
};

TEST_F(DeclarationTest, EveryElementHoldsItsQualifiersByNameWithoutCase)
{
    const auto property = fClass->AllocatePropertyDecl("P", 1, {});
    const auto method = fClass->AllocateMethodDecl("M", TType::kUint8, {});
    const auto parameter = method->AllocateParameterDecl("X", TType::kUint8Array, {});
    ICIMNamedElement* const elements[] = {property.get(), method.get(), parameter.get()};
    for (ICIMNamedElement* element : elements) {
        Qualify(*element, "Second", std::string("2"));
        Qualify(*element, "First", std::string("1"));
        bool found = false;
        const auto first = element->GetQualifier("FIRST", found, {});
        ASSERT_TRUE(found);
        EXPECT_EQ("First", first->GetName({}));
        EXPECT_EQ(element, first->GetClassOrProperty({}).get());
        EXPECT_EQ(TDecl::kFlavorOverridable, first->GetFlavor({}));
        EXPECT_FALSE(element->GetQualifier("Third", found, {}));
        EXPECT_FALSE(found);
        EXPECT_EQ(14U, StatusOf([&] { element->AllocateQualifier(nullptr, 1, {}); }));
        EXPECT_EQ(14U, StatusOf([&] { element->AddQualifier(nullptr, {}); }));
        EXPECT_EQ(25U, StatusOf([&] { element->GetQualifier("1", {}); }));
        std::vector<std::string> names;
        element->EnumerateQualifiers(
            [&](const auto& qualifier) {
                names.push_back(qualifier->GetName({}));
                return true;
            },
            {});
        EXPECT_THAT(names, ElementsAre("First", "Second"));
    }
    parameter->AddToMethod({});
    EXPECT_EQ(parameter, method->GetParameterDecl("x", {}));
    EXPECT_TRUE(parameter->IsArray({}));
    EXPECT_EQ(method, parameter->GetMethodDecl({}));
    int visits = 0;
    method->EnumerateParameterDecls([&](const auto&) { return ++visits != 0; }, {});
    EXPECT_EQ(1, visits);
    EXPECT_EQ(fClass, method->GetClass({}));
    EXPECT_EQ(31U, StatusOf([&] { property->RemoveFromClass({}); }));
}

// The first is named "A", the second "B".
template <typename TElement> void ExpectComparedByNameAndNeverAssigned(TElement& first, TElement& second)
{
    EXPECT_TRUE(first < second && !(first == second));
    first = second;
    EXPECT_EQ("A", first.GetName({}));
    EXPECT_NO_THROW(first.Validate({}));
}

TEST_F(DeclarationTest, ElementsCompareByNameAndAssignNothing)
{
    const auto method = fClass->AllocateMethodDecl("A", TType::kUint8, {});
    ExpectComparedByNameAndNeverAssigned(*method, *fClass->AllocateMethodDecl("B", TType::kUint8, {}));
    ExpectComparedByNameAndNeverAssigned(*fClass->AllocatePropertyDecl("A", 1, {}),
                                         *fClass->AllocatePropertyDecl("B", 1, {}));
    ExpectComparedByNameAndNeverAssigned(*method->AllocateParameterDecl("A", TType::kUint8, {}),
                                         *method->AllocateParameterDecl("B", TType::kUint8, {}));
    ExpectComparedByNameAndNeverAssigned(*QualifierDecl("A", true), *QualifierDecl("B", true));
}

TEST_F(DeclarationTest, AQualifierAndItsDeclarationKeepValueAndFlavorApart)
{
    const auto declaration = QualifierDecl("Q", TCIMValue(TType::kStringArray, 0));
    EXPECT_EQ(TType::kStringArray, declaration->GetType({}));
    EXPECT_TRUE(declaration->IsArray({}));
    const auto qualifier = fClass->AllocateQualifier(declaration, Texts({"a"}), TDecl::kFlavorToSubclass, {});
    qualifier->Validate({});
    EXPECT_EQ(TType::kStringArray, qualifier->GetType({}));
    EXPECT_TRUE(qualifier->IsArray({}));
    EXPECT_FALSE(qualifier->GetPropagated({}));
    qualifier->SetFlavor(TDecl::kFlavorRestricted, {});
    qualifier->UnsetFlavor(TDecl::kFlavorToSubclass, {});
    EXPECT_EQ(TDecl::kFlavorRestricted, qualifier->GetFlavor({}));
    declaration->SetFlavor(TDecl::kFlavorRestricted, {});
    declaration->UnsetFlavor(TDecl::kFlavorOverridable, {});
    EXPECT_EQ(TDecl::kFlavorRestricted, declaration->GetFlavor({}));
    declaration->SetDefaultValue(Texts({"d"}), {});
    EXPECT_EQ("d", declaration->GetDefaultValue({}).ToString(10));
    EXPECT_EQ("a", qualifier->GetValue({}).ToString(10));
    const auto other = fClass->AllocateQualifier(declaration, Texts({"b"}), {});
    EXPECT_TRUE(*qualifier < *other && !(*qualifier == *other));
    *qualifier = *other;
    EXPECT_TRUE(*qualifier == *other);
    qualifier->SetValue(Texts({"c"}), {});
    EXPECT_EQ("c", qualifier->GetValue({}).ToString(10));
    const auto later = fClass->AllocateQualifier(QualifierDecl("R", true), false, {});
    EXPECT_TRUE(*qualifier < *later && !(*later < *qualifier));
    EXPECT_EQ(31U, StatusOf([&] { qualifier->RemoveFromClassOrProperty({}); }));
    EXPECT_EQ(31U, StatusOf([&] { declaration->RemoveQualifierDecl({}); }));
    EXPECT_EQ(fNamespace, declaration->GetNamespace({}));
    declaration->AddToNamespace({});
    EXPECT_EQ(declaration, fNamespace->FindQualifierDecl("q"));
}

TEST_F(DeclarationTest, APropertyFindsItsTextsInTheDeclaration)
{
    const auto declaration = fClass->AllocatePropertyDecl("P", 1, {});
    Qualify(*declaration, "ValueMap", Texts({"..", "0x8000.."}));
    Qualify(*declaration, "Values", Texts({"DMTF Reserved", "Vendor Reserved"}));
    EXPECT_EQ("Vendor Reserved", TPEGASUSProperty(0x8001, declaration, fClass).ToString());
}

TEST_F(DeclarationTest, APropertyKeepsItsPreviousValueAndLosesItsDeclarationQuietly)
{
    auto declaration = fClass->AllocatePropertyDecl("P", 1, {});
    TPEGASUSProperty property(1, declaration, fClass);
    EXPECT_TRUE(property.IsDefaultValue({}));
    EXPECT_FALSE(property.GetPropagated({}));
    EXPECT_EQ(TType::kSint32, property.GetType({}));
    EXPECT_TRUE(property.IsPrevValueDifferent());
    property.SetPrevValue();
    EXPECT_FALSE(property.IsPrevValueDifferent());
    property.SetValue(2, {});
    EXPECT_TRUE(property.IsPrevValueDifferent());
    EXPECT_FALSE(property.IsDefaultValue({}));
    EXPECT_EQ("1", property.PrevValueToString());
    property.SetPrevValue(3);
    EXPECT_EQ(TCIMValue(3), property.GetPrevValue());
    const auto otherClass = boost::make_shared<TPEGASUSClass>(fNamespace, "CIM_B", nullptr);
    TPEGASUSProperty inherited(1, declaration, otherClass);
    EXPECT_TRUE(inherited.GetPropagated({}));
    EXPECT_TRUE(inherited < property && !(inherited == property));
    ICIMProperty& target = inherited;
    target = property;
    EXPECT_TRUE(inherited == property);
    declaration.reset();
    EXPECT_FALSE(property.GetDeclaration({}));
    EXPECT_FALSE(property.IsArray({}));
    EXPECT_FALSE(property.IsDefaultValue({}));
    EXPECT_EQ("2", property.ToString());
}

} // namespace
} // namespace NKOLVRX20
