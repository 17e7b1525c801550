// SPDX-License-Identifier: MIT
// The class object's own rules: adding declarations, the hierarchy, its instances.
#include "src/schema/TPEGASUSQualifierDecl.h"
#include "tests/src/schema/ServedNamespace.h"

#include <host/ICIMInstance.h>
#include <host/ICIMMethodDecl.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>
#include <utility>

namespace NKOLVRX20 {
namespace {

using Pegasus::CIMName;
using Pegasus::CIMValue;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using TType = TCIMValue::TCIMType;

class ClassObjectTest : public ::testing::Test
{
  protected:
    boost::shared_ptr<TPEGASUSClass> Add(const char* name, const char* superName = nullptr)
    {
        fServed.fModel.addClass(kNsp, Pegasus::CIMClass(CIMName(name), superName ? CIMName(superName) : CIMName()));
        return fServed.Class(name);
    }

    // Returns: a declaration of the owner's, with the qualifier OVERRIDE when asked.
    boost::shared_ptr<ICIMPropertyDecl> Declare(const boost::shared_ptr<TPEGASUSClass>& owner, const char* name,
                                                const TCIMValue& value, bool overrides = false)
    {
        const auto declaration = owner->AllocatePropertyDecl(name, value, {});
        if (overrides) {
            const auto qualifierDecl = fServed.fNamespace->AllocateQualifierDecl(
                "Override", TCIMValue(std::string()), ICIMQualifierDecl::kScopeAny, ICIMQualifierDecl::kFlavorNone, {});
            declaration->AllocateQualifier(qualifierDecl, std::string("x"), {})->AddToClassOrProperty({});
        }
        return declaration;
    }

