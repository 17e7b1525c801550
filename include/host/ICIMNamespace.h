// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/ICIMQualifierDecl.h>
#include <host/TCIMReference.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// A namespace of the host's model: classes, qualifier declarations, instances, and the providers behind them. The rules
// of HostFwd.h hold. INamespaceProvider::AllocateNamespace makes the namespaces of a plug-in.
//
// Here: one namespace, "root/cimv2", served by a private CIM server. The object owns that server: when its last shared
// pointer goes, it stops the server and deletes the repository. This blocks for three seconds and the time of the
// server's own stop command; failures are lines in the log.
// Here: while unconnected (all start attempts failed) classes are null, enumerations leave the visitor
// uncalled and instances are null; the log has said why.
class ICIMNamespace
{
  public:
    virtual ~ICIMNamespace() = default;

    // Returns: the entry object of the plug-in that made the namespace.
    virtual boost::shared_ptr<INamespaceProvider> GetNamespaceProvider(TCIMContext context) = 0;
    // Replaces the host namespace that GetQualifierDecl asks; null takes it away.
    // Ownership: kept weakly; the host keeps it alive.
    virtual void SetUpcallNamespace(boost::shared_ptr<ICIMNamespace> upcall, TCIMContext context) = 0;
    // Stacks another namespace below this one.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual void AddUnderlyingNamespace(boost::shared_ptr<ICIMNamespace> underlying, TCIMContext context) = 0;
    // Makes an empty class of that name below the superclass, which may be null, for the host to fill.
    // Here: unsupported. Returns: null, always; classes come from the server only.
    virtual boost::shared_ptr<ICIMClass> AllocateClass(const std::string& name, boost::shared_ptr<ICIMClass> superClass,
                                                       TCIMContext context) = 0;
    // Returns: the class of that name; null for the empty name and when the server fails to give the class.
    // Here: a class is fetched at its first mention, after its superclasses, and kept until the namespace ends; "nsp"
    // and "timeout" count at that time only. "timeout" bounds the enumerations of the class; this call has its own
    // bound. "<root>" is the pseudo-class above all others. A failure of the server is a line in the log and a null
    // class; a class whose superclass failed stands directly below "<root>".
    // Context: nsp, timeout.
    // Throws: TVRXException 25 (an invalid CIM name), 14 (nsp or timeout of a type other than string);
    // Pegasus::UninitializedObjectException when the server's answer was not HTTP.
    // Blocks: 5 seconds for each request to a silent server: two a class of the chain, one a qualifier that is new.
    virtual boost::shared_ptr<ICIMClass> GetClass(const std::string& name, TCIMContext context) = 0;
    // Visits the namespace's class tree, depth first, a class before its subclasses.
    // Here: the classes that were fetched so far, as ICIMClass::EnumerateSubClasses of "<root>" does.
    virtual void EnumerateRootClasses(TClassVisitor visitor, TCIMContext context) = 0;
    // Visits the providers, in the order in which they were found.
    // Context: pluginType. With a number other than 7 the call returns at once; an absent key means 7.
    // Threads: with the host's setting "pegasus_multi_thread" = "on" the visitor runs on one thread a provider, all at
    // once; what it returns is ignored. It may only collect, under a lock of its own: fetching classes and
    // instances uses the namespace's unguarded client and class map. Fetch after this call, on one thread.
    // Throws: TVRXException 14 when pluginType is not a kSint8 (a signed char: TCIMValue(static_cast<signed char>(7)));
    // what the visitor throws (on threads a line in the log takes its place); boost::thread_resource_error when a
    // thread cannot be made, after those that run have ended.
    // Blocks: as long as the visitors.
    virtual void EnumerateProviders(TProviderVisitor visitor, TCIMContext context) = 0;
    // Makes a qualifier declaration of the default value's type.
    // Returns: a declaration that points back to this namespace; ICIMQualifierDecl::AddToNamespace enters it.
    virtual boost::shared_ptr<ICIMQualifierDecl> AllocateQualifierDecl(const std::string& name, TCIMValue defaultValue,
                                                                       ICIMQualifierDecl::EScope scope,
                                                                       ICIMQualifierDecl::EFlavor flavor,
                                                                       TCIMContext context) = 0;
    // Looks a qualifier declaration up.
    // Here: the call goes to the upcall namespace with the same arguments; EnumerateQualifierDecls lists this
    // namespace's own declarations.
    // Throws: boost::bad_weak_ptr when the upcall namespace is unset or gone; what the upcall namespace throws.
    virtual boost::shared_ptr<ICIMQualifierDecl> GetQualifierDecl(const std::string& name, TCIMContext context) = 0;
    // Visits the declarations of all qualifiers that the fetched classes carry, and those that were added.
    virtual void EnumerateQualifierDecls(TQualifierDeclVisitor visitor, TCIMContext context) = 0;
    // Delivers indications that pass the filter to the visitor.
    // Here: indications are unsupported. Throws: TVRXException 1, always.
    virtual void Subscribe(boost::shared_ptr<ICIMIndicationFilter> filter, TInstanceVisitor visitor,
                           TCIMContext context) = 0;
    // Returns: the instance that the reference names; null for an unknown one, and when the server fails, which the log
    // says.
    // Here: fetches all instances of the reference's class and takes the first whose path is, byte for byte, the one
    // that the server gives it. The order of keys, letter case and blanks count.
    // Context: nsp, timeout, as for GetClass.
    // Throws: what GetClass throws; boost::bad_weak_ptr.
    // Blocks: as GetClass, then up to the class's timeout.
    virtual boost::shared_ptr<ICIMInstance> GetInstance(const TCIMReference& reference, TCIMContext context) = 0;
    // Deletes the instance that the reference names.
    // Here: this and the next two go to the repository namespace, arguments unchanged.
    // Throws: TVRXException 31 when AllocateNamespace's context lacked a repository; what that namespace throws.
    virtual void DeleteInstance(const TCIMReference& reference, TCIMContext context) = 0;
    // Sets the named property values on the instance. Here: as DeleteInstance.
    virtual void ModifyInstance(const TCIMReference& reference, TCIMContext values, TCIMContext context) = 0;
    // Visits the instances that a query selects. Here: as DeleteInstance.
    virtual void ExecuteQuery(TInstanceVisitor visitor, std::string& language, std::string& query,
                              TCIMContext context) = 0;
    // Forgets the instances that the namespace keeps.
    // Here: returns at once; every request fetches again, and classes keep only what AddInstance gave them.
    virtual void ClearInstances() = 0;
};

} // namespace NKOLVRX20
