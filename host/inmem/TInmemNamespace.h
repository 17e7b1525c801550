// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMNamespace.h>

#include <boost/weak_ptr.hpp>

#include <map>
#include <vector>

namespace NKOLVRX20 {

// A namespace whose classes, qualifier declarations and instances are kept in memory. The host gives it to a plug-in
// as upcall namespace (where the plug-in looks up qualifier declarations) and as repository (where the plug-in
// delegates the operations that it leaves to the host); a record of a machine is read into one, with its providers.
// Thread: one at a time.
class TInmemNamespace : public ICIMNamespace
{
  public:
    TInmemNamespace() = default;
    // Clears the classes, which hold their instances and are held by them.
    ~TInmemNamespace() override;

    // Add an object, or replace the one of the same name or path.
    void AddClass(const boost::shared_ptr<ICIMClass>& newClass);
    void AddQualifierDecl(const boost::shared_ptr<ICIMQualifierDecl>& declaration);
    void AddInstance(const boost::shared_ptr<ICIMInstance>& instance);
    void AddProvider(const boost::shared_ptr<IProvider>& provider) { fProviders.push_back(provider); }

    // Returns: null: the host itself made this namespace.
    boost::shared_ptr<INamespaceProvider> GetNamespaceProvider(TCIMContext context) override;
    void SetUpcallNamespace(boost::shared_ptr<ICIMNamespace> upcall, TCIMContext context) override;
    // Throws: TVRXException 31.
    void AddUnderlyingNamespace(boost::shared_ptr<ICIMNamespace> underlying, TCIMContext context) override;
    // Throws: TVRXException 31. Classes are made elsewhere and added.
    boost::shared_ptr<ICIMClass> AllocateClass(const std::string& name, boost::shared_ptr<ICIMClass> superClass,
                                               TCIMContext context) override;
    boost::shared_ptr<ICIMClass> GetClass(const std::string& name, TCIMContext context) override;
    void EnumerateRootClasses(TClassVisitor visitor, TCIMContext context) override;
    // In the order in which they were added, on the calling thread, whatever pluginType says.
    void EnumerateProviders(TProviderVisitor visitor, TCIMContext context) override;
    // Throws: TVRXException 31.
    boost::shared_ptr<ICIMQualifierDecl> AllocateQualifierDecl(const std::string& name, TCIMValue defaultValue,
                                                               ICIMQualifierDecl::EScope scope,
                                                               ICIMQualifierDecl::EFlavor flavor,
                                                               TCIMContext context) override;
    boost::shared_ptr<ICIMQualifierDecl> GetQualifierDecl(const std::string& name, TCIMContext context) override;
    void EnumerateQualifierDecls(TQualifierDeclVisitor visitor, TCIMContext context) override;
    // Throws: TVRXException 31.
    void Subscribe(boost::shared_ptr<ICIMIndicationFilter> filter, TInstanceVisitor visitor,
                   TCIMContext context) override;
    // Finds an instance by its path text, byte for byte.
    boost::shared_ptr<ICIMInstance> GetInstance(const TCIMReference& reference, TCIMContext context) override;
    // Throws: TVRXException 6 when the instance is absent.
    void DeleteInstance(const TCIMReference& reference, TCIMContext context) override;
    // Throws: TVRXException 6 when the instance is absent.
    void ModifyInstance(const TCIMReference& reference, TCIMContext values, TCIMContext context) override;
    // Throws: TVRXException 31.
    void ExecuteQuery(TInstanceVisitor visitor, std::string& language, std::string& query,
                      TCIMContext context) override;
    void ClearInstances() override;

  private:
    std::map<std::string, boost::shared_ptr<ICIMClass>> fClasses;                // by normalised name
    std::map<std::string, boost::shared_ptr<ICIMQualifierDecl>> fQualifierDecls; // by normalised name
    std::map<std::string, boost::shared_ptr<ICIMInstance>> fInstances;           // by path text
    std::vector<boost::shared_ptr<IProvider>> fProviders;
    boost::weak_ptr<ICIMNamespace> fUpcall;
};

} // namespace NKOLVRX20
