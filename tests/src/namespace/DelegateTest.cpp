// SPDX-License-Identifier: MIT
// What the namespace hands to the host's own namespaces, and how it finds them in the context.
#include "tests/src/support/NamespaceRig.h"

#include <host/ICIMInstance.h>
#include <host/ICIMNamespace.h>
#include <host/ICIMQualifierDecl.h>
#include <host/INamespaceProvider.h>
#include <host/IProvider.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstring>

namespace NKOLVRX20 {
namespace {

using ::testing::_;
using ::testing::SaveArg;

// A namespace of the host.
class THostNamespace : public ICIMNamespace
{
  public:
    MOCK_METHOD(boost::shared_ptr<INamespaceProvider>, GetNamespaceProvider, (TCIMContext), (override));
    MOCK_METHOD(void, SetUpcallNamespace, (boost::shared_ptr<ICIMNamespace>, TCIMContext), (override));
    MOCK_METHOD(void, AddUnderlyingNamespace, (boost::shared_ptr<ICIMNamespace>, TCIMContext), (override));
    MOCK_METHOD(boost::shared_ptr<ICIMClass>, AllocateClass,
                (const std::string&, boost::shared_ptr<ICIMClass>, TCIMContext), (override));
    MOCK_METHOD(boost::shared_ptr<ICIMClass>, GetClass, (const std::string&, TCIMContext), (override));
    MOCK_METHOD(void, EnumerateRootClasses, (TClassVisitor, TCIMContext), (override));
    MOCK_METHOD(void, EnumerateProviders, (TProviderVisitor, TCIMContext), (override));
    MOCK_METHOD(boost::shared_ptr<ICIMQualifierDecl>, AllocateQualifierDecl,
                (const std::string&, TCIMValue, ICIMQualifierDecl::EScope, ICIMQualifierDecl::EFlavor, TCIMContext),
                (override));
    MOCK_METHOD(boost::shared_ptr<ICIMQualifierDecl>, GetQualifierDecl, (const std::string&, TCIMContext), (override));
    MOCK_METHOD(void, EnumerateQualifierDecls, (TQualifierDeclVisitor, TCIMContext), (override));
    MOCK_METHOD(void, Subscribe, (boost::shared_ptr<ICIMIndicationFilter>, TInstanceVisitor, TCIMContext), (override));
    MOCK_METHOD(boost::shared_ptr<ICIMInstance>, GetInstance, (const TCIMReference&, TCIMContext), (override));
    MOCK_METHOD(void, DeleteInstance, (const TCIMReference&, TCIMContext), (override));
    MOCK_METHOD(void, ModifyInstance, (const TCIMReference&, TCIMContext, TCIMContext), (override));
    MOCK_METHOD(void, ExecuteQuery, (TInstanceVisitor, std::string&, std::string&, TCIMContext), (override));
    MOCK_METHOD(void, ClearInstances, (), (override));
};

class DelegateTest : public ::testing::Test
{
  protected:
    static TCIMValue AddressOf(const boost::shared_ptr<ICIMNamespace>& pointer)
    {
        return reinterpret_cast<unsigned long>(&pointer);
    }

    static boost::shared_ptr<TPEGASUSNamespace> Make(const TCIMContext& context)
    {
        return boost::make_shared<TPEGASUSNamespace>(context, "root/cimv2");
    }

    TNamespaceRig fRig;
    const boost::shared_ptr<THostNamespace> fMock = boost::make_shared<THostNamespace>();
    boost::shared_ptr<ICIMNamespace> fHost = fMock;
    const TCIMContext fContext = {{"option", 1}};
};

TEST_F(DelegateTest, WritesAndQueriesGoToTheRepositoryNamespaceUnchanged)
{
    const auto ns = Make({{"repository", AddressOf(fHost)}});
    TCIMReference reference;
    reference.SetPath("CIM_A.Key=1");
    const TCIMContext values = {{"Name", "x"}};
    std::string language = "WQL", query = "select";
    const auto changesQuery = [](TInstanceVisitor, std::string&, std::string& text, TCIMContext) { text = "changed"; };
    EXPECT_CALL(*fMock, DeleteInstance(reference, fContext));
    EXPECT_CALL(*fMock, ModifyInstance(reference, values, fContext));
    EXPECT_CALL(*fMock, ExecuteQuery(_, language, query, fContext)).WillOnce(changesQuery);
    ns->DeleteInstance(reference, fContext);
    ns->ModifyInstance(reference, values, fContext);
    ns->ExecuteQuery({}, language, query, fContext);
    EXPECT_EQ("changed", query);
}

TEST_F(DelegateTest, TheRepositoryNamespaceIsKeptAliveTheUpcallNamespaceIsNot)
{
    const auto ns = Make({{"repository", AddressOf(fHost)}, {"upcall", AddressOf(fHost)}});
    EXPECT_EQ(2 + 1, fHost.use_count()); // fMock, fHost, the repository
    EXPECT_EQ(fHost, ns->GetUpcallNamespace());
    EXPECT_CALL(*fMock, GetQualifierDecl("Key", fContext));
    EXPECT_EQ(nullptr, ns->GetQualifierDecl("Key", fContext));

    boost::shared_ptr<ICIMNamespace> other = boost::make_shared<THostNamespace>();
    ns->SetUpcallNamespace(other, {});
    EXPECT_EQ(other, ns->GetUpcallNamespace());
    other.reset();
    EXPECT_THROW(ns->GetUpcallNamespace(), boost::bad_weak_ptr);
    EXPECT_THROW(ns->GetQualifierDecl("Key", {}), boost::bad_weak_ptr);
}

TEST_F(DelegateTest, OnlyAnUnsigned64BitAddressCounts)
{
    const unsigned long address = AddressOf(fHost);
    const TCIMValue wrong[] = {static_cast<long>(address),
                               std::to_string(address),
                               TCIMValue(),
                               TCIMValue(TCIMValue::TCIMType::kUint64, 0),
                               0UL,
                               TCIMValue(TCIMValue::TCIMType::kUint64, 0, {address})};
    for (const TCIMValue& value : wrong) {
        SCOPED_TRACE(value.ToString(10));
        const auto ns = Make({{"repository", value}, {"upcall", value}});
        EXPECT_EQ(31U, StatusOf([&] { ns->DeleteInstance({}, {}); }));
        EXPECT_THROW(ns->GetUpcallNamespace(), boost::bad_weak_ptr);
    }
}

// In the Itanium C++ ABI a pointer to a virtual member function begins with 1 plus the byte offset of its slot.
template <typename TFunction> std::size_t SlotOf(TFunction function)
{
    std::size_t pointer = 0;
    std::memcpy(&pointer, &function, sizeof pointer);
    return (pointer - 1) / sizeof(void*);
}

TEST(NamespaceSlotsTest, TheTwoOfItsOwnFollowTheInterface)
{
    using TOwn = TPEGASUSNamespace;
    using TAllocateClass = boost::shared_ptr<ICIMClass> (TOwn::*)(
        const std::string&, const std::string&, const std::string&, boost::shared_ptr<ICIMClass>, TCIMContext&);
    const std::size_t last = SlotOf(&ICIMNamespace::ClearInstances);
    EXPECT_EQ(last + 1, SlotOf(static_cast<TAllocateClass>(&TOwn::AllocateClass)));
    EXPECT_EQ(last + 2, SlotOf(static_cast<ICIMNamespace& (TOwn::*)(const ICIMNamespace&)>(&TOwn::operator=)));
}

} // namespace
} // namespace NKOLVRX20