    TServedNamespace fServed;
};

TEST_F(ClassObjectTest, AddPropertyDeclTakesEveryBranch)
{
    const auto base = Add("CIM_Base");
    const TCIMValue nothing, bytes(TType::kUint8, 0, {}), integers(TType::kSint32, 0, {});
    const std::string refused = "TPEGASUS: Attempt to override property P in class C: ";
    struct
    {
        const char* fName;
        const char* fProperty;
        const char* fKind; // "o": overrides, "f": the declaration that is there belongs to another class
        TCIMValue fFirst;  // null: nothing is there
        TCIMValue fSecond;
        unsigned int fStatus;
        std::string fMessage;
    } const rows[] = {
        {"new", "P", "", nothing, 1, 0, ""},
        {"new array", "P", "", nothing, bytes, 0, ""},
        {"duplicate", "P", "", 1, 1, 16, "TPEGASUS: Attempt to add property P to class C: already exists"},
        {"duplicate, other case", "p", "", 1, 1, 16, "TPEGASUS: Attempt to add property p to class C: already exists"},
        {"PortType twice", "XPortTypeY", "", 1, 2, 0, ""},
        {"porttype twice", "porttype", "", 1, 1, 16,
         "TPEGASUS: Attempt to add property porttype to class C: already exists"},
        {"override", "P", "of", 1, 2, 0, ""},
        {"override of nothing", "P", "o", nothing, 1, 0, refused + "property doesn't exist in base class"},
        {"override with another type", "P", "of", 1, true, 14, refused + "different types"},
        {"override with an array", "P", "of", 1, integers, 14, refused + "different types"},
        {"override of one's own", "P", "o", 1, 1, 16, refused + "original was defined in this class"},
        {"reference", "P", "", nothing, TCIMReference(), 22,
         "TPEGASUS: Attempt to add reference property P to non-association class C"},
        {"bad name", "1P", "", nothing, 1, 25, "PEGASUS: CIM name '1P' is invalid"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        const bool overrides = row.fKind[0] == 'o', isForeign = std::string(row.fKind) == "of";
        const auto target = boost::make_shared<TPEGASUSClass>(fServed.fNamespace, "C", nullptr);
        const std::string first = std::string(row.fName) == "duplicate, other case" ? "P" : row.fProperty;
        if (!row.fFirst.IsNull()) {
            target->AddPropertyDecl(Declare(isForeign ? base : target, first.c_str(), row.fFirst));
        }
        const auto second = Declare(target, row.fProperty, row.fSecond, overrides);
        std::vector<std::string> log;
        if (!row.fMessage.empty()) {
            log.push_back("0|" + row.fMessage);
        }
        if (overrides && row.fStatus != 0) {
            log.push_back(std::string("0|TPEGASUS: Attempt define property P in class Cfailed. Reason = ") +
                          TVRXStatusCode(row.fStatus).TranslateStatusCode());
        }
        fServed.Log();
        EXPECT_EQ(row.fStatus, StatusOf([&] { second->AddToClass({}); }));
        EXPECT_EQ(log, fServed.Log());
        if (row.fStatus == 0) {
            EXPECT_EQ(second, target->GetPropertyDecl(row.fProperty, {}));
        }
    }
}

TEST_F(ClassObjectTest, OnlyTheCollectionTimeMayBeMissing)
{
    const auto target = Add("CIM_A");
    EXPECT_FALSE(target->GetPropertyDecl("DateTimeOfCollection", {}));
    for (const char* name : {"datetimeofcollection", "Other"}) {
        EXPECT_EQ(15U, StatusOf([&] { target->GetPropertyDecl(name, {}); })) << name;
    }
}

TEST_F(ClassObjectTest, EnumerationsGoInKeyOrderAndStopAtFalse)
{
    Pegasus::CIMClass source(CIMName("CIM_A"));
    for (const char* name : {"b", "C", "a"}) {
        source.addProperty(Property(name, CIMValue(Pegasus::Uint8(1)), "Key"));
        source.addMethod(Pegasus::CIMMethod(CIMName(name), Pegasus::CIMTYPE_UINT8));
    }
    source.addProperty(Property("aa", CIMValue(Pegasus::Uint8(1))));
    Pegasus::CIMProperty noKey(CIMName("ab"), CIMValue(Pegasus::Uint8(1)));
    noKey.addQualifier(Pegasus::CIMQualifier(CIMName("Key"), CIMValue(false)));
    source.addProperty(noKey);
    source.addQualifier(TrueQualifier("Key"));
    source.addQualifier(TrueQualifier("Abstract"));
    fServed.fModel.addClass(kNsp, source);
    const auto target = fServed.Class("CIM_A");

    std::vector<std::string> seen;
    std::size_t limit = 9;
    const auto note = [&](const std::string& name) {
        seen.push_back(name);
        return seen.size() < limit;
    };
    const auto taken = [&] { return std::exchange(seen, {}); };
    const auto noteNamed = [&](const auto& element) { return note(element->GetName({})); };
    for (const bool stops : {false, true}) {
        limit = stops ? 1 : 9;
        target->EnumerateKeyNames([&](const std::string* name) { return note(*name); }, {});
        EXPECT_EQ(stops ? std::vector<std::string>{"a"} : (std::vector<std::string>{"a", "b", "C"}), taken());
        target->EnumeratePropertyDecls(noteNamed, {});
        EXPECT_EQ(stops ? std::vector<std::string>{"a"} : (std::vector<std::string>{"a", "aa", "ab", "b", "C"}),
                  taken());
        target->EnumerateMethodDecls(noteNamed, {});
        EXPECT_EQ(stops ? std::vector<std::string>{"a"} : (std::vector<std::string>{"a", "b", "C"}), taken());
        target->EnumerateQualifiers(noteNamed, {});
        EXPECT_EQ(stops ? std::vector<std::string>{"Abstract"} : (std::vector<std::string>{"Abstract", "Key"}),
                  taken());
        target->EnumerateStaticProperties(
            [&](const auto& property) { return note(property->GetDeclaration({})->GetName({})); }, {});
        EXPECT_EQ(stops ? 1U : 5U, taken().size());
    }
}

TEST_F(ClassObjectTest, TheTreeIsWalkedParentsFirstUntilFalseAndPastAThrowingVisitor)
{
    for (const char* name : {"A", "B"}) {
        Add(name);
    }
    Add("A1", "A");
    Add("A1x", "A1");
    Add("A2", "A");
    const auto root = fServed.fNamespace->GetRootClass();
    struct
    {
        const char* fName;
        bool fDeep;
        const char* fStopAt;
        const char* fThrowAt;
        std::vector<std::string> fSeen;
    } const rows[] = {
        {"deep", true, "", "", {"A", "A1", "A1x", "A2", "B"}},
        {"direct", false, "", "", {"A", "B"}},
        {"stopped at the first", true, "A", "", {"A"}},
        {"stopped two levels down", true, "A1x", "", {"A", "A1", "A1x"}},
        {"thrown: its subtree is lost", true, "", "A1", {"A", "A1", "A2", "B"}},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        fServed.Log();
        std::vector<std::string> seen;
        root->EnumerateSubClasses(
            [&](const boost::shared_ptr<ICIMClass>& child) {
                seen.push_back(child->GetName({}));
                if (seen.back() == row.fThrowAt) {
                    throw std::runtime_error("visitor");
                }
                return seen.back() != row.fStopAt;
            },
            row.fDeep, {});
        EXPECT_EQ(row.fSeen, seen);
        const std::vector<std::string> thrown = {"0|TPEGASUSClass::EnumerateSubClasses : A  visitor"};
        EXPECT_EQ(*row.fThrowAt ? thrown : std::vector<std::string>{}, fServed.Log());
    }
}

TEST_F(ClassObjectTest, AncestorsAreFoundByNameUpToButNotTheRoot)
{
    const auto base = Add("A");
    const auto derived = Add("A1", "A");
    const auto root = fServed.fNamespace->GetRootClass();
    EXPECT_TRUE(derived->IsSubclassOf(derived, {}));
    EXPECT_TRUE(derived->IsSubclassOf(base, {}));
    EXPECT_TRUE(Add("A11", "A1")->IsSubclassOf(base, {}));
    EXPECT_FALSE(base->IsSubclassOf(derived, {}));
    EXPECT_FALSE(derived->IsSubclassOf(root, {}));
    EXPECT_FALSE(derived->IsSubclassOf(nullptr, {}));
    EXPECT_TRUE(root->IsSubclassOf(root, {}));
    EXPECT_TRUE(root->IsRootClass({}));
    EXPECT_FALSE(base->IsRootClass({}));
    const auto lower = boost::make_shared<TPEGASUSClass>(fServed.fNamespace, "a", nullptr);
    EXPECT_FALSE(*lower == *base);
    EXPECT_TRUE(*base == *fServed.Class("a"));
    EXPECT_TRUE(*base < *lower);
}

TEST_F(ClassObjectTest, TheSuperclassIsAskedForEachTimeAndComesFromTheCache)
{
    const auto base = Add("A");
    const auto derived = Add("A1", "A");
    fServed.TakeRequests();
    EXPECT_EQ(base, derived->GetSuperClass({}));
    EXPECT_FALSE(base->GetSuperClass({}));
    EXPECT_FALSE(fServed.fNamespace->GetRootClass()->GetSuperClass({}));
    EXPECT_THAT(fServed.TakeRequests(), ElementsAre("GetClass A1", "GetClass A"));
    fServed.Log();
    fServed.fModel.addFault("GetClass", [](const test::PeerRequest& request) {
        return test::errorAnswer(request, 1, "CIM_ERR_FAILED: gone");
    });
    EXPECT_EQ(42U, StatusOf([&] { derived->GetSuperClass({}); }));
    EXPECT_THAT(fServed.Log(), ElementsAre("0|TPEGASUSClass::GetSuperClass from Pegasus for: A1 returned exception: "
                                           "CIM_ERR_FAILED: gone"));
    const auto unconnected = fServed.fRig.MakeNamespace();
    EXPECT_FALSE(boost::make_shared<TPEGASUSClass>(unconnected, "A1", nullptr)->GetSuperClass({}));
    EXPECT_FALSE(boost::make_shared<TPEGASUSClass>(unconnected, "<root>", nullptr)->IsRootClass({}));
}

TEST_F(ClassObjectTest, AClassAsksInItsOwnServerNamespaceAndWithItsOwnTimeout)
{
    Pegasus::CIMClass source(CIMName("V1"), CIMName("V"));
    source.addQualifier(TrueQualifier("Vendors"));
    fServed.fModel.addClass("root/vendor", source)
        .addClass("root/vendor", Pegasus::CIMClass(CIMName("W1"), CIMName("W")))
        .addQualifier("root/vendor",
                      Pegasus::CIMQualifierDecl(CIMName("Vendors"), CIMValue(false), Pegasus::CIMScope::ANY));
    for (const char* name : {"V", "W"}) { // namesakes in both
        for (const char* ns : {kNsp, "root/vendor"}) {
            fServed.fModel.addClass(ns, Pegasus::CIMClass(CIMName(name)));
        }
    }
    Pegasus::CIMClient& client = *fServed.fNamespace->getPegClient();
    TCIMContext context;
    client.setTimeout(301000); // what a slow class before has left
    const auto derived = fServed.fNamespace->AllocateClass("V1", "root/vendor", "60", nullptr, context);
    EXPECT_EQ(5000U, fServed.TimeoutMs());
    EXPECT_TRUE(derived->GetQualifier("Vendors", {}));
    client.setTimeout(301000);
    const auto base = boost::dynamic_pointer_cast<TPEGASUSClass>(derived->GetSuperClass({}));
    ASSERT_TRUE(base);
    EXPECT_EQ("root/vendor", base->GetPegasusNSPStr());
    client.setTimeout(301000);
    EXPECT_EQ(base, derived->GetSuperClass({{"nsp", kNsp}})); // from the cache
    EXPECT_EQ(5000U, fServed.TimeoutMs());
    const auto other = fServed.fNamespace->AllocateClass("W1", "root/vendor", "60", nullptr, context);
    const auto asked = boost::dynamic_pointer_cast<TPEGASUSClass>(other->GetSuperClass({{"nsp", kNsp}}));
    ASSERT_TRUE(asked);
    EXPECT_EQ(kNsp, asked->GetPegasusNSPStr()); // as the caller said
}

TEST_F(ClassObjectTest, ClearingReachesTheWholeSubtreeAndForeignOwners)
{
    const auto base = Add("A");
    const auto derived = Add("A1", "A");
    const auto other = Add("B");
    const auto addTo = [](const boost::shared_ptr<TPEGASUSClass>& holder, const boost::shared_ptr<TPEGASUSClass>& of) {
        const auto instance = of->AllocateInstance({});
        holder->AddInstance(instance);
        return boost::weak_ptr<ICIMInstance>(instance);
    };
    const std::vector<boost::weak_ptr<ICIMInstance>> kept = {
        addTo(base, base), addTo(derived, derived), addTo(base, other), addTo(other, base), addTo(other, other)};
    const auto removed = other->AllocateInstance({});
    removed->AddToNamespace({});
    other->RemoveInstance(removed);
    EXPECT_EQ(1, removed.use_count());
    const auto lone = Add("C");
    const auto ofOther = addTo(other, other);
    const auto guest = other->AllocateInstance({});
    lone->AddInstance(guest);
    lone->RemoveInstance(guest);
    lone->ClearInstances();
    EXPECT_FALSE(ofOther.expired());
    for (const auto& instance : kept) {
        EXPECT_FALSE(instance.expired());
    }
    base->ClearInstances();
    for (const auto& instance : kept) {
        EXPECT_TRUE(instance.expired());
    }
}

TEST_F(ClassObjectTest, AClassOutlivesItsNamespaceWithoutReachingForIt)
{
    const auto target = Add("CIM_A");
    fServed.fNamespace.reset();
    EXPECT_FALSE(target->GetNamespace({}));
    EXPECT_EQ("CIM_A", target->GetName({}));
    EXPECT_THROW(target->AddToNamespace({}), boost::bad_weak_ptr);
    EXPECT_THROW(target->GetSuperClass({}), boost::bad_weak_ptr);
    EXPECT_THROW(target->IsRootClass({}), boost::bad_weak_ptr);
    EXPECT_THROW(target->EnumerateInstances([](const auto&) { return true; }, true, {}), boost::bad_weak_ptr);
}

TEST_F(ClassObjectTest, WhatIsNotServedDoesNothingOrSaysSo)
{
    const auto target = Add("A");
    const auto child = Add("A1", "A");
    target->Validate({});
    target->SetCollected();
    EXPECT_FALSE(target->hasCollected());
    target->RemoveChildClass(child);
    target->AddChildClass(child);
    EXPECT_THAT(target->GetChildClasses(), ElementsAre(child));
    target->AddAssociationClass(child);
    target->RemoveAssociationClass(child);
    int visits = 0;
    const auto count = [&](const auto&) { return ++visits != 0; };
    target->EnumerateAssociatedClasses(count, "", "", "", "", {});
    target->EnumerateAssociationClasses(count, "", "", {});
    EXPECT_EQ(0, visits);
    const auto method = target->AllocateMethodDecl("M", TType::kUint8, {});
    method->AddToClass({});
    target->RemoveMethodDecl(method);
    EXPECT_FALSE(target->GetMethodDecl("M", {}));
    const auto property = Declare(target, "P", 1);
    target->AddPropertyDecl(property);
    target->RemovePropertyDecl(property);
    EXPECT_EQ(property, target->GetPropertyDecl("P", {}));
    ICIMClass& same = *target;
    EXPECT_EQ(&same, &(same = *child));
    EXPECT_EQ("A", target->GetName({}));
    bool found = false;
    fServed.Log();
    EXPECT_EQ(1U, StatusOf([&] { target->GetQualifier("Key", found, {}); }));
    EXPECT_EQ(31U, StatusOf([&] { target->SetPropertyValue("P", 1, {}); }));
    EXPECT_EQ(31U, StatusOf([&] { target->ModifyClass(child, {}); }));
    EXPECT_EQ(31U, StatusOf([&] { target->RemoveFromNamespace({}); }));
    EXPECT_EQ(14U, StatusOf([&] { target->AddPropertyDecl(nullptr); }));
    EXPECT_EQ(14U, StatusOf([&] { target->AddChildClass(nullptr); }));
    EXPECT_EQ(14U, StatusOf([&] { target->AddInstance(nullptr); }));
    EXPECT_EQ(14U, StatusOf([&] { target->AddQualifier(nullptr, {}); }));
    EXPECT_EQ(14U, StatusOf([&] { fServed.fNamespace->AddClass(nullptr); }));
    EXPECT_EQ(14U, StatusOf([&] { fServed.fNamespace->AddQualifierDecl(nullptr); }));
    EXPECT_THAT(fServed.Log(),
                ElementsAre("0|TPEGASUSClass::GetQualifier failed: Key of A: not supported with a found flag",
                            "0|TPEGASUSClass::SetPropertyValue failed: A.P: not supported",
                            "0|TPEGASUSClass::ModifyClass failed: A: not supported",
                            "0|TPEGASUSClass::RemoveFromNamespace failed: A: not supported",
                            "0|TPEGASUSClass::AddPropertyDecl failed: A: null, or not a declaration of this plug-in",
                            "0|TPEGASUSClass::AddChildClass failed: A: null",
                            "0|TPEGASUSClass::AddInstance failed: A: null",
                            "0|TQualifiedElement::AddQualifier failed: A: null, or not a qualifier of this plug-in",
                            "0|TPEGASUSNamespace::AddClass failed: null",
                            "0|TPEGASUSNamespace::AddQualifierDecl failed: null"));
}

} // namespace
} // namespace NKOLVRX20
