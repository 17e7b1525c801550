// SPDX-License-Identifier: MIT
#include "host/cli/losses/TRegistrationCheck.h"

#include "host/cli/model/ErrorReport.h"
#include "host/cli/model/Names.h"
#include "host/cli/model/NoContext.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMProperty.h>

#include <algorithm>
#include <cctype>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

constexpr char kInterOpNamespace[] = "root/PG_InterOp";
constexpr char kCapabilitiesClass[] = "PG_ProviderCapabilities";
constexpr int kMaxDepth = 128; // of a chain of superclasses

TCIMContext In(const std::string& serverNamespace)
{
    return {{"nsp", TCIMValue(serverNamespace)}};
}

TCIMValue ValueOf(const ICIMInstance& instance, const char* property)
{
    return instance.GetProperty(property, kNoContext)->GetValue(kNoContext);
}

std::set<std::string> NamespacesOf(const ICIMInstance& capabilities)
{
    std::set<std::string> names;
    const TCIMValue value = ValueOf(capabilities, "Namespaces");
    if (value.IsArray() && !value.IsNull()) {
        for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(value)) {
            names.insert(SmallLetters(element.ToString(10)));
        }
    }
    return names;
}

} // namespace

TRegistrationCheck::TRegistrationCheck(ICIMNamespace& ns, const TVendorFiles& files, TLossLog& losses)
    : fNamespace(ns), fFiles(files), fLosses(losses)
{
    for (const TClassList& list : files.GetClassLists()) {
        fModuleVendors[list.fModule] = list.fVendor; // many vendors use one name for both
    }
}

void TRegistrationCheck::Run(const std::vector<TProviderRecord>& providers)
{
    CheckFolders();
    const std::string error = ErrorOf([&] {
        if (!fIsKnown) {
            ReadRegistrations();
        }
        if (fIsKnown) {
            CheckClasses(providers);
        }
    });
    if (!error.empty()) {
        fLosses.Add("the registrations of the providers could not be read: " + error);
    }
}

void TRegistrationCheck::CheckClasses(const std::vector<TProviderRecord>& providers)
{
    for (const TProviderRecord& provider : providers) {
        for (const TClassRecord& each : provider.fClasses) {
            const TClassList* const list = each.fInstanceCount == 0 ? fFiles.FindClass(each.fName) : nullptr;
            if (list) {
                CheckClass(*list, each.fName);
            }
        }
    }
}

// A folder may as well hold nothing but libraries that other vendors share.
void TRegistrationCheck::CheckFolders()
{
    for (const TVendorFolder& folder : fFiles.GetFolders()) {
        const bool hasMof = folder.fHasDefinitions || folder.fHasRegistration;
        if (folder.fHasClassList || !(hasMof || folder.fHasLibrary)) {
            continue;
        }
        TLoss loss = LossOf(ELossKind::kNoClassList,
                            "the folder has no class list (*.classes.xml), so that nothing of it is shown");
        loss.fVendor = folder.fName;
        loss.fFile = folder.fPath;
        loss.fIsNote = !hasMof;
        fLosses.Add(loss);
    }
}

void TRegistrationCheck::ReadModules()
{
    static_cast<void>(ErrorOf([this] { ReadRegistrations(); }));
}

void TRegistrationCheck::ReadRegistrations()
{
    const auto capabilities = fNamespace.GetClass(kCapabilitiesClass, In(kInterOpNamespace));
    if (!capabilities) {
        return;
    }
    capabilities->EnumerateInstances(
        [this](boost::shared_ptr<ICIMInstance> instance) {
            const TRegistration registration{ValueOf(*instance, "ClassName").ToString(10), NamespacesOf(*instance),
                                             ValueOf(*instance, "ProviderModuleName").ToString(10)};
            if (const TClassList* list = fFiles.FindClass(registration.fClass)) {
                fModuleVendors[registration.fModule] = list->fVendor;
            }
            fRegistrations.push_back(registration);
            return true;
        },
        false, kNoContext);
    fIsKnown = true;
}

void TRegistrationCheck::CheckClass(const TClassList& list, const std::string& name)
{
    std::string elsewhere;
    for (const TRegistration& registration : fRegistrations) {
        if (!IsSame(registration.fClass, name)) {
            continue;
        }
        if (registration.fNamespaces.count(SmallLetters(list.fNamespace)) != 0) {
            return;
        }
        elsewhere = JoinNames({registration.fNamespaces.begin(), registration.fNamespaces.end()});
    }
    if (IsRegisteredForSubclass(list, name)) {
        return;
    }
    const TVendorFolder* const folder = fFiles.FindFolder(list.fVendor);
    if (!elsewhere.empty()) {
        EnterLoss(list, name, ELossKind::kOtherNamespace,
                  ": asked for in namespace " + list.fNamespace + " (<nsp>), but a provider is registered for it in " +
                      elsewhere);
    } else if (folder && !folder->fHasRegistration) {
        EnterLoss(list, name, ELossKind::kNoRegistration,
                  ": no provider, because the folder has no registration file (*.registration.mof)");
    } else {
        EnterLoss(list, name, ELossKind::kNoCapabilities,
                  ": no provider, because no PG_ProviderCapabilities instance of a registration file names it");
    }
}

// The provider of a subclass answers for its superclass too.
bool TRegistrationCheck::IsRegisteredForSubclass(const TClassList& list, const std::string& name)
{
    for (const TRegistration& registration : fRegistrations) {
        if (registration.fNamespaces.count(SmallLetters(list.fNamespace)) == 0 ||
            !fFiles.FindClass(registration.fClass))
        {
            continue;
        }
        auto ancestor = fNamespace.GetClass(registration.fClass, In(list.fNamespace));
        for (int depth = 0; ancestor && !ancestor->IsRootClass(kNoContext) && depth < kMaxDepth; ++depth) {
            if (IsSame(ancestor->GetName(kNoContext), name)) {
                return true;
            }
            ancestor = ancestor->GetSuperClass(kNoContext);
        }
    }
    return false;
}

void TRegistrationCheck::EnterLoss(const TClassList& list, const std::string& name, ELossKind kind,
                                   const std::string& end)
{
    TLoss loss;
    loss.fKind = kind;
    loss.fVendor = list.fVendor;
    loss.fFile = list.fPath;
    loss.fBegin = "class ";
    loss.fObjects = {name};
    loss.fEnd = end;
    loss.fClasses = {name};
    loss.fIsConsequence = kind == ELossKind::kNoCapabilities; // possibly, of a file that did not compile
    fLosses.Add(loss);
}

} // namespace vrxhost
