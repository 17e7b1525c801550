// SPDX-License-Identifier: MIT
// The entry object: the singleton, the module path, and the namespaces that it makes and drops.
#include "src/plugin/TPEGASUSNamespaceProvider.h"
#include "tests/src/support/NamespaceRig.h"

#include <host/INamespaceProviderManager.h>
#include <host/TRootObject.h>
#include <host/TVRXException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;

class EntryTest : public ::testing::Test
{
  protected:
    EntryTest()
    {
        fRig.OfferPortOf(fServer);
        fServer.Listen();
    }
    ~EntryTest() override { TPEGASUSNamespaceProvider::ClearNamespace(); }

    boost::shared_ptr<ICIMNamespace> Allocate(const std::string& name = "root/cimv2",
                                              const boost::shared_ptr<ICIMNamespace>& upcall = nullptr) const
    {
        TCIMContext context = fRig.Context();
        context["upcall"] = TCIMValue(reinterpret_cast<unsigned long>(&upcall));
        return TPEGASUSNamespaceProvider::GetInstance()->AllocateNamespace(context, false, name);
    }

    TFakeCimServer fServer;
    TNamespaceRig fRig;
};

TEST_F(EntryTest, InitializeRegistersTheOneInstance)
{
    const auto manager = TRootObject::GetNamespaceProviderManager();
    TPEGASUSNamespaceProvider::Initialize();
    const auto instance = TPEGASUSNamespaceProvider::GetInstance();
    EXPECT_EQ(instance, manager->GetNamespaceProvider("pegasus"));
    manager->UnregisterNamespaceProvider(instance);
    EXPECT_EQ(0, instance->GetType({}));
    EXPECT_FALSE(instance->IsIndicationsSupported({}));
}

TEST_F(EntryTest, RecordsItsDirectoryOrSaysThatItCannot)
{
    std::string& path = TPEGASUSNamespaceProvider::GetfgModulePathName();
    path.clear();
    fRig.fWorld.fDladdrFails = true;
    CmpiInit();
    EXPECT_EQ("", path);
    EXPECT_THAT(fRig.fLog.Take(), ElementsAre("0|PEGASUS NSP initialization failed"));
    fRig.fWorld.fDladdrFails = false;
    fRig.fWorld.fDladdrFile = nullptr;
    CmpiInit();
    EXPECT_EQ("", path);
    EXPECT_THAT(fRig.fLog.Take(), ElementsAre("0|PEGASUS NSP initialization failed"));
    const std::string deep = "/" + std::string(600, 'd');
    const std::pair<std::string, std::string> rows[] = {{"/opt/x/lib/libplug.so", "/opt/x/lib"},
                                                        {"./libplug.so", "."},
                                                        {"libplug.so", "."},
                                                        {deep + "/libplug.so", deep}};
    for (const auto& [file, directory] : rows) {
        fRig.fWorld.fDladdrFile = file.c_str();
        CmpiInit();
        EXPECT_EQ(directory, path);
    }
}

TEST_F(EntryTest, TheNamespaceIsTheSameWhateverIsAskedForAndAnotherTakesItsPlace)
{
    EXPECT_EQ(nullptr, TPEGASUSNamespaceProvider::GetNamespace());
    Allocate("root/other");
    const boost::weak_ptr<TPEGASUSNamespace> first = TPEGASUSNamespaceProvider::GetNamespace();
    ASSERT_FALSE(first.expired());
    EXPECT_TRUE(first.lock()->isConnected());
    EXPECT_EQ("root/cimv2", first.lock()->GetName());
    EXPECT_EQ("3|PEGASUS NSP with the consumer: " + fRig.fConsumer, fRig.fLog.Lines().front());

    fRig.fWorld.Take();
    Allocate();
    EXPECT_TRUE(first.expired());
    const auto trace = fRig.fWorld.Take();
    EXPECT_EQ("run cimserver -s", trace.front()); // the old server ends before the new one starts
    EXPECT_THAT(trace,
                Contains("run cimserver httpPort=" + std::to_string(fServer.Port()) + " enableHttpsConnection=false"));

    const auto held = TPEGASUSNamespaceProvider::GetNamespace();
    Allocate("", held);
    EXPECT_EQ(held, TPEGASUSNamespaceProvider::GetNamespace()->GetUpcallNamespace());
    EXPECT_TRUE(held->isConnected()); // lives on with the host
    EXPECT_NE(held, TPEGASUSNamespaceProvider::GetNamespace());
}

TEST_F(EntryTest, AFailureLeavesTheNewNamespaceInPlace)
{
    fRig.fModule.Write("pegasus/provider/acme/a.classes.xml", "<vrx/>");
    fRig.fWorld.fUnreadableDirectory = fRig.M() + "/pegasus/provider";
    EXPECT_EQ(11U, StatusOf([&] { Allocate(); }));
    ASSERT_NE(nullptr, TPEGASUSNamespaceProvider::GetNamespace());
    fRig.fWorld.Take();
    TPEGASUSNamespaceProvider::ClearNamespace();
    EXPECT_EQ(nullptr, TPEGASUSNamespaceProvider::GetNamespace());
    EXPECT_THAT(fRig.fWorld.Trace(), Contains("run cimserver -s"));
}

} // namespace
} // namespace NKOLVRX20
