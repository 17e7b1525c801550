#pragma once

#include <host/ICIMElement.h>
#include <host/ICIMNamedElement.h>
#include <host/TCIMReference.h>

namespace NKOLVRX20 {

// A CIM class: its declarations, its place in the hierarchy and its instances.
class ICIMClass : public ICIMElement, public ICIMNamedElement
{
  public:
    virtual void Validate(TCIMContext context) = 0;
    virtual void AddToNamespace(TCIMContext context) = 0;
    virtual void RemoveFromNamespace(TCIMContext context) = 0;
    virtual void ModifyClass(boost::shared_ptr<ICIMClass> newDefinition, TCIMContext context) = 0;
    virtual std::string GetName(TCIMContext context) const = 0;
    virtual boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const = 0;
    virtual bool IsAssociation(TCIMContext context) const = 0;
    virtual bool IsAbstract(TCIMContext context) const = 0;
    virtual bool IsRootClass(TCIMContext context) const = 0;
    // Returns: the superclass, possibly null.
    virtual boost::shared_ptr<ICIMClass> GetSuperClass(TCIMContext context) const = 0;
    // Depth-first, a class before its own subclasses; direct subclasses only unless deep.
    virtual void EnumerateSubClasses(TClassVisitor visitor, bool deep, TCIMContext context) const = 0;
    // Returns: true for the class itself and each of its ancestors.
    virtual bool IsSubclassOf(boost::shared_ptr<const ICIMClass> other, TCIMContext context) const = 0;
    virtual void EnumerateAssociatedClasses(TClassVisitor visitor, const std::string& associationClass,
                                            const std::string& resultClass, const std::string& role,
                                            const std::string& resultRole, TCIMContext context) = 0;
    virtual void EnumerateAssociationClasses(TClassVisitor visitor, const std::string& resultClass,
                                             const std::string& role, TCIMContext context) = 0;
    virtual void EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext context) const = 0;
    // Builds a property declaration with the value's type and the value as default, owned by this class but not yet
    // added to it.
    virtual boost::shared_ptr<ICIMPropertyDecl> AllocatePropertyDecl(const std::string& name, TCIMValue value,
                                                                     TCIMContext context) = 0;
    virtual boost::shared_ptr<ICIMPropertyDecl> GetPropertyDecl(const std::string& name, TCIMContext context) const = 0;
    virtual void EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext context) const = 0;
    virtual boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const = 0;
    virtual void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) = 0;
    virtual void EnumerateStaticProperties(TPropertyVisitor visitor, TCIMContext context) const = 0;
    virtual boost::shared_ptr<ICIMInstance> AllocateInstance(TCIMContext context) = 0;
    virtual void EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext context) = 0;
    virtual boost::shared_ptr<ICIMMethodDecl>
    AllocateMethodDecl(const std::string& name, TCIMValue::TCIMType returnType, TCIMContext context) = 0;
    virtual boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(const std::string& name, TCIMContext context) const = 0;
    virtual void EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext context) const = 0;
    virtual TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) = 0;
    virtual bool operator==(const ICIMClass& other) const = 0;
    virtual bool operator<(const ICIMClass& other) const = 0;
    virtual ICIMClass& operator=(const ICIMClass& other) = 0;

    // Whether the host has collected the class already.
    virtual bool hasCollected() const = 0;
    virtual void SetCollected() = 0;

    virtual void AddChildClass(boost::shared_ptr<ICIMClass> child) = 0;
    virtual void RemoveChildClass(boost::shared_ptr<ICIMClass> child) = 0;
    virtual void AddInstance(boost::shared_ptr<ICIMInstance> instance) = 0;
    virtual void RemoveInstance(boost::shared_ptr<ICIMInstance> instance) = 0;
    virtual void AddAssociationClass(boost::shared_ptr<ICIMClass> association) = 0;
    virtual void RemoveAssociationClass(boost::shared_ptr<ICIMClass> association) = 0;
    virtual void AddPropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) = 0;
    virtual void RemovePropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration) = 0;
    virtual void AddMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) = 0;
    virtual void RemoveMethodDecl(boost::shared_ptr<ICIMMethodDecl> declaration) = 0;

    // The qualifier operations once more, so that they have slots of their own here, in this order.
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

    // Calls a method on the object that the reference names.
    virtual TCIMValue InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                                   TCIMContext& outputs, TCIMContext context) = 0;
    virtual void ClearInstances() = 0;
};

} // namespace NKOLVRX20
