// SPDX-License-Identifier: MIT
#pragma once

#include "src/common/ClientConnection.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/IProvider.h>
#include <host/TProviderInfo.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

// CMPI's own names for a broker and a call context.
struct _CMPIBroker;  // NOLINT(bugprone-reserved-identifier)
struct _CMPIContext; // NOLINT(bugprone-reserved-identifier)

namespace NKOLVRX20 {

// One vendor provider: what its requested-class file says, the classes that were fetched for it, and a client of its
// own.
// Ownership: shared by the namespace's list, the classes bound to it, and the host.
// Thread: one at a time.
class TPEGASUSProvider : public IProvider, public TClientOwner
{
  public:
    TPEGASUSProvider();
    ~TPEGASUSProvider() override;

    std::string GetName(TCIMContext context) const override;
    // Returns: "lib" and the name.
    std::string GetModuleName(TCIMContext context) const override;
    std::string GetDescription(TCIMContext context) const override;
    // Throws: TVRXException 31, always.
    boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const override;
    // Visits the collected classes in request order; those tagged "CDM" and those whose qualifier "DONTCOLLECT" is true
    // are left out. The visitor's result is ignored; a TVRXException costs only its own class.
    void EnumerateClassesProvided(TClassVisitor visitor, TCIMContext context) override;
    // Leaves this object as it is.
    IProvider& operator=(const IProvider& other) override;

    // Creates the client and connects it, as the namespace does.
    void initPegasusClient();
    void connectPegasusClient(const std::string& host, unsigned short port, const std::string& user,
                              const std::string& password);
    // Returns: the server namespace in which the provider's classes are compiled and asked for: the one that the
    // requested-class file gives, else "root/cimv2".
    const std::string& GetServerNamespace() const;
    // Returns: the same as the client library wants it.
    // Throws: Pegasus::InvalidNamespaceNameException when the requested-class file gave a bad one.
    Pegasus::CIMNamespaceName GetPegNamespace() const;

    // Returns: whether a class of exactly this name, case included, was collected.
    bool IsClassesProvided(const std::string& className) const;

    // Kept for the host's callers; calls are ignored.
    void Initialize(const _CMPIBroker* broker, const _CMPIContext* context);
    void AddPluginToClass();

    void SetType(std::string type);
    void SetPath(std::string path);
    void SetName(std::string name);
    void SetDescription(std::string description);
    void SetModuleName(std::string moduleName);
    void SetNameSpaceName(std::string nameSpaceName);
    void SetDefaultTimeoutVal(std::string& seconds);
    void SetClassVector(std::vector<std::string>& entries);
    void SetCollectedClasses(std::vector<boost::shared_ptr<ICIMClass>> classes);
    void SetDiagnosticOnly(bool diagnosticOnly);

    const std::string& GetType() const { return fType; }
    // Returns: the full path of the requested-class file; the provider's identity.
    const std::string& GetPath() const { return fPath; }
    // Returns: the namespace as the requested-class file gives it, for instance "root/cimv2"; possibly empty.
    const std::string& GetNameSpaceName(const TCIMContext& context) const;
    const std::string& GetDefaultTimeoutVal() const { return fDefaultTimeout; }
    // Returns: the requested entries as the file has them, timeouts and tags included.
    std::vector<std::string> GetClassVector() const { return fRequestedClasses; }
    const std::vector<boost::shared_ptr<ICIMClass>>& GetCollectedClasses() const { return fCollectedClasses; }
    bool GetDiagnosticOnly() const { return fDiagnosticOnly; }
    boost::shared_ptr<TProviderInfo> GetProviderInfo() const { return fProviderInfo; }
    // Returns: false, always: initialisation by way of CMPI is unused.
    bool IsInitialized() const { return fInitialized; }

  private:
    static void OfferClass(const boost::shared_ptr<ICIMClass>& collected, const std::string& providerName,
                           const TClassVisitor& visitor);

    std::string fType;
    std::string fPath;
    std::string fName;
    std::string fDescription;
    std::string fModuleName;
    std::string fNameSpaceName;
    std::string fDefaultTimeout;
    std::vector<std::string> fRequestedClasses;
    std::vector<boost::shared_ptr<ICIMClass>> fCollectedClasses;
    bool fDiagnosticOnly = false;
    boost::shared_ptr<TProviderInfo> fProviderInfo;
    bool fInitialized = false;
};

} // namespace NKOLVRX20
