// SPDX-License-Identifier: MIT
#include "src/namespace/TPEGASUSNamespace.h"

#include "src/common/CoreLog.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/Removal.h"
// Upwards, on purpose: the host asks a namespace for its provider, and that is the entry's one object.
#include "src/plugin/TPEGASUSNamespaceProvider.h"
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"
#include "src/schema/TPEGASUSQualifierDecl.h"

#include <host/ICIMIndicationFilter.h>
#include <host/ICIMInstance.h>

namespace NKOLVRX20 {

namespace {

constexpr char kHostAddress[] = "127.0.0.1";

constexpr TConnectionTexts kConnectionTexts = {
    "TPEGASUSNamespace:Pegasus Client Creation Fail: ",
    "TPEGASUSNamespace::connect enter",
    "TPEGASUSNamespace::connect succeeded \n",
    "TPEGASUSNamespace::connect failed: ",
};

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

// Runs one step of the destructor: what it throws is logged, so that the next step still runs.
template <typename TStep> void RunShutdownStep(const char* name, TStep step) noexcept
{
    try {
        step();
    } catch (...) {
        LogCaughtException("TPEGASUSNamespace::~TPEGASUSNamespace failed at ", name, ": ");
    }
}

} // namespace

TPEGASUSNamespace::TPEGASUSNamespace(TCIMContext context, std::string name)
    : TClientOwner(kConnectionTexts), fName(name), fTree(GetVRXRootPath()), fHostAddress(kHostAddress),
      fPort(kPreferredPort), fRefused(!IsSafeDirectory(fTree.Root())),
      fRepositoryNamespace(NamespaceFromContext(context, "repository")),
      fUpcallNamespace(NamespaceFromContext(context, "upcall"))
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

// Providers and classes hold each other, and so do classes and their instances. This step breaks the cycles; otherwise
// one pointer in the host's hands would keep all of them alive.
void TPEGASUSNamespace::ReleaseCycles()
{
    for (const auto& provider : fProviders) {
        provider->SetCollectedClasses({});
    }
    fClasses.Visit([](const boost::shared_ptr<TPEGASUSClass>& entered) {
        entered->ReleaseLinks();
        return true;
    });
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
    LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSNamespace::AddUnderlyingNamespace failed: ", fName,
                ": not supported");
}

void TPEGASUSNamespace::Subscribe(boost::shared_ptr<ICIMIndicationFilter>, TInstanceVisitor, TCIMContext)
{
    LogAndThrow(TVRXStatusCode::kOperationNotSupported, "TPEGASUSNamespace::Subscribe failed: ", fName,
                ": indications are not supported");
}

boost::shared_ptr<ICIMInstance> TPEGASUSNamespace::GetInstance(const TCIMReference& reference, TCIMContext context)
{
    const auto instanceClass = boost::dynamic_pointer_cast<TPEGASUSClass>(GetClass(reference.GetClassName(), context));
    return instanceClass ? instanceClass->GetInstance(reference, context) : nullptr;
}

ICIMNamespace& TPEGASUSNamespace::RepositoryNamespace(const char* operation, const std::string& object) const
{
    if (!fRepositoryNamespace) {
        LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSNamespace::", operation, " failed: ", object,
                    ": the host gave no repository namespace");
    }
    return *fRepositoryNamespace;
}

void TPEGASUSNamespace::DeleteInstance(const TCIMReference& reference, TCIMContext context)
{
    RepositoryNamespace("DeleteInstance", reference.GetPath()).DeleteInstance(reference, context);
}

void TPEGASUSNamespace::ModifyInstance(const TCIMReference& reference, TCIMContext values, TCIMContext context)
{
    RepositoryNamespace("ModifyInstance", reference.GetPath()).ModifyInstance(reference, values, context);
}

void TPEGASUSNamespace::ExecuteQuery(TInstanceVisitor visitor, std::string& language, std::string& query,
                                     TCIMContext context)
{
    RepositoryNamespace("ExecuteQuery", query).ExecuteQuery(visitor, language, query, context);
}

void TPEGASUSNamespace::ClearInstances() {}

ICIMNamespace& TPEGASUSNamespace::operator=(const ICIMNamespace&)
{
    return *this;
}

} // namespace NKOLVRX20
