// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace vrxhost {

// Hears from the collector whom it asks, and decides when a provider has taken too long.
class IProviderWatch
{
  public:
    virtual ~IProviderWatch() = default;

    virtual void BeginProvider(const std::string& name) = 0;
    virtual void BeginClass(const std::string& className) = 0;
    virtual void EndProvider() = 0;

    // Returns: true once the provider is to be left as it is; the collector goes on with the next one.
    virtual bool IsGivenUp() const = 0;
    virtual int GetDeadlineSeconds() const = 0;
};

} // namespace vrxhost
