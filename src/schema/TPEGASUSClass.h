#pragma once

#include "src/schema/NamedMap.h"
#include "src/schema/OwningNamespace.h"
#include "src/schema/TQualifiedElement.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/ICIMClass.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <map>
#include <set>
#include <string>
#include <vector>

namespace NKOLVRX20 {

class TPEGASUSMethodDecl;
class TPEGASUSNamespace;
class TPEGASUSPropertyDecl;
class TPEGASUSProvider;

// The host's image of one class of the server. Declarations are read once, when the namespace makes the class;
// instances are fetched from the server at every call.
//
// Names are looked up without regard to case; an invalid name throws TVRXException 25.
// Ownership: always held by boost::shared_ptr. Owns its declarations and children, shares its provider; points to its
// namespace and superclass weakly. What needs the namespace throws boost::bad_weak_ptr when it is gone.
// Thread: one at a time.
class TPEGASUSClass : public TQualifiedElement<TPEGASUSClass, ICIMClass>
{
  public:
    // The superclass is linked by Initialize.
    TPEGASUSClass(const boost::shared_ptr<TPEGASUSNamespace>& ns, std::string name,
                  const boost::shared_ptr<TPEGASUSClass>& superClass);
    ~TPEGASUSClass() override;

    TPEGASUSClass(const TPEGASUSClass&) = delete;
    TPEGASUSClass& operator=(const TPEGASUSClass&) = delete;

    // Reads the class's declarations from the server and takes its place below the superclass; the root class "<root>"
    // only takes its settings. An element that cannot be mirrored is logged and left out.
    // Requires: a timeout in decimal seconds. The superclass may be null.
    // Throws: TVRXException 42, after a log line, when the server does not give the class.
    // Blocks: up to 5 seconds for the class, and again for each qualifier that is new to the namespace.
    void Initialize(const std::string& cimNamespace, const std::string& timeout,
                    const boost::shared_ptr<TPEGASUSClass>& superClass);

    // --- ICIMClass, in slot order ---

