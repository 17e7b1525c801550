// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMElement.h>
#include <host/ICIMNamedElement.h>
#include <host/TCIMReference.h>

namespace NKOLVRX20 {

// A CIM class: its declarations, its place in the hierarchy and its instances. The rules of HostFwd.h hold.
//
// Here: the image of one class of the private server. Declarations are read once, when ICIMNamespace::GetClass makes
// the class, and hold the inherited ones too; instances are fetched from the server at every call. An element that
// could not be read is a line in the log and missing from the class. A class keeps its subclasses and the provider that
// serves it alive until the namespace ends; its namespace it holds weakly.
// Here: an operation that needs the namespace throws boost::bad_weak_ptr after the namespace's end: AddToNamespace,
// IsRootClass, GetSuperClass, EnumerateInstances and InvokeMethod with a target.
class ICIMClass : public ICIMElement, public ICIMNamedElement
{
  public:
    // Checks the class against its superclass and namespace. Here: returns at once.
    virtual void Validate(TCIMContext context) = 0;
    // Enters the class into its namespace.
    // Here: GetClass has done it for every class that it returns.
    // Throws: TVRXException 16 when a class of that name is there; boost::bad_weak_ptr.
    virtual void AddToNamespace(TCIMContext context) = 0;
    // Takes the class out of its namespace.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual void RemoveFromNamespace(TCIMContext context) = 0;
    // Replaces the declarations by those of another class.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual void ModifyClass(boost::shared_ptr<ICIMClass> newDefinition, TCIMContext context) = 0;
    // Returns: the name as the server spells it.
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the namespace; null when it is gone.
    virtual boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const = 0;
    // Returns: whether the qualifier ASSOCIATION is true.
    virtual bool IsAssociation(TCIMContext context) const = 0;
    // Returns: whether the qualifier ABSTRACT is true. An abstract class may still be enumerated: a provider may
    // deliver instances of its subclasses.
    virtual bool IsAbstract(TCIMContext context) const = 0;
    // Returns: true for the pseudo-class "<root>" of a connected namespace only.
    // Throws: boost::bad_weak_ptr.
    virtual bool IsRootClass(TCIMContext context) const = 0;
    // Returns: the superclass; null for a class at the top, and when the namespace is unconnected.
    // Here: asks the server for the superclass's name, then the namespace for the class (ICIMNamespace::GetClass with
    // the context).
    // Context: nsp (default: this class's own) and timeout, for a superclass that has yet to be fetched.
    // Throws: TVRXException 42 when the server fails to answer; what GetClass throws; boost::bad_weak_ptr.
    // Blocks: one request, then as GetClass.
    virtual boost::shared_ptr<ICIMClass> GetSuperClass(TCIMContext context) const = 0;
    // Visits the direct subclasses, or with deep the whole tree below, depth first, a class before its own subclasses.
    // Here: those that were fetched so far. A std::exception of the visitor is a line in the log and costs that class
    // and what is below it; other exceptions leave.
    virtual void EnumerateSubClasses(TClassVisitor visitor, bool deep, TCIMContext context) const = 0;
    // Returns: true when other is this class or one of its ancestors below "<root>"; false for null.
    // Here: compares names, case included; "<root>" is a subclass of itself only.
    virtual bool IsSubclassOf(boost::shared_ptr<const ICIMClass> other, TCIMContext context) const = 0;
    // Visits the classes that associations link with this one; an empty text lets every class pass.
    // Here: this and the next one leave the visitor uncalled. Associations are classes of their own, with instances and
    // references.
    virtual void EnumerateAssociatedClasses(TClassVisitor visitor, const std::string& associationClass,
                                            const std::string& resultClass, const std::string& role,
                                            const std::string& resultRole, TCIMContext context) = 0;
    // Visits the association classes that refer to this one.
    virtual void EnumerateAssociationClasses(TClassVisitor visitor, const std::string& resultClass,
                                             const std::string& role, TCIMContext context) = 0;
    // Visits the names of the properties whose qualifier KEY is true, as they are spelled. The pointer is valid during
    // the visitor's call only.
    virtual void EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext context) const = 0;
    // Makes a property declaration with the value's type and the value as default. TCIMValue(type, 0) declares the type
    // alone.
    // Returns: a declaration that points back to this class; AddPropertyDecl adds it.
    virtual boost::shared_ptr<ICIMPropertyDecl> AllocatePropertyDecl(const std::string& name, TCIMValue value,
                                                                     TCIMContext context) = 0;
    // Returns: the declaration; null for exactly "DateTimeOfCollection", in this spelling, when the class lacks it.
    // Throws: TVRXException 15 for any other undeclared property, 25.
    virtual boost::shared_ptr<ICIMPropertyDecl> GetPropertyDecl(const std::string& name, TCIMContext context) const = 0;
    // Visits the declarations, inherited ones included.
    virtual void EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext context) const = 0;
    // Returns: the class's own value of the property: its default.
    // Throws: TVRXException 15 when the class lacks the property, or the property a default; 25.
    virtual boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const = 0;
    // Sets a value on the class itself.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) = 0;
    // Visits the values that the class itself has: one for each property with a default.
    virtual void EnumerateStaticProperties(TPropertyVisitor visitor, TCIMContext context) const = 0;
    // Returns: a new, empty instance of the class; AddToNamespace enters it.
    // Here: it exists in memory only.
    virtual boost::shared_ptr<ICIMInstance> AllocateInstance(TCIMContext context) = 0;
    // Visits the instances of the class and of its subclasses in the server's order, with deep also the properties that
    // subclasses add. The class of every visited instance is this one, also of an instance of a subclass.
    // Here: asks whether the server has the class, then for its instances, in the provider's server namespace over the
    // provider's own connection; a class that lacks a provider goes over the namespace's connection. All instances have
    // arrived before the first is visited. A failure of the server or of an instance is a line in the log and costs the
    // instances concerned: zero instances can mean either. A property that fails to convert is missing
    // from its instance.
    // Throws: what the visitor throws; boost::bad_weak_ptr.
    // Blocks: twice the class's timeout (its own in *.classes.xml, else the file's), 199 seconds for a class whose name
    // contains "AvailableDiagnosticService", else 301 seconds for "SoftwareIdentity"; and as ICIMNamespace::GetClass
    // for each class that a reference property names for the first time.
    virtual void EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext context) = 0;
    // Makes a method declaration that points back to this class. Its type is a scalar code.
    // Returns: a declaration outside of the class's list.
    virtual boost::shared_ptr<ICIMMethodDecl>
    AllocateMethodDecl(const std::string& name, TCIMValue::TCIMType returnType, TCIMContext context) = 0;
    // Returns: the declaration; null for an undeclared method.
    virtual boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(const std::string& name, TCIMContext context) const = 0;
    // Visits the method declarations, inherited ones included.
    virtual void EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext context) const = 0;
    // Calls a static method of the class.
    // Here: the call stays in the plug-in. Returns: null, always; InvokeMethod with a target, at the end, is the one
    // that works.
    virtual TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) = 0;
    // Equal names, byte for byte, in whatever namespaces.
    virtual bool operator==(const ICIMClass& other) const = 0;
    // Byte order of the names.
    virtual bool operator<(const ICIMClass& other) const = 0;
    // Here: leaves this class as it is.
    virtual ICIMClass& operator=(const ICIMClass& other) = 0;

    // Whether the host has collected the class already: a mark of the host's own.
    // Here: always false; SetCollected is ignored.
    virtual bool hasCollected() const = 0;
    virtual void SetCollected() = 0;

    // Enters a direct subclass; one of the same name, case included, is ignored.
    // Here: GetClass has done it for every class that it returns.
    virtual void AddChildClass(boost::shared_ptr<ICIMClass> child) = 0;
    // Takes a subclass out. Here: ignored.
    virtual void RemoveChildClass(boost::shared_ptr<ICIMClass> child) = 0;
    // Keeps the instance with the class until RemoveInstance or ClearInstances; EnumerateInstances passes it over.
    // Here: an instance of another class also makes ClearInstances reach that class.
    virtual void AddInstance(boost::shared_ptr<ICIMInstance> instance) = 0;
    // Releases an instance that AddInstance took; any other is ignored.
    virtual void RemoveInstance(boost::shared_ptr<ICIMInstance> instance) = 0;
    // Notes an association class that refers to this one. Here: both are ignored.
    virtual void AddAssociationClass(boost::shared_ptr<ICIMClass> association) = 0;
    virtual void RemoveAssociationClass(boost::shared_ptr<ICIMClass> association) = 0;
    // Adds a property declaration that AllocatePropertyDecl of this plug-in made.
    // Here: a declaration with the qualifier OVERRIDE replaces an inherited one of the same type, or is added; a name
    // that contains "PortType" replaces any declaration; every other name must be new.
    // Throws, after a line in the log: TVRXException 22 (a reference outside of an association), 14 (an
    // override of another type, or a declaration from elsewhere), 16 (the class has it already), 25.
    virtual void AddPropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) = 0;
    // Here: ignored, as the next two.
    virtual void RemovePropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) = 0;
    virtual void AddMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) = 0;
    virtual void RemoveMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) = 0;

    // The qualifier operations of ICIMNamedElement once more: here they have slots of their own, in this order. They do
    // what is said there, but for GetQualifier with found.
    // Here: that one is unsupported on a class. Throws: TVRXException 1, always.
    void AddQualifier(boost::shared_ptr<ICIMQualifier> qualifier, TCIMContext context) override = 0;
    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                       TCIMValue value, ICIMQualifierDecl::EFlavor flavor,
                                                       TCIMContext context) override = 0;
    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                       TCIMValue value, TCIMContext context) override = 0;
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, TCIMContext context) const override = 0;
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, bool& found,
                                                  TCIMContext context) const override = 0;
    void EnumerateQualifiers(TQualifierVisitor visitor, TCIMContext context) const override = 0;

    // Calls a method of the object that the target's path names; a path that ends with the class's name means the class
    // itself. inputs holds the input parameters by name; outputs receives the output parameters, entries of those names
    // are replaced.
    // Here: every input travels by its value's own type, whatever the method's declaration says; a 16-bit array travels
    // as an 8-bit one and keeps the low bytes.
    // Returns: the method's return value; null for a void one.
    // Throws: TVRXException 14 (a value fails to convert); Pegasus::CIMException when the server or the method refuses,
    // any other Pegasus::Exception when the connection or the answer is missing, or a name or path is malformed;
    // boost::bad_weak_ptr.
    // Blocks: up to the timeout that an earlier operation gave the namespace's client: 5 seconds after a GetClass, 300
    // seconds after an ICIMInstance::InvokeMethod, 65535 seconds before any.
    virtual TCIMValue InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                                   TCIMContext& outputs, TCIMContext context) = 0;
    // Releases what AddInstance took, here, in all subclasses and in the classes of instances that came from elsewhere.
    virtual void ClearInstances() = 0;
};

} // namespace NKOLVRX20
