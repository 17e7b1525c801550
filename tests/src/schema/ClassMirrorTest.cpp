// SPDX-License-Identifier: MIT
// What a new class takes over from the server, what it asks for, and what it leaves out.
#include "src/schema/DeclarationAttributes.h"
#include "src/schema/TPEGASUSQualifierDecl.h"
#include "tests/src/schema/ServedNamespace.h"

#include <host/ICIMMethodDecl.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>
#include <host/TVRXException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

using Pegasus::CIMName;
using Pegasus::CIMValue;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using TType = TCIMValue::TCIMType;
using TDecl = ICIMQualifierDecl;

class ClassMirrorTest : public ::testing::Test
{
  protected:
    // Returns: the failures among the log's lines.
    std::vector<std::string> Failures() const { return fServed.fRig.fLog.LinesWith("0|"); }

    TServedNamespace fServed;
};

TEST_F(ClassMirrorTest, TakesOverEveryDeclaration)
{
    Pegasus::CIMClass source(CIMName("CIM_Disk"));
    source.addQualifier(TrueQualifier("Abstract"));
    source.addProperty(Property("Id", CIMValue(Pegasus::String("")), "Key"));
    source.addProperty(Property("Sizes", CIMValue(Pegasus::CIMTYPE_UINT64, true)));
    source.addProperty(Property("Count", CIMValue(Pegasus::Uint16(7))));
    source.addProperty(Property("Unset", CIMValue(Pegasus::CIMTYPE_UINT16, false)));
    source.addProperty(Pegasus::CIMProperty(CIMName("Inherited"), CIMValue(Pegasus::Uint16(1)), 0, CIMName(),
                                            CIMName("CIM_Base"), true));
    Pegasus::CIMMethod method(CIMName("Format"), Pegasus::CIMTYPE_UINT32);
    Pegasus::CIMParameter parameter(CIMName("Label"), Pegasus::CIMTYPE_STRING, true);
    parameter.addQualifier(TrueQualifier("In"));
    method.addParameter(parameter);
    source.addMethod(method);
    fServed.fModel.addClass(kNsp, source);

    const auto mirrored = fServed.Class("cim_disk", "120");
    EXPECT_THAT(Failures(), IsEmpty());
    ASSERT_TRUE(mirrored);
    EXPECT_THAT(fServed.TakeRequests(), ElementsAre("GetClass cim_disk", "GetClass CIM_Disk", "GetQualifier Abstract",
                                                    "GetQualifier Key", "GetQualifier In"));
    EXPECT_EQ("CIM_Disk", mirrored->GetName({}));
    EXPECT_EQ("root/cimv2", mirrored->GetPegasusNSPStr());
    EXPECT_EQ(120000U, mirrored->GetDefaultTimeoutMs());
    EXPECT_TRUE(mirrored->IsAbstract({}));
    EXPECT_FALSE(mirrored->IsAssociation({}));
    EXPECT_EQ(TType::kString, mirrored->GetPropertyDecl("ID", {})->GetType({}));
    EXPECT_EQ("Id", mirrored->GetPropertyDecl("ID", {})->GetName({}));
    const auto sizes = mirrored->GetPropertyDecl("sizes", {});
    EXPECT_EQ(TType::kUint64Array, sizes->GetType({}));
    EXPECT_TRUE(sizes->IsArray({}));
    EXPECT_TRUE(sizes->GetDefaultValue({}).IsNull());
    EXPECT_EQ(mirrored, sizes->GetClass({}));
    EXPECT_EQ(TCIMValue(static_cast<unsigned short>(7)), mirrored->GetProperty("count", {})->GetValue({}));
    EXPECT_EQ(TCIMValue(TType::kUint16, 0), mirrored->GetPropertyDecl("Unset", {})->GetDefaultValue({}));
    EXPECT_EQ(TType::kUint16, mirrored->GetPropertyDecl("Unset", {})->GetDefaultValue({}).GetType());
    EXPECT_FALSE(mirrored->GetProperty("count", {})->GetPropagated({}));
    EXPECT_TRUE(mirrored->GetProperty("Inherited", {})->GetPropagated({}));
    EXPECT_EQ(15U, StatusOf([&] { mirrored->GetProperty("Sizes", {}); }));
    const auto format = mirrored->GetMethodDecl("FORMAT", {});
    ASSERT_TRUE(format);
    EXPECT_EQ(TType::kUint32, format->GetReturnType({}));
    const auto label = format->GetParameterDecl("label", {});
    ASSERT_TRUE(label);
    EXPECT_EQ(TType::kStringArray, label->GetType({}));
    EXPECT_TRUE(label->GetQualifier("IN", {}));
    EXPECT_FALSE(format->GetParameterDecl("Other", {}));
}