    // Does nothing.
    void Validate(TCIMContext context) override;
    void AddToNamespace(TCIMContext context) override;
    // Throws: TVRXException 31, always; so does ModifyClass.
    void RemoveFromNamespace(TCIMContext context) override;
    void ModifyClass(boost::shared_ptr<ICIMClass> newDefinition, TCIMContext context) override;
    // Returns: the name as the server spells it.
    std::string GetName(TCIMContext context) const override;
    // Returns: null when it is gone.
    boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const override;
    bool IsAssociation(TCIMContext context) const override;
    bool IsAbstract(TCIMContext context) const override;
    // Returns: true for the connected namespace's root class alone.
    bool IsRootClass(TCIMContext context) const override;
    // Asks the server at every call, then the namespace's cache, for a class of this one's own server namespace unless
    // the context's "nsp" names another. Returns: null also for the root class, and when the namespace is not
    // connected. Throws: TVRXException 42, after a log line, when the server does not answer; what GetClass throws.
    boost::shared_ptr<ICIMClass> GetSuperClass(TCIMContext context) const override;
    // A visitor's std::exception is logged and costs only its own child. Returning false ends the whole walk.
    void EnumerateSubClasses(TClassVisitor visitor, bool deep, TCIMContext context) const override;
    // Compares names, case included. The root class counts as a superclass of itself only.
    bool IsSubclassOf(boost::shared_ptr<const ICIMClass> other, TCIMContext context) const override;
    // Visit nothing.
    void EnumerateAssociatedClasses(TClassVisitor visitor, const std::string& associationClass,
                                    const std::string& resultClass, const std::string& role,
                                    const std::string& resultRole, TCIMContext context) override;
    void EnumerateAssociationClasses(TClassVisitor visitor, const std::string& resultClass, const std::string& role,
                                     TCIMContext context) override;
    // In byte order of the normalised names, as the other enumerations of declarations.
    void EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext context) const override;
    boost::shared_ptr<ICIMPropertyDecl> AllocatePropertyDecl(const std::string& name, TCIMValue value,
                                                             TCIMContext context) override;
    // Returns: null for exactly "DateTimeOfCollection" when it is not declared. Throws: TVRXException 15 for others.
    boost::shared_ptr<ICIMPropertyDecl> GetPropertyDecl(const std::string& name, TCIMContext context) const override;
    void EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext context) const override;
    // The properties of the class itself are those that have a default value. Throws: TVRXException 15.
    boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const override;
    // Throws: TVRXException 31, always.
    void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) override;
    void EnumerateStaticProperties(TPropertyVisitor visitor, TCIMContext context) const override;
    // Returns: a new TPEGASUSInstance, not entered anywhere.
    boost::shared_ptr<ICIMInstance> AllocateInstance(TCIMContext context) override;
    // Fetches the instances from the server and visits them in its order until the visitor returns false. Failures
    // are logged and leave fewer instances, or none; only the visitor's own exceptions leave.
    // Blocks: up to the class's timeout, twice; longer for classes that are known to be slow (see the source).
    void EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext context) override;
    boost::shared_ptr<ICIMMethodDecl> AllocateMethodDecl(const std::string& name, TCIMValue::TCIMType returnType,
                                                         TCIMContext context) override;
    // Returns: null when there is none.
    boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(const std::string& name, TCIMContext context) const override;
    void EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext context) const override;
    // Returns: null, always; nothing is called without a target.
    TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) override;
    // By name, case included.
    bool operator==(const ICIMClass& other) const override;
    bool operator<(const ICIMClass& other) const override;
    // Copies nothing.
    ICIMClass& operator=(const ICIMClass& other) override;

    // Returns: false, always.
    bool hasCollected() const override;
    // Does nothing.
    void SetCollected() override;

    // Does nothing when a child of that name is there. Throws: TVRXException 14, after a log line, for null.
    void AddChildClass(boost::shared_ptr<ICIMClass> child) override;
    void RemoveChildClass(boost::shared_ptr<ICIMClass> child) override; // does nothing
    // While an instance of another class is here, that class's instances are cleared with this one's.
    // Throws: TVRXException 14, after a log line, for null.
    void AddInstance(boost::shared_ptr<ICIMInstance> instance) override;
    void RemoveInstance(boost::shared_ptr<ICIMInstance> instance) override;
    void AddAssociationClass(boost::shared_ptr<ICIMClass> association) override;    // does nothing
    void RemoveAssociationClass(boost::shared_ptr<ICIMClass> association) override; // does nothing
    // Replaces what is there only when the declaration has the qualifier "OVERRIDE" and the same type, and the other
    // belongs to another class; or when its name contains "PortType".
    // Throws, after a log line: TVRXException 22 (a reference outside of an association), 14 (another type, or
    // no declaration of this plug-in), 16 (is there already).
    void AddPropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) override;
    void RemovePropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) override; // does nothing
    void AddMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) override;        // does nothing
    void RemoveMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) override;     // does nothing

    using TQualifiedElement<TPEGASUSClass, ICIMClass>::GetQualifier;
    // Throws: TVRXException 1, always.
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, bool& found,
                                                  TCIMContext context) const override;

    // Parameters travel by their own types, whatever their declarations say; outputs replace entries of their names.
    // Throws: what the client throws, Pegasus::Exception; TVRXException 14, after a log line, for an input that does
    // not convert, and nothing is sent then.
    // Blocks: up to the timeout that the namespace's client was given last.
    TCIMValue InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                           TCIMContext& outputs, TCIMContext context) override;
    // Also those of all subclasses.
    void ClearInstances() override;

    // --- single instances ---

    // Fetches the class's instances and looks for one whose path is the reference's to the letter.
    // Returns: null when there is none, and after a failure, which is logged.
    // Blocks: up to the class's timeout.
    boost::shared_ptr<ICIMInstance> GetInstance(const TCIMReference& reference, TCIMContext context);
    // The same in the provider's namespace; the context's "nsp" is only logged. Blocks: up to twice the timeout.
    boost::shared_ptr<ICIMInstance> GetInstanceWithNsp(const TCIMReference& reference, TCIMContext context);

    // --- the class's place ---

    const TOwningNamespace& GetOwningNamespace() const { return fNamespace; }
    const Pegasus::CIMNamespaceName& GetPegasusNSP() const { return fPegasusNsp; }
    const std::string& GetPegasusNSPStr() const { return fPegasusNspText; }
    // The provider that serves the class; null when none was bound to it.
    boost::shared_ptr<TPEGASUSProvider> GetProvider() const { return fProvider; }
    void SetProvider(boost::shared_ptr<TPEGASUSProvider> provider) { fProvider = provider; }
    // The tag of the requested entry ("CDM"); empty at first.
    const std::string& GetTag() const { return fTag; }
    void SetTag(const std::string& tag) { fTag = tag; }
    unsigned int GetDefaultTimeoutMs() const { return fDefaultTimeoutMs; }

    const std::vector<boost::shared_ptr<ICIMClass>>& GetChildClasses() const { return fChildClasses; }
    // Takes the class out of its superclass's children, where Initialize entered it.
    void LeaveSuperClass();
    // Takes over the children of the class that this one replaces in the namespace, and its place below the superclass.
    void TakePlaceOf(TPEGASUSClass& replaced);
    // Releases provider, children and instances, so that a circle of pointers does not keep itself alive.
    void ReleaseLinks();

    // --- for initialisation ---

    // Enters the superclass's declaration of that name, if it has one, so that it can be overridden.
    void AdoptPropertyDecl(const std::string& name);
    void EnterMethodDecl(const boost::shared_ptr<TPEGASUSMethodDecl>& declaration);
    // Gives the class a property of its own with the value; propagated when a superclass has declared it.
    void EnterProperty(const boost::shared_ptr<ICIMPropertyDecl>& declaration, const TCIMValue& value, bool propagated);

  private:
    // The existing declaration, of the same name, may be null.
    void OverridePropertyDecl(const boost::shared_ptr<TPEGASUSPropertyDecl>& existing,
                              const boost::shared_ptr<TPEGASUSPropertyDecl>& declaration);
    void AddNewPropertyDecl(const boost::shared_ptr<TPEGASUSPropertyDecl>& existing,
                            const boost::shared_ptr<TPEGASUSPropertyDecl>& declaration);
    [[noreturn]] void RefuseOverride(const std::string& name, const char* reason, unsigned int status) const;

    boost::weak_ptr<TPEGASUSClass> fSuperClass;
    std::vector<boost::shared_ptr<ICIMClass>> fChildClasses;
    std::set<boost::shared_ptr<ICIMClass>> fInstanceOwners;
    std::multimap<std::string, boost::shared_ptr<ICIMInstance>> fInstances; // by path text
    TNamedMap<TPEGASUSPropertyDecl> fPropertyDecls;
    TNamedMap<ICIMProperty> fProperties; // those with a value on the class itself
    TNamedMap<TPEGASUSMethodDecl> fMethodDecls;
    TOwningNamespace fNamespace;
    std::string fPegasusNspText;
    const std::string fName;
    Pegasus::CIMNamespaceName fPegasusNsp;
    boost::shared_ptr<TPEGASUSProvider> fProvider;
    std::string fTag;
    std::string fTimeout;
    unsigned int fDefaultTimeoutMs = 0;
};

} // namespace NKOLVRX20
