// SPDX-License-Identifier: MIT
// A host that drops the namespace at an awkward moment: with its objects in hand, or from inside a visitor.
#include "src/plugin/TPEGASUSNamespaceProvider.h"
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"
#include "tests/src/support/NamespaceRig.h"

#include <host/ICIMInstance.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/TCIMReference.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>

namespace NKOLVRX20 {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr char kElements[] =
    "<QUALIFIER NAME=\"Association\" TYPE=\"boolean\"><VALUE>TRUE</VALUE></QUALIFIER>"
    "<QUALIFIER NAME=\"Key\" TYPE=\"boolean\"><VALUE>TRUE</VALUE></QUALIFIER>"
    "<PROPERTY NAME=\"Id\" TYPE=\"string\"><QUALIFIER NAME=\"Key\" TYPE=\"boolean\"><VALUE>TRUE</VALUE></QUALIFIER>"
    "<VALUE>a</VALUE></PROPERTY><PROPERTY NAME=\"Second\" TYPE=\"string\"><QUALIFIER NAME=\"Key\" TYPE=\"boolean\">"
    "<VALUE>TRUE</VALUE></QUALIFIER><VALUE>b</VALUE></PROPERTY>"
    "<METHOD NAME=\"Go\" TYPE=\"uint32\"></METHOD><METHOD NAME=\"Stop\" TYPE=\"uint32\"></METHOD>";

std::string QualifierDeclaration(const std::string& name)
{
    return "<QUALIFIER.DECLARATION NAME=\"" + name +
           "\" TYPE=\"boolean\"><SCOPE CLASS=\"true\"/><VALUE>FALSE</VALUE></QUALIFIER.DECLARATION>";
}

// An instance whose path spells out the class that its property "Peer" refers to.
std::string NamedInstance(const std::string& id)
{
    const auto key = [](const std::string& name, const std::string& value) {
        return "<KEYBINDING NAME=\"" + name + "\"><KEYVALUE VALUETYPE=\"string\">" + value + "</KEYVALUE></KEYBINDING>";
    };
    const auto path = [](const std::string& keys) {
        return "<INSTANCENAME CLASSNAME=\"ACME_One\">" + keys + "</INSTANCENAME>";
    };
    return "<VALUE.NAMEDINSTANCE>" + path(key("Id", id) + key("Peer", "root/cimv2:ACME_One.Id")) +
           "<INSTANCE CLASSNAME=\"ACME_One\"><PROPERTY.REFERENCE NAME=\"Peer\"><VALUE.REFERENCE>" +
           path(key("Id", id)) + "</VALUE.REFERENCE></PROPERTY.REFERENCE></INSTANCE></VALUE.NAMEDINSTANCE>";
}

class LifetimeTest : public ::testing::Test
{
  protected:
    LifetimeTest()
    {
        for (const char* vendor : {"acme", "beta"}) {
            fRig.WriteProvider(vendor, "a.classes.xml",
                               "<vrx><nsp name='root/cimv2'/><module name='" + std::string(vendor) +
                                   "'/><timeout value='9'/><class name='ACME_One'/><class name='ACME_Two'/></vrx>");
        }
        fServer.AnswerClass("ACME_One", "", kElements);
        fServer.AnswerClass("ACME_Two", "ACME_One", kElements);
        for (const char* name : {"Association", "Key"}) {
            fServer.Answer(std::string("GetQualifier ") + name, QualifierDeclaration(name));
        }
        fServer.Answer("EnumerateInstances ACME_One", NamedInstance("1") + NamedInstance("2"));
        fServer.Listen();
        fRig.OfferPortOf(fServer);
    }
    ~LifetimeTest() override { TPEGASUSNamespaceProvider::ClearNamespace(); }

    void Allocate()
    {
        fNamespace = TPEGASUSNamespaceProvider::GetInstance()->AllocateNamespace(fRig.Context(), true, "");
        fWatched = TPEGASUSNamespaceProvider::GetNamespace();
        fClass = fNamespace->GetClass("ACME_One", {});
        fProvider = TPEGASUSNamespaceProvider::GetNamespace()->GetProvidersContainer().front();
        fRig.fWorld.Take();
    }

    // Drops all that the host has; the server has ended when this returns.
    void Drop()
    {
        fClass.reset();
        fProvider.reset();
        fNamespace.reset();
        TPEGASUSNamespaceProvider::ClearNamespace();
        EXPECT_TRUE(fWatched.expired());
        EXPECT_THAT(fRig.fWorld.Trace(), Contains("run cimserver -s"));
    }