TEST_F(ClassMirrorTest, AQualifierIsAskedForOnceANamespaceAndAfterAFailureOnceAClass)
{
    Pegasus::CIMClass first(CIMName("CIM_A"));
    Pegasus::CIMProperty unknown = Property("B", CIMValue(true), "Unheard");
    unknown.addQualifier(TrueQualifier("Key"));
    first.addProperty(Property("A", CIMValue(true), "Unheard"));
    first.addProperty(unknown);
    Pegasus::CIMClass second(CIMName("CIM_B"));
    second.addProperty(Property("A", CIMValue(true), "key"));
    fServed.fModel.addClass(kNsp, first).addClass(kNsp, second);

    const auto mirrored = fServed.Class("CIM_A");
    EXPECT_THAT(fServed.TakeRequests(),
                ElementsAre("GetClass CIM_A", "GetClass CIM_A", "GetQualifier Unheard", "GetQualifier Key"));
    EXPECT_THAT(Failures(), ElementsAre("0|TPEGASUSClass::Initialize - Unable to retrieve qualifier: "
                                        "Unheard\tdetail: CIM_ERR_NOT_FOUND: Unheard"));
    EXPECT_FALSE(mirrored->GetPropertyDecl("A", {})->GetQualifier("Unheard", {}));
    EXPECT_TRUE(mirrored->GetPropertyDecl("B", {})->GetQualifier("Key", {}));
    fServed.Class("CIM_B");
    EXPECT_THAT(fServed.TakeRequests(), ElementsAre("GetClass CIM_B", "GetClass CIM_B"));
    EXPECT_TRUE(fServed.fNamespace->FindQualifierDecl("KEY"));
}

TEST_F(ClassMirrorTest, AQualifierKeepsItsValueFlavorAndOrigin)
{
    Pegasus::CIMClass source(CIMName("CIM_A"));
    source.addQualifier(Pegasus::CIMQualifier(CIMName("Override"), CIMValue(Pegasus::String("x")),
                                              Pegasus::CIMFlavor::OVERRIDABLE + Pegasus::CIMFlavor::RESTRICTED, true));
    fServed.fModel.addClass(kNsp, source);
    const auto qualifier = fServed.Class("CIM_A")->GetQualifier("OVERRIDE", {});
    ASSERT_TRUE(qualifier);
    EXPECT_EQ("x", qualifier->GetValue({}).ToString(10));
    EXPECT_EQ(TDecl::kFlavorOverridable | TDecl::kFlavorRestricted, qualifier->GetFlavor({}));
    EXPECT_TRUE(qualifier->GetPropagated({}));
    const auto declaration = qualifier->GetDeclaration({});
    EXPECT_EQ(TType::kString, declaration->GetType({}));
    EXPECT_TRUE(declaration->GetDefaultValue({}).IsNull());
    EXPECT_EQ(TDecl::kScopeProperty | TDecl::kScopeMethod, declaration->GetScope({}));
}

