// SPDX-License-Identifier: MIT
#include "src/plugin/TPEGASUSNamespaceProvider.h"

#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/Directories.h"
#include "src/namespace/TPEGASUSNamespace.h"

#include <host/ICIMNamespace.h>
#include <host/INamespaceProviderManager.h>
#include <host/TRootObject.h>

#include <boost/make_shared.hpp>

#include <dlfcn.h>

namespace NKOLVRX20 {

void CmpiInit()
{
    Dl_info library = {};
    if (::dladdr(reinterpret_cast<void*>(&CmpiInit), &library) == 0 || library.dli_fname == nullptr) {
        LogFailure("PEGASUS NSP initialization failed");
        return;
    }
    const std::string file = library.dli_fname;
    const auto slash = file.rfind('/');
    TPEGASUSNamespaceProvider::GetfgModulePathName() = slash == std::string::npos ? "." : file.substr(0, slash);
}

namespace {

// Run by the loader, before the host can call anything: the module path is known from the first call on.
[[maybe_unused]] const bool fgInitialized = (CmpiInit(), true);

} // namespace

std::string& TPEGASUSNamespaceProvider::GetfgModulePathName()
{
    return ModulePath();
}

boost::shared_ptr<TPEGASUSNamespaceProvider> TPEGASUSNamespaceProvider::GetInstance()
{
    static const boost::shared_ptr<TPEGASUSNamespaceProvider> fgInstance =
        boost::make_shared<TPEGASUSNamespaceProvider>();
    return fgInstance;
}

void TPEGASUSNamespaceProvider::Initialize()
{
    TRootObject::GetNamespaceProviderManager()->RegisterNamespaceProvider(GetInstance());
}

boost::shared_ptr<TPEGASUSNamespace> TPEGASUSNamespaceProvider::GetNamespace()
{
    return GetInstance()->fNamespace;
}

void TPEGASUSNamespaceProvider::ClearNamespace()
{
    GetInstance()->fNamespace.reset();
}

std::string TPEGASUSNamespaceProvider::GetName(TCIMContext) const
{
    static const std::string fgName = "pegasus";
    return fgName;
}

boost::shared_ptr<ICIMNamespace> TPEGASUSNamespaceProvider::AllocateNamespace(TCIMContext context, bool,
                                                                              std::string) const
{
    const boost::shared_ptr<TPEGASUSNamespace> allocated =
        boost::make_shared<TPEGASUSNamespace>(context, kDefaultCimNamespace);
    // Before starting: if the plug-in was the last owner of the earlier namespace, its server ends here, before the new
    // one starts.
    fNamespace = allocated;
    allocated->Initialize(context);
    allocated->FindProviders();
    return allocated;
}

int TPEGASUSNamespaceProvider::GetType(TCIMContext) const
{
    return 0;
}

bool TPEGASUSNamespaceProvider::IsIndicationsSupported(TCIMContext) const
{
    return false;
}

} // namespace NKOLVRX20
