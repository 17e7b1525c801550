// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace NKOLVRX20 {

// What the host keeps on a provider beside the provider itself.
// Here: a provider holds an empty one, for the host to fill.
struct TProviderInfo
{
    std::string fVendor;
    std::string fVersion;
};

} // namespace NKOLVRX20
