#pragma once

#include <string>

namespace NKOLVRX20 {

// What the host keeps on a provider beside the provider itself.
struct TProviderInfo
{
    std::string fVendor;
    std::string fVersion;
};

} // namespace NKOLVRX20
