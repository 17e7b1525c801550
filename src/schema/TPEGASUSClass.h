// SPDX-License-Identifier: MIT
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

// Returns: the leading number of seconds of a class's timeout text in milliseconds. The product wraps at 32 bits; a
// text that lacks a leading number gives 0.
unsigned int MillisecondsFromText(const std::string& seconds);

// Returns: whether the text is a number of seconds, and its milliseconds fit into 32 bits.
bool IsPlainTimeout(const std::string& seconds);

// The host's image of one class of the server. Declarations are read once, when the namespace makes the class;
// instances are fetched from the server at every call.
//
// Names are looked up ignoring case; an invalid name throws TVRXException 25.
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
    // only takes its settings. An element that fails to be mirrored is logged and left out.
    // Requires: a timeout in decimal seconds. The superclass may be null.
    // Throws: TVRXException 42, after a log line, when the request for the class fails.
    // Blocks: up to 5 seconds for the class, and again for each qualifier that is new to the namespace.
    void Initialize(const std::string& cimNamespace, const std::string& timeout,
                    const boost::shared_ptr<TPEGASUSClass>& superClass);

    // --- ICIMClass, in slot order ---

    // Returns at once.
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
    // Asks the server at every call, then the namespace's cache, for a class of the server namespace that the
    // context's "nsp" names, by default this one's own. Returns: null also for the root class, and while the namespace
    // is unconnected. Throws: TVRXException 42, after a log line, when the server fails to answer; what GetClass
    // throws.
    boost::shared_ptr<ICIMClass> GetSuperClass(TCIMContext context) const override;
    // A visitor's std::exception is logged and costs only its own child. Returning false ends the whole walk.
    void EnumerateSubClasses(TClassVisitor visitor, bool deep, TCIMContext context) const override;
    // Compares names, case included. The root class counts as a superclass of itself only.
    bool IsSubclassOf(boost::shared_ptr<const ICIMClass> other, TCIMContext context) const override;
    // Return at once: the visitor stays uncalled.
    void EnumerateAssociatedClasses(TClassVisitor visitor, const std::string& associationClass,
                                    const std::string& resultClass, const std::string& role,
                                    const std::string& resultRole, TCIMContext context) override;
    void EnumerateAssociationClasses(TClassVisitor visitor, const std::string& resultClass, const std::string& role,
                                     TCIMContext context) override;
    // In byte order of the normalised names, as the other enumerations of declarations.
    void EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext context) const override;
    boost::shared_ptr<ICIMPropertyDecl> AllocatePropertyDecl(const std::string& name, TCIMValue value,
                                                             TCIMContext context) override;
    // Returns: null for exactly "DateTimeOfCollection" when it is undeclared. Throws: TVRXException 15 for others.
    boost::shared_ptr<ICIMPropertyDecl> GetPropertyDecl(const std::string& name, TCIMContext context) const override;
    void EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext context) const override;
    // The properties of the class itself are those that have a default value. Throws: TVRXException 15.
    boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const override;
    // Throws: TVRXException 31, always.
    void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) override;
    void EnumerateStaticProperties(TPropertyVisitor visitor, TCIMContext context) const override;
    // Returns: a new TPEGASUSInstance; its AddToNamespace enters it.
    boost::shared_ptr<ICIMInstance> AllocateInstance(TCIMContext context) override;
    // Fetches the instances from the server and visits them in its order until the visitor returns false. Failures
    // are logged and cost the instances concerned, possibly all; only the visitor's own exceptions leave.
    // Blocks: up to the class's timeout, twice; longer for classes that are known to be slow (see the source).
    void EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext context) override;
    boost::shared_ptr<ICIMMethodDecl> AllocateMethodDecl(const std::string& name, TCIMValue::TCIMType returnType,
                                                         TCIMContext context) override;
    // Returns: null when absent.
    boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(const std::string& name, TCIMContext context) const override;
    void EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext context) const override;
    // Returns: null, always; a call needs a target.
    TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) override;
    // By name, case included.
    bool operator==(const ICIMClass& other) const override;
    bool operator<(const ICIMClass& other) const override;
    // Leaves this class as it is.
    ICIMClass& operator=(const ICIMClass& other) override;

    // Returns: false, always.
    bool hasCollected() const override;
    // Returns at once.
    void SetCollected() override;

    // Ignores a child whose name is there already. Throws: TVRXException 14, after a log line, for null.
    void AddChildClass(boost::shared_ptr<ICIMClass> child) override;
    void RemoveChildClass(boost::shared_ptr<ICIMClass> child) override; // returns at once
    // While an instance of another class is here, that class's instances are cleared with this one's.
    // Throws: TVRXException 14, after a log line, for null.
    void AddInstance(boost::shared_ptr<ICIMInstance> instance) override;
    void RemoveInstance(boost::shared_ptr<ICIMInstance> instance) override;
    void AddAssociationClass(boost::shared_ptr<ICIMClass> association) override;    // returns at once
    void RemoveAssociationClass(boost::shared_ptr<ICIMClass> association) override; // returns at once
    // Replaces what is there only when the declaration has the qualifier "OVERRIDE" and the same type, and the other
    // belongs to another class; or when its name contains "PortType".
    // Throws, after a log line: TVRXException 22 (a reference outside of an association), 14 (another type, or
    // a declaration from elsewhere), 16 (is there already).
    void AddPropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) override;
    void RemovePropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) override; // returns at once
    void AddMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) override;        // returns at once
    void RemoveMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) override;     // returns at once

    using TQualifiedElement<TPEGASUSClass, ICIMClass>::GetQualifier;
    // Throws: TVRXException 1, always.
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, bool& found,
                                                  TCIMContext context) const override;

    // Parameters travel by their own types, whatever their declarations say; outputs replace entries of their names.
    // Throws: what the client throws, Pegasus::Exception; TVRXException 14, after a log line and before anything is
    // sent, for an input that fails to convert.
    // Blocks: up to the timeout that the namespace's client was given last.
    TCIMValue InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                           TCIMContext& outputs, TCIMContext context) override;
    // Also those of all subclasses.
    void ClearInstances() override;

    // --- single instances ---

    // Fetches the class's instances and looks for one whose path is the reference's to the letter.
    // Returns: null when absent, and after a failure, which is logged.
    // Blocks: up to the class's timeout.
    boost::shared_ptr<ICIMInstance> GetInstance(const TCIMReference& reference, TCIMContext context);
    // The same in the provider's namespace; the context's "nsp" is only logged. Blocks: up to twice the timeout.
    boost::shared_ptr<ICIMInstance> GetInstanceWithNsp(const TCIMReference& reference, TCIMContext context);

    // --- the class's place ---

    const TOwningNamespace& GetOwningNamespace() const { return fNamespace; }
    const Pegasus::CIMNamespaceName& GetPegasusNSP() const { return fPegasusNsp; }
    const std::string& GetPegasusNSPStr() const { return fPegasusNspText; }
    // The provider that serves the class; null for an unbound class.
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
    // Releases provider, children and instances, which breaks circles of owning pointers.
    void ReleaseLinks();

    // --- for initialisation ---

    // Enters the superclass's declaration of that name, if it has one, so that it can be overridden.
    void AdoptPropertyDecl(const std::string& name);
    void EnterMethodDecl(const boost::shared_ptr<TPEGASUSMethodDecl>& declaration);
    // Gives the class a property of its own with the value; propagated when a superclass has declared it.
    void EnterProperty(const boost::shared_ptr<ICIMPropertyDecl>& declaration, const TCIMValue& value, bool propagated);

  private:
    // The existing declaration, of the same name, may be null. Both throw what AddPropertyDecl throws.
    void CheckOverride(const boost::shared_ptr<TPEGASUSPropertyDecl>& existing,
                       const TPEGASUSPropertyDecl& declaration) const;
    void CheckNewPropertyDecl(const boost::shared_ptr<TPEGASUSPropertyDecl>& existing, const std::string& name) const;
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