    TFakeCimServer fServer;
    TNamespaceRig fRig;
    boost::shared_ptr<ICIMNamespace> fNamespace;
    boost::weak_ptr<TPEGASUSNamespace> fWatched;
    boost::shared_ptr<ICIMClass> fClass;
    boost::shared_ptr<IProvider> fProvider;
};

TEST_F(LifetimeTest, AVisitorMayDropEverythingThatItWasCalledFrom)
{
    int visits = 0;
    // By value: the first visit drops what the host holds; the rest still comes.
    const auto drop = [&](const auto&...) {
        if (++visits == 1) {
            Drop();
        }
        return true;
    };
    const auto dropAndThrow = [&](const auto&) -> bool {
        drop(0);
        throw TVRXException(15);
    };
    struct
    {
        const char* fName;
        std::function<void()> fCall;
        int fVisits;
    } const rows[] = {
        {"providers", [&] { fNamespace->EnumerateProviders(drop, {}); }, 2},
        {"root classes", [&] { fNamespace->EnumerateRootClasses(drop, {}); }, 1},
        {"root classes, throwing", [&] { fNamespace->EnumerateRootClasses(dropAndThrow, {}); }, 1},
        {"qualifier declarations", [&] { fNamespace->EnumerateQualifierDecls(drop, {}); }, 2},
        {"classes provided", [&] { fProvider->EnumerateClassesProvided(drop, {}); }, 2},
        {"classes provided, throwing", [&] { fProvider->EnumerateClassesProvided(dropAndThrow, {}); }, 2},
        {"instances", [&] { fClass->EnumerateInstances(drop, true, {}); }, 2},
        {"subclasses", [&] { fClass->EnumerateSubClasses(drop, true, {}); }, 1},
        {"subclasses, throwing", [&] { fClass->EnumerateSubClasses(dropAndThrow, true, {}); }, 1},
        {"property declarations", [&] { fClass->EnumeratePropertyDecls(drop, {}); }, 2},
        {"keys", [&] { fClass->EnumerateKeyNames(drop, {}); }, 2},
        {"class-level values", [&] { fClass->EnumerateStaticProperties(drop, {}); }, 2},
        {"method declarations", [&] { fClass->EnumerateMethodDecls(drop, {}); }, 2},
        {"qualifiers", [&] { fClass->EnumerateQualifiers(drop, {}); }, 2},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        Allocate();
        ASSERT_TRUE(fClass);
        visits = 0;
        row.fCall();
        EXPECT_EQ(row.fVisits, visits);
    }
}

TEST_F(LifetimeTest, WhatTheHostStillHoldsNeitherDelaysTheEndNorReachesIntoIt)
{
    Allocate();
    std::vector<boost::shared_ptr<ICIMInstance>> instances;
    fClass->EnumerateInstances(
        [&](const boost::shared_ptr<ICIMInstance>& instance) {
            instances.push_back(instance);
            return true;
        },
        true, {});
    ASSERT_EQ(2U, instances.size());
    const TCIMValue peer = instances[0]->GetProperty("Peer", {})->GetValue({});
    ASSERT_EQ(fClass, peer.GetReferencedClass());
    const auto decl = fClass->GetPropertyDecl("Id", {});
    const auto keptClass = fClass;
    auto entered = fClass->AllocateInstance({});
    entered->AddToNamespace({});
    const boost::weak_ptr<ICIMInstance> watched = entered;
    entered.reset();
    const auto keptProvider = fProvider;
    boost::weak_ptr<ICIMClass> other = fNamespace->GetClass("ACME_Two", {});
    fRig.fWorld.Take();
    Drop();
    EXPECT_THAT(fRig.Abbreviate(fRig.fWorld.Trace()),
                ElementsAre("run cimserver -s", "sleep 3", "system " + RemovalOf("START", "-f"),
                            "system " + RemovalOf("R/pegasus/repository"),
                            "system " + RemovalOf("R/pegasus/provider/lsi_mir/repository.xml")));

    EXPECT_TRUE(watched.expired());
    EXPECT_TRUE(other.expired()); // nobody holds it: no class keeps another
    EXPECT_EQ("acme", keptProvider->GetName({}));
    int visits = 0;
    keptProvider->EnumerateClassesProvided([&](const auto&) { return ++visits != 0; }, {});
    keptClass->EnumerateSubClasses([&](const auto&) { return ++visits != 0; }, true, {});
    EXPECT_EQ(0, visits);
    EXPECT_EQ(keptClass, decl->GetClass({}));
    EXPECT_FALSE(keptClass->GetNamespace({}));
    EXPECT_EQ("ACME_One.Id=\"1\"", peer.ToString(10));
    EXPECT_FALSE(static_cast<TCIMReference>(peer).GetNamespace());
    EXPECT_EQ(keptClass, instances[1]->GetClass({}));
    EXPECT_THROW(keptClass->GetSuperClass({}), boost::bad_weak_ptr);
    TCIMContext none;
    EXPECT_THROW(instances[1]->InvokeMethod("Go", none, {}), boost::bad_weak_ptr);
}

} // namespace
} // namespace NKOLVRX20
