#pragma once

#include <host/HostFwd.h>
#include <host/ICIMQualifierDecl.h>
#include <host/TCIMReference.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// A namespace of the host's model: classes, qualifier declarations, instances, and the providers behind them.
// Thread: one thread at a time drives a namespace.
class ICIMNamespace
{
  public:
    virtual ~ICIMNamespace() = default;

    virtual boost::shared_ptr<INamespaceProvider> GetNamespaceProvider(TCIMContext context) = 0;
    // Ownership: the namespace keeps the upcall namespace weakly.
    virtual void SetUpcallNamespace(boost::shared_ptr<ICIMNamespace> upcall, TCIMContext context) = 0;
    virtual void AddUnderlyingNamespace(boost::shared_ptr<ICIMNamespace> underlying, TCIMContext context) = 0;
    virtual boost::shared_ptr<ICIMClass> AllocateClass(const std::string& name, boost::shared_ptr<ICIMClass> superClass,
                                                       TCIMContext context) = 0;
    // Returns: the class of that name, case ignored; possibly null.
    virtual boost::shared_ptr<ICIMClass> GetClass(const std::string& name, TCIMContext context) = 0;
    virtual void EnumerateRootClasses(TClassVisitor visitor, TCIMContext context) = 0;
    virtual void EnumerateProviders(TProviderVisitor visitor, TCIMContext context) = 0;
    virtual boost::shared_ptr<ICIMQualifierDecl> AllocateQualifierDecl(const std::string& name, TCIMValue defaultValue,
                                                                       ICIMQualifierDecl::EScope scope,
                                                                       ICIMQualifierDecl::EFlavor flavor,
                                                                       TCIMContext context) = 0;
    virtual boost::shared_ptr<ICIMQualifierDecl> GetQualifierDecl(const std::string& name, TCIMContext context) = 0;
    virtual void EnumerateQualifierDecls(TQualifierDeclVisitor visitor, TCIMContext context) = 0;
    virtual void Subscribe(boost::shared_ptr<ICIMIndicationFilter> filter, TInstanceVisitor visitor,
                           TCIMContext context) = 0;
    // Returns: the instance that the reference names; possibly null.
    virtual boost::shared_ptr<ICIMInstance> GetInstance(const TCIMReference& reference, TCIMContext context) = 0;
    virtual void DeleteInstance(const TCIMReference& reference, TCIMContext context) = 0;
    virtual void ModifyInstance(const TCIMReference& reference, TCIMContext values, TCIMContext context) = 0;
    virtual void ExecuteQuery(TInstanceVisitor visitor, std::string& language, std::string& query,
                              TCIMContext context) = 0;
    virtual void ClearInstances() = 0;
};

} // namespace NKOLVRX20
