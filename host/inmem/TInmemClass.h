// SPDX-License-Identifier: MIT
#pragma once

#include "host/inmem/InmemDeclarations.h"

#include <host/ICIMNamespace.h>

#include <boost/enable_shared_from_this.hpp>

namespace NKOLVRX20 {

// A class in memory: declarations, and the instances that were added to it, in that order. Nothing answers calls of its
// methods, and associations are beyond it; such operations throw TVRXException 31.
// Ownership: a class and its instances hold each other until RemoveInstance or ClearInstances. Held by
// boost::shared_ptr.
// Thread: one at a time.
class TInmemClass : public TInmemElement<ICIMClass>, public boost::enable_shared_from_this<TInmemClass>
{
  public:
    explicit TInmemClass(const std::string& name, const boost::shared_ptr<ICIMClass>& superClass = nullptr)
        : fName(name), fSuperClass(superClass)
    {
    }

    bool Has(const std::string& property) const { return fPropertiesByName.count(NormalizedName(property)) != 0; }
    // Requires: a name that is new to the class.
    boost::shared_ptr<TInmemPropertyDecl> Declare(const std::string& name, TCIMValue::TCIMType type,
                                                  bool isKey = false);
    boost::shared_ptr<TInmemMethodDecl> DeclareMethod(const std::string& name, TCIMValue::TCIMType returnType);
    void SetNamespace(const boost::shared_ptr<ICIMNamespace>& ns) { fNamespace = ns; }

    void Validate(TCIMContext) override {}
    void AddToNamespace(TCIMContext) override { ThrowNotInMemory(); }
    void RemoveFromNamespace(TCIMContext) override { ThrowNotInMemory(); }
    void ModifyClass(boost::shared_ptr<ICIMClass>, TCIMContext) override { ThrowNotInMemory(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext) const override { return fNamespace.lock(); }
    bool IsAssociation(TCIMContext) const override { return IsQualified("Association"); }
    bool IsAbstract(TCIMContext) const override { return IsQualified("Abstract"); }
    bool IsRootClass(TCIMContext) const override { return fName == "<root>"; }
    boost::shared_ptr<ICIMClass> GetSuperClass(TCIMContext) const override { return fSuperClass; }
    void EnumerateSubClasses(TClassVisitor, bool, TCIMContext) const override { ThrowNotInMemory(); }
    bool IsSubclassOf(boost::shared_ptr<const ICIMClass>, TCIMContext) const override { ThrowNotInMemory(); }
    void EnumerateAssociatedClasses(TClassVisitor, const std::string&, const std::string&, const std::string&,
                                    const std::string&, TCIMContext) override
    {
        ThrowNotInMemory();
    }
    void EnumerateAssociationClasses(TClassVisitor, const std::string&, const std::string&, TCIMContext) override
    {
        ThrowNotInMemory();
    }
    void EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext) const override;
    boost::shared_ptr<ICIMPropertyDecl> AllocatePropertyDecl(const std::string&, TCIMValue, TCIMContext) override
    {
        ThrowNotInMemory();
    }
    // Case ignored, as of a real class; throws 15 for an unknown name and 25 for one that begins with a digit.
    boost::shared_ptr<ICIMPropertyDecl> GetPropertyDecl(const std::string& name, TCIMContext) const override;
    void EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext) const override;
    boost::shared_ptr<ICIMProperty> GetProperty(const std::string&, TCIMContext) const override { ThrowNotInMemory(); }
    void SetPropertyValue(const std::string&, TCIMValue, TCIMContext) override { ThrowNotInMemory(); }
    void EnumerateStaticProperties(TPropertyVisitor, TCIMContext) const override { ThrowNotInMemory(); }
    boost::shared_ptr<ICIMInstance> AllocateInstance(TCIMContext) override { ThrowNotInMemory(); }
    void EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext) override;
    boost::shared_ptr<ICIMMethodDecl> AllocateMethodDecl(const std::string&, TCIMValue::TCIMType, TCIMContext) override
    {
        ThrowNotInMemory();
    }
    boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(const std::string& name, TCIMContext) const override;
    void EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext) const override;
    TCIMValue InvokeMethod(const std::string&, TCIMContext&, TCIMContext) override { ThrowNotInMemory(); }
    bool operator==(const ICIMClass&) const override { ThrowNotInMemory(); }
    bool operator<(const ICIMClass&) const override { ThrowNotInMemory(); }
    ICIMClass& operator=(const ICIMClass&) override { ThrowNotInMemory(); }
    bool hasCollected() const override { return false; }
    void SetCollected() override {}
    void AddChildClass(boost::shared_ptr<ICIMClass>) override { ThrowNotInMemory(); }
    void RemoveChildClass(boost::shared_ptr<ICIMClass>) override { ThrowNotInMemory(); }
    void AddInstance(boost::shared_ptr<ICIMInstance> instance) override { fInstances.push_back(instance); }
    void RemoveInstance(boost::shared_ptr<ICIMInstance> instance) override;
    void AddAssociationClass(boost::shared_ptr<ICIMClass>) override { ThrowNotInMemory(); }
    void RemoveAssociationClass(boost::shared_ptr<ICIMClass>) override { ThrowNotInMemory(); }
    void AddPropertyDecl(boost::shared_ptr<ICIMPropertyDecl>) override { ThrowNotInMemory(); }
    void RemovePropertyDecl(boost::shared_ptr<ICIMPropertyDecl>) override { ThrowNotInMemory(); }
    void AddMethodDecl(boost::shared_ptr<ICIMMethodDecl>) override { ThrowNotInMemory(); }
    void RemoveMethodDecl(boost::shared_ptr<ICIMMethodDecl>) override { ThrowNotInMemory(); }
    TCIMValue InvokeMethod(const TCIMReference&, const std::string&, const TCIMContext&, TCIMContext&,
                           TCIMContext) override
    {
        ThrowNotInMemory();
    }
    void ClearInstances() override { fInstances.clear(); }

  private:
    bool IsQualified(const char* qualifier) const;

    std::string fName;
    boost::shared_ptr<ICIMClass> fSuperClass;
    boost::weak_ptr<ICIMNamespace> fNamespace;
    std::vector<boost::shared_ptr<TInmemPropertyDecl>> fProperties;                 // as they were declared
    std::map<std::string, boost::shared_ptr<TInmemPropertyDecl>> fPropertiesByName; // normalised
    std::vector<boost::shared_ptr<TInmemMethodDecl>> fMethods;
    std::vector<boost::shared_ptr<ICIMInstance>> fInstances;
};

} // namespace NKOLVRX20