// Equal values are shared behind the scenes.
TEST_F(ClassMirrorTest, EachClassHasTheQualifierValuesThatTheServerGaveForIt)
{
    const char* const served[] = {"x", "x", "y", "x"};
    const auto name = [](std::size_t i) { return "CIM_" + std::to_string(i); };
    for (std::size_t i = 0; i < 4; ++i) {
        Pegasus::CIMClass source(CIMName(name(i).c_str()));
        source.addQualifier(TextQualifier("Override", name(i).c_str()));
        source.addProperty(
            Property("P", CIMValue(Pegasus::Uint8(1))).addQualifier(TextQualifier("Override", served[i])));
        source.addProperty(Property("Q", CIMValue(Pegasus::Uint8(1))).addQualifier(TextQualifier("Override", "q")));
        fServed.fModel.addClass(kNsp, source);
    }
    const auto qualifier = [&](std::size_t i, const char* property) {
        return fServed.Class(name(i))->GetPropertyDecl(property, {})->GetQualifier("Override", {});
    };
    qualifier(0, "P")->SetValue(TCIMValue("changed"), {}); // before the other classes are asked for
    const char* const expected[] = {"changed", "x", "y", "x"};
    for (std::size_t i = 0; i < 4; ++i) {
        EXPECT_EQ(TCIMValue(expected[i]), qualifier(i, "P")->GetValue({})) << i;
        EXPECT_EQ(TCIMValue("q"), qualifier(i, "Q")->GetValue({})) << i;
        EXPECT_EQ(TCIMValue(name(i)), fServed.Class(name(i))->GetQualifier("Override", {})->GetValue({})) << i;
    }
}

TEST_F(ClassMirrorTest, AQualifierHasAFlavorOfItsOwnOnEachElement)
{
    using Pegasus::CIMFlavor;
    const struct
    {
        const char* fProperty;
        CIMFlavor fServed;
        unsigned int fExpected;
    } rows[] = {
        {"A", CIMFlavor::OVERRIDABLE + CIMFlavor::RESTRICTED, TDecl::kFlavorOverridable | TDecl::kFlavorRestricted},
        {"B", CIMFlavor::OVERRIDABLE + CIMFlavor::TOSUBCLASS, TDecl::kFlavorOverridable | TDecl::kFlavorToSubclass},
        {"C", CIMFlavor::OVERRIDABLE + CIMFlavor::RESTRICTED, TDecl::kFlavorOverridable | TDecl::kFlavorRestricted},
    };
    Pegasus::CIMClass source(CIMName("CIM_A"));
    for (const auto& row : rows) {
        Pegasus::CIMProperty property = Property(row.fProperty, CIMValue(Pegasus::Uint8(1)));
        property.addQualifier(Pegasus::CIMQualifier(CIMName("Key"), CIMValue(true), row.fServed));
        source.addProperty(property);
    }
    fServed.fModel.addClass(kNsp, source);
    const auto mirrored = fServed.Class("CIM_A");
    for (const auto& row : rows) {
        EXPECT_EQ(row.fExpected, mirrored->GetPropertyDecl(row.fProperty, {})->GetQualifier("Key", {})->GetFlavor({}))
            << row.fProperty;
    }
}

