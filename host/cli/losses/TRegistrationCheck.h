// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/losses/TLossLog.h"
#include "host/cli/losses/TVendorFiles.h"
#include "host/cli/model/Document.h"

#include <host/ICIMNamespace.h>

#include <map>
#include <set>
#include <string>
#include <vector>

namespace vrxhost {

// Finds what is missing without any failure: classes that no provider is registered for, and folders that nothing asks
// for. Reads the server's registrations through the namespace. Thread: one at a time.
class TRegistrationCheck
{
  public:
    // The arguments outlive the object.
    TRegistrationCheck(NKOLVRX20::ICIMNamespace& ns, const TVendorFiles& files, TLossLog& losses);

    // Enters the losses. providers: with the instances that were collected; classes that were not asked are left out.
    void Run(const std::vector<TProviderRecord>& providers);

    // Reads the registrations before the instances are asked for. What fails is reported by Run.
    void ReadModules();

    // Returns: the vendor of each provider module.
    const std::map<std::string, std::string>& GetModuleVendors() const { return fModuleVendors; }

  private:
    struct TRegistration
    {
        std::string fClass;
        std::set<std::string> fNamespaces; // in small letters
        std::string fModule;
    };

    void ReadRegistrations();
    void CheckFolders();
    void CheckClasses(const std::vector<TProviderRecord>& providers);
    void CheckClass(const TClassList& list, const std::string& name);
    bool IsRegisteredForSubclass(const TClassList& list, const std::string& name);
    void EnterLoss(const TClassList& list, const std::string& name, ELossKind kind, const std::string& end);

    NKOLVRX20::ICIMNamespace& fNamespace;
    const TVendorFiles& fFiles;
    TLossLog& fLosses;
    std::vector<TRegistration> fRegistrations;
    bool fIsKnown = false; // whether the server has answered
    std::map<std::string, std::string> fModuleVendors;
};

} // namespace vrxhost
