#ifndef HOST_TPROVIDERINFO_H
#define HOST_TPROVIDERINFO_H

#include <string>

namespace NKOLVRX20 {

// What the host keeps on a provider beside the provider itself.
struct TProviderInfo
{
    std::string fVendor;
    std::string fVersion;
};

} // namespace NKOLVRX20

#endif