TEST_F(ClassMirrorTest, WhatCannotBeMirroredIsLoggedAndLeftOut)
{
    Pegasus::CIMClass source(CIMName("CIM_A"));
    source.addProperty(Property("Gr\xC3\xB6\xC3\x9F"
                                "e",
                                CIMValue(Pegasus::Uint8(1))));
    source.addProperty(
        Pegasus::CIMProperty(CIMName("Ref"), CIMValue(Pegasus::CIMTYPE_REFERENCE, false), 0, CIMName("CIM_A")));
    source.addProperty(Property("Good", CIMValue(Pegasus::Uint8(1))));
    source.addMethod(Pegasus::CIMMethod(CIMName("M\xC3\xA4"), Pegasus::CIMTYPE_UINT32));
    Pegasus::CIMMethod method(CIMName("Go"), Pegasus::CIMTYPE_UINT32);
    for (const char* name : {"P\xC3\xA4", "Force"}) {
        method.addParameter(Pegasus::CIMParameter(CIMName(name), Pegasus::CIMTYPE_UINT8));
    }
    source.addMethod(method);
    for (const char* name : {"Q\xC3\xA4", "Abstract"}) {
        source.addQualifier(TrueQualifier(name));
    }
    fServed.fModel.addClass(kNsp, source);
    const auto mirrored = fServed.Class("CIM_A");
    ASSERT_TRUE(mirrored);
    const std::string invalid = TVRXStatusCode(25).TranslateStatusCode();
    const std::string reference = TVRXStatusCode(22).TranslateStatusCode();
    EXPECT_THAT(Failures(),
                ElementsAre("0|PEGASUS: CIM name 'Q\xC3\xA4' is invalid",
                            "0|- error when Adding Qualifiers for class: CIM_A\tdetail: " + invalid,
                            "0|PEGASUS: CIM name 'Gr\xC3\xB6\xC3\x9F"
                            "e' is invalid",
                            "0| - error when Adding Qualifiers for property: Gr\xC3\xB6\xC3\x9F"
                            "e\tdetail: " +
                                invalid,
                            "0|TPEGASUS: Attempt to add reference property Ref to non-association class CIM_A",
                            "0| - error when Adding Qualifiers for property: Ref\tdetail: " + reference,
                            "0|PEGASUS: CIM name 'M\xC3\xA4' is invalid",
                            "0| - error when Adding Qualifiers for method: M\xC3\xA4\tdetail: " + invalid,
                            "0|PEGASUS: CIM name 'P\xC3\xA4' is invalid",
                            "0| - error when Adding Qualifiers for method: Go\tdetail: " + invalid));
    EXPECT_TRUE(mirrored->GetPropertyDecl("Good", {}));
    EXPECT_TRUE(mirrored->IsAbstract({}));
    ASSERT_TRUE(mirrored->GetMethodDecl("Go", {}));
    EXPECT_TRUE(mirrored->GetMethodDecl("Go", {})->GetParameterDecl("Force", {}));
    EXPECT_EQ(15U, StatusOf([&] { mirrored->GetPropertyDecl("Ref", {}); }));
}

TEST_F(ClassMirrorTest, APropertyOfATypeThatTheHostLacksIsDeclaredAsText)
{
    Pegasus::CIMClass source(CIMName("CIM_A"));
    source.addProperty(Property("Inner", CIMValue(Pegasus::CIMTYPE_OBJECT, false)));
    fServed.fModel.addClass(kNsp, source);
    const auto mirrored = fServed.Class("CIM_A");
    EXPECT_THAT(Failures(), IsEmpty());
    EXPECT_THAT(fServed.fRig.fLog.LinesWith("3|Not"),
                ElementsAre("3|Not supported type of property Inner in class CIM_A: 15, default to string."));
    EXPECT_EQ(TType::kString, mirrored->GetPropertyDecl("Inner", {})->GetType({}));
}

TEST_F(ClassMirrorTest, ReferencesAreWelcomeInAnAssociation)
{
    Pegasus::CIMClass source(CIMName("CIM_A"));
    source.addQualifier(TrueQualifier("Association"));
    source.addProperty(
        Pegasus::CIMProperty(CIMName("Ref"), CIMValue(Pegasus::CIMTYPE_REFERENCE, false), 0, CIMName("CIM_A")));
    fServed.fModel.addClass(kNsp, source);
    EXPECT_EQ(TType::kReference, fServed.Class("CIM_A")->GetPropertyDecl("ref", {})->GetType({}));
    EXPECT_THAT(Failures(), IsEmpty());
}

