#include "src/namespace/TPEGASUSNamespace.h"

#include "src/common/CoreLog.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/SafeNames.h"
#include "src/namespace/ServerTree.h"
#include "src/plugin/TPEGASUSNamespaceProvider.h"
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"
#include "src/schema/TPEGASUSQualifierDecl.h"

#include <host/ICIMIndicationFilter.h>
#include <host/ICIMInstance.h>
#include <host/TVRXException.h>

#include <cstdlib>

namespace NKOLVRX20 {

namespace {

constexpr char kHostAddress[] = "127.0.0.1";

// Vendors whose libraries the server must find.
constexpr const char* kLibraryVendors[] = {"/broadcom", "/mellanox", "/intelCDM", "/brocade", "/fusionio", "/nvidia"};
constexpr char kProgramVendor[] = "/mellanox";

std::string LibraryPath(const std::string& root)
{
    std::string path = root + kLibraryDirectory + ":" + root;
    for (const char* vendor : kLibraryVendors) {
        path += ":" + root + kProviderDirectory + vendor;
    }
    return path;
}

std::string ProgramPath(const std::string& root)
{
    const char* inherited = std::getenv("PATH");
    return std::string(inherited ? inherited : "") + ":" + root + ":" + root + kProviderDirectory + kProgramVendor;
}

std::vector<std::string> ServerEnvironment(const std::string& root)
{
    return {"PEGASUS_HOME=" + root + kPegasusHome, "LD_LIBRARY_PATH=" + LibraryPath(root), "PATH=" + ProgramPath(root)};
}

// Returns: the namespace whose shared pointer's address the context holds as an unsigned 64-bit number, or null.
boost::shared_ptr<ICIMNamespace> NamespaceFromContext(const TCIMContext& context, const std::string& key)
{
    const auto entry = context.find(key);
    if (entry == context.end() || entry->second.IsArray() || entry->second.IsNull() ||
        entry->second.GetType() != TCIMValue::TCIMType::kUint64)
    {
        return nullptr;
    }
    const unsigned long address = entry->second;
    // The host passes a pointer as a number.
    // NOLINTNEXTLINE(performance-no-int-to-ptr)
    const auto* pointer = reinterpret_cast<const boost::shared_ptr<ICIMNamespace>*>(address);
    return pointer ? *pointer : nullptr;
}

// Runs one step of the destructor.
template <typename TStep> void RunShutdownStep(const char* name, TStep step) noexcept
{
    try {
        step();
    } catch (...) {
        LogCaughtException(kShutdownStepFailedText, name, ": ");
    }
}

} // namespace

TPEGASUSNamespace::TPEGASUSNamespace(TCIMContext context, std::string name)
    : fName(name), fRootDirectory(GetVRXRootPath()), fServerProgramDirectory(fRootDirectory + kProgramDirectory),
      fServerEnvironment(ServerEnvironment(fRootDirectory)), fHostAddress(kHostAddress), fPort(kPreferredPort),
      fRefused(!IsSafeDirectory(fRootDirectory)), fRepositoryNamespace(NamespaceFromContext(context, "repository")),
      fUpcallNamespace(NamespaceFromContext(context, "upcall")), fConnection(kNamespaceConnectionTexts)
{
}

TPEGASUSNamespace::~TPEGASUSNamespace()
{
    if (!fRefused) {
        RunShutdownStep("stop command", [this] { StopCimserver(); });
        RunShutdownStep("residual server", [this] { closeCimserver(false); });
        RunShutdownStep("repository", [this] { cleanCimserver(); });
    }
    RunShutdownStep("release", [this] { ReleaseCycles(); });
}

void TPEGASUSNamespace::ReleaseCycles()
{
    for (const auto& provider : fProviders) {
        provider->SetCollectedClasses({});
    }
    for (const auto& entry : fClasses) {
        entry.second->ReleaseLinks();
    }
    if (fRootClass) {
        fRootClass->ReleaseLinks();
    }
}

boost::shared_ptr<INamespaceProvider> TPEGASUSNamespace::GetNamespaceProvider(TCIMContext)
{
    return TPEGASUSNamespaceProvider::GetInstance();
}

void TPEGASUSNamespace::SetUpcallNamespace(boost::shared_ptr<ICIMNamespace> upcall, TCIMContext)
{
    fUpcallNamespace = upcall;
}

boost::shared_ptr<ICIMNamespace> TPEGASUSNamespace::GetUpcallNamespace() const
{
    return boost::shared_ptr<ICIMNamespace>(fUpcallNamespace);
}

void TPEGASUSNamespace::AddUnderlyingNamespace(boost::shared_ptr<ICIMNamespace>, TCIMContext)
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

void TPEGASUSNamespace::Subscribe(boost::shared_ptr<ICIMIndicationFilter>, TInstanceVisitor, TCIMContext)
{
    throw TVRXException(TVRXStatusCode::kOperationNotSupported);
}

boost::shared_ptr<ICIMInstance> TPEGASUSNamespace::GetInstance(const TCIMReference& reference, TCIMContext context)
{
    const auto instanceClass = boost::dynamic_pointer_cast<TPEGASUSClass>(GetClass(reference.GetClassName(), context));
    return instanceClass ? instanceClass->GetInstance(reference, context) : nullptr;
}

ICIMNamespace& TPEGASUSNamespace::RepositoryNamespace() const
{
    if (!fRepositoryNamespace) {
        throw TVRXException(TVRXStatusCode::kNotSupported);
    }
    return *fRepositoryNamespace;
}

void TPEGASUSNamespace::DeleteInstance(const TCIMReference& reference, TCIMContext context)
{
    RepositoryNamespace().DeleteInstance(reference, context);
}

void TPEGASUSNamespace::ModifyInstance(const TCIMReference& reference, TCIMContext values, TCIMContext context)
{
    RepositoryNamespace().ModifyInstance(reference, values, context);
}

void TPEGASUSNamespace::ExecuteQuery(TInstanceVisitor visitor, std::string& language, std::string& query,
                                     TCIMContext context)
{
    RepositoryNamespace().ExecuteQuery(visitor, language, query, context);
}

void TPEGASUSNamespace::ClearInstances() {}

ICIMNamespace& TPEGASUSNamespace::operator=(const ICIMNamespace&)
{
    return *this;
}

} // namespace NKOLVRX20
