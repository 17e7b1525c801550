// SPDX-License-Identifier: MIT
// What a provider says of itself, and which operations it refuses or ignores.
#include "src/provider/TPEGASUSProvider.h"
#include "tests/src/support/StatusOf.h"

#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

TEST(ProviderObjectTest, KnowsNoNamespaceAndCopiesNothing)
{
    TPEGASUSProvider provider, other;
    provider.SetName("acme");
    other.SetName("beta");
    EXPECT_EQ(31U, StatusOf([&] { provider.GetNamespace({}); }));
    IProvider& same = provider;
    EXPECT_EQ(&same, &(same = other));
    EXPECT_EQ("acme", provider.GetName({}));
    provider.Initialize(nullptr, nullptr);
    provider.AddPluginToClass();
    EXPECT_FALSE(provider.IsInitialized());
    EXPECT_NE(nullptr, provider.GetProviderInfo());
    EXPECT_FALSE(provider.IsClassesProvided(""));
    provider.EnumerateClassesProvided([](const auto&) { return ADD_FAILURE() << "nothing to visit", true; }, {});
}

} // namespace
} // namespace NKOLVRX20