TEST_F(ClassMirrorTest, AnOverrideReplacesWhatTheSuperclassDeclares)
{
    const auto override = [](const char* name, const CIMValue& value) {
        Pegasus::CIMProperty property{CIMName(name), value};
        property.addQualifier(TextQualifier("Override", name));
        return property;
    };
    Pegasus::CIMClass base(CIMName("CIM_Base"));
    base.addProperty(Property("Same", CIMValue(Pegasus::Uint8(1))));
    base.addProperty(Property("Other", CIMValue(Pegasus::Uint8(1))));
    Pegasus::CIMClass derived(CIMName("CIM_Derived"), CIMName("CIM_Base"));
    derived.addProperty(override("Same", CIMValue(Pegasus::Uint8(2))));
    derived.addProperty(override("Other", CIMValue(Pegasus::Uint16(2))));
    derived.addProperty(override("New", CIMValue(Pegasus::Uint8(2))));
    fServed.fModel.addClass(kNsp, base).addClass(kNsp, derived);
    const auto mirrored = fServed.Class("CIM_Derived");
    const std::string mismatch = TVRXStatusCode(14).TranslateStatusCode();
    EXPECT_THAT(
        Failures(),
        ElementsAre("0|TPEGASUS: Attempt to override property Other in class CIM_Derived: different types",
                    "0|TPEGASUS: Attempt define property Other in class CIM_Derivedfailed. Reason = " + mismatch,
                    "0| - error when Adding Qualifiers for property: Other\tdetail: " + mismatch,
                    "0|TPEGASUS: Attempt to override property New in class CIM_Derived: property doesn't exist in "
                    "base class"));
    EXPECT_EQ(mirrored, mirrored->GetPropertyDecl("Same", {})->GetClass({}));
    EXPECT_TRUE(mirrored->GetPropertyDecl("New", {}));
}

TEST_F(ClassMirrorTest, AServerThatDoesNotGiveTheClassASecondTimeMakesItNull)
{
    fServed.fModel.addClass(kNsp, Pegasus::CIMClass(CIMName("CIM_A")));
    const auto pass = [&](const test::PeerRequest& request) {
        return test::classAnswer(request, Pegasus::CIMClass(CIMName("CIM_A")));
    };
    fServed.fModel.addFault("GetClass", pass);
    fServed.fModel.addFault("GetClass", [](const test::PeerRequest& request) {
        return test::errorAnswer(request, 1, "CIM_ERR_FAILED: gone");
    });
    EXPECT_FALSE(fServed.Class("CIM_A"));
    EXPECT_THAT(Failures(), ElementsAre("0|TPEGASUSClass::Initialize - Unable to retrieve class: CIM_A\tdetail: "
                                        "CIM_ERR_FAILED: gone"));
    EXPECT_THAT(fServed.fRig.fLog.LinesWith("3|Catching exeption"),
                ElementsAre(std::string("3|Catching exeption: AllocateClass  --- CIM_A  \twith reason: ") +
                            TVRXStatusCode(42).TranslateStatusCode()));
    EXPECT_THAT(fServed.fNamespace->GetRootClass()->GetChildClasses(), IsEmpty());
    EXPECT_TRUE(fServed.Class("CIM_A")); // the next try is not spoilt
}

TEST(QualifierBitsTest, WordsBecomeBits)
{
    EXPECT_EQ(TDecl::kFlavorNone, FlavorFromText(""));
    EXPECT_EQ(TDecl::kFlavorOverridable | TDecl::kFlavorToSubclass | TDecl::kFlavorTranslatable,
              FlavorFromText("OVERRIDABLE TOSUBCLASS TRANSLATABLE"));
    EXPECT_EQ(TDecl::kFlavorToInstance | TDecl::kFlavorDisableOverride | TDecl::kFlavorRestricted,
              FlavorFromText("TOINSTANCE DISABLEOVERRIDE RESTRICTED UNHEARDOF"));
    const Pegasus::CString any = Pegasus::CIMScope::ANY.toString().getCString();
    EXPECT_EQ(TDecl::kScopeAny, ScopeFromText(static_cast<const char*>(any)));
    EXPECT_EQ(TDecl::kScopeReference, ScopeFromText("REFERENCE"));
}

} // namespace
} // namespace NKOLVRX20
