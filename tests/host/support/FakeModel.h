// SPDX-License-Identifier: MIT
// A small object model for the host's tests: declarations with settable qualifiers, and a class that holds them and
// serves instances. Operations that the host leaves unused throw TVRXException 31.
#pragma once

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMMethodDecl.h>
#include <host/ICIMNamespace.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>
#include <host/TVRXException.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/make_shared.hpp>
#include <boost/weak_ptr.hpp>

#include <functional>
#include <map>
#include <vector>

#include <strings.h>

namespace NKOLVRX20 {

[[noreturn]] inline void ThrowUnused()
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

class TFakeQualifier : public ICIMQualifier
{
  public:
    TFakeQualifier(const std::string& name, const TCIMValue& value) : fName(name), fValue(value) {}
    void Validate(TCIMContext) override {}
    void AddToClassOrProperty(TCIMContext) override { ThrowUnused(); }
    void RemoveFromClassOrProperty(TCIMContext) override { ThrowUnused(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMNamedElement> GetClassOrProperty(TCIMContext) const override { ThrowUnused(); }
    TCIMValue::TCIMType GetType(TCIMContext) const override { return fValue.GetType(); }
    bool IsArray(TCIMContext) const override { return fValue.IsArray(); }
    boost::shared_ptr<const ICIMQualifierDecl> GetDeclaration(TCIMContext) const override { ThrowUnused(); }
    TCIMValue GetValue(TCIMContext) const override { return fValue; }
    void SetValue(TCIMValue value, TCIMContext) override { fValue = value; }
    void SetFlavor(ICIMQualifierDecl::EFlavor, TCIMContext) override { ThrowUnused(); }
    void UnsetFlavor(ICIMQualifierDecl::EFlavor, TCIMContext) override { ThrowUnused(); }
    ICIMQualifierDecl::EFlavor GetFlavor(TCIMContext) const override { ThrowUnused(); }
    bool operator==(const ICIMQualifier&) const override { ThrowUnused(); }
    bool operator<(const ICIMQualifier&) const override { ThrowUnused(); }
    bool GetPropagated(TCIMContext) const override { return false; }
    ICIMQualifier& operator=(const ICIMQualifier&) override { ThrowUnused(); }

  private:
    std::string fName;
    TCIMValue fValue;
};

struct TNameOrder
{
    bool operator()(const std::string& x, const std::string& y) const { return strcasecmp(x.c_str(), y.c_str()) < 0; }
};

// The qualifier block of an element.
template <typename Interface> class TFakeElement : public Interface
{
  public:
    TFakeElement() = default;
    Interface& operator=(const Interface&) override { ThrowUnused(); }
    void SetQualifier(const std::string& name, const TCIMValue& value)
    {
        fQualifiers[name] = boost::make_shared<TFakeQualifier>(name, value);
    }
    void AddQualifier(boost::shared_ptr<ICIMQualifier>, TCIMContext) override { ThrowUnused(); }
    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl>, TCIMValue,
                                                       TCIMContext) override
    {
        ThrowUnused();
    }
    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl>, TCIMValue,
                                                       ICIMQualifierDecl::EFlavor, TCIMContext) override
    {
        ThrowUnused();
    }
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, TCIMContext) const override
    {
        const auto found = fQualifiers.find(name);
        return found == fQualifiers.end() ? boost::shared_ptr<ICIMQualifier>() : found->second;
    }
    void EnumerateQualifiers(TQualifierVisitor visitor, TCIMContext) const override
    {
        for (const auto& qualifier : fQualifiers) {
            visitor(qualifier.second);
        }
    }
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string&, bool&, TCIMContext) const override
    {
        ThrowUnused();
    }

  private:
    std::map<std::string, boost::shared_ptr<ICIMQualifier>, TNameOrder> fQualifiers;
};

class TFakePropertyDecl : public TFakeElement<ICIMPropertyDecl>
{
  public:
    TFakePropertyDecl(const std::string& name, TCIMValue::TCIMType type, bool isKey)
        : fName(name), fType(type), fIsKey(isKey)
    {
    }
    bool IsKey() const { return fIsKey; }
    void SetClass(const boost::shared_ptr<ICIMClass>& owner) { fClass = owner; }

    void Validate(TCIMContext) override {}
    void AddToClass(TCIMContext) override { ThrowUnused(); }
    void RemoveFromClass(TCIMContext) override { ThrowUnused(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext) const override { return fClass.lock(); }
    TCIMValue::TCIMType GetType(TCIMContext) const override { return fType; }
    bool IsArray(TCIMContext) const override { return fType.IsArray(); }
    TCIMValue GetDefaultValue(TCIMContext) const override { return fDefault; }
    void SetDefaultValue(TCIMValue value, TCIMContext) override { fDefault = value; }
    bool operator==(const ICIMPropertyDecl&) const override { ThrowUnused(); }
    bool operator<(const ICIMPropertyDecl&) const override { ThrowUnused(); }
    ICIMPropertyDecl& operator=(const ICIMPropertyDecl&) override { ThrowUnused(); }

  private:
    std::string fName;
    TCIMValue::TCIMType fType;
    bool fIsKey;
    TCIMValue fDefault;
    boost::weak_ptr<ICIMClass> fClass;
};

class TFakeParameterDecl : public TFakeElement<ICIMParameterDecl>
{
  public:
    TFakeParameterDecl(const std::string& name, TCIMValue::TCIMType type) : fName(name), fType(type) {}
    void Validate(TCIMContext) override {}
    void AddToMethod(TCIMContext) override { ThrowUnused(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(TCIMContext) const override { ThrowUnused(); }
    TCIMValue::TCIMType GetType(TCIMContext) const override { return fType; }
    bool IsArray(TCIMContext) const override { return fType.IsArray(); }
    bool operator==(const ICIMParameterDecl&) const override { ThrowUnused(); }
    bool operator<(const ICIMParameterDecl&) const override { ThrowUnused(); }
    ICIMParameterDecl& operator=(const ICIMParameterDecl&) override { ThrowUnused(); }

  private:
    std::string fName;
    TCIMValue::TCIMType fType;
};

class TFakeMethodDecl : public TFakeElement<ICIMMethodDecl>
{
  public:
    TFakeMethodDecl(const std::string& name, TCIMValue::TCIMType type,
                    std::vector<boost::shared_ptr<ICIMParameterDecl>> parameters)
        : fName(name), fType(type), fParameters(std::move(parameters))
    {
    }
    void Validate(TCIMContext) override {}
    void AddToClass(TCIMContext) override { ThrowUnused(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext) const override { ThrowUnused(); }
    TCIMValue::TCIMType GetReturnType(TCIMContext) const override { return fType; }
    boost::shared_ptr<ICIMParameterDecl> AllocateParameterDecl(const std::string&, TCIMValue::TCIMType,
                                                               TCIMContext) override
    {
        ThrowUnused();
    }
    boost::shared_ptr<ICIMParameterDecl> GetParameterDecl(const std::string&, TCIMContext) const override
    {
        ThrowUnused();
    }
    void EnumerateParameterDecls(TParameterDeclVisitor visitor, TCIMContext) const override
    {
        for (const auto& parameter : fParameters) {
            if (!visitor(parameter)) {
                return;
            }
        }
    }
    bool operator==(const ICIMMethodDecl&) const override { ThrowUnused(); }
    bool operator<(const ICIMMethodDecl&) const override { ThrowUnused(); }
    ICIMMethodDecl& operator=(const ICIMMethodDecl&) override { ThrowUnused(); }

  private:
    std::string fName;
    TCIMValue::TCIMType fType;
    std::vector<boost::shared_ptr<ICIMParameterDecl>> fParameters;
};

// Serves the instances that were added to it, or runs fEnumerate when that is set.
class TFakeClass : public TFakeElement<ICIMClass>, public boost::enable_shared_from_this<TFakeClass>
{
  public:
    explicit TFakeClass(const std::string& name, const boost::shared_ptr<ICIMClass>& superClass = nullptr)
        : fName(name), fSuperClass(superClass)
    {
    }

    boost::shared_ptr<TFakePropertyDecl> Declare(const std::string& name, TCIMValue::TCIMType type, bool isKey = false);
    void DeclareMethod(const boost::shared_ptr<ICIMMethodDecl>& method) { fMethods.push_back(method); }

    std::function<void(TInstanceVisitor)> fEnumerate;
    boost::weak_ptr<ICIMNamespace> fNamespace;
    std::vector<boost::shared_ptr<ICIMInstance>> fInstances;

    void Validate(TCIMContext) override {}
    void AddToNamespace(TCIMContext) override { ThrowUnused(); }
    void RemoveFromNamespace(TCIMContext) override { ThrowUnused(); }
    void ModifyClass(boost::shared_ptr<ICIMClass>, TCIMContext) override { ThrowUnused(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext) const override { return fNamespace.lock(); }
    bool IsAssociation(TCIMContext) const override { return false; }
    bool IsAbstract(TCIMContext) const override { return false; }
    bool IsRootClass(TCIMContext) const override { return fName == "<root>"; }
    boost::shared_ptr<ICIMClass> GetSuperClass(TCIMContext) const override { return fSuperClass; }
    void EnumerateSubClasses(TClassVisitor, bool, TCIMContext) const override { ThrowUnused(); }
    bool IsSubclassOf(boost::shared_ptr<const ICIMClass>, TCIMContext) const override { ThrowUnused(); }
    void EnumerateAssociatedClasses(TClassVisitor, const std::string&, const std::string&, const std::string&,
                                    const std::string&, TCIMContext) override
    {
        ThrowUnused();
    }
    void EnumerateAssociationClasses(TClassVisitor, const std::string&, const std::string&, TCIMContext) override
    {
        ThrowUnused();
    }
    void EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext) const override;
    boost::shared_ptr<ICIMPropertyDecl> AllocatePropertyDecl(const std::string&, TCIMValue, TCIMContext) override
    {
        ThrowUnused();
    }
    // Case ignored, as of a real class; throws 15 for an unknown name and 25 for one that begins with a digit.
    boost::shared_ptr<ICIMPropertyDecl> GetPropertyDecl(const std::string& name, TCIMContext) const override;
    void EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext) const override;
    boost::shared_ptr<ICIMProperty> GetProperty(const std::string&, TCIMContext) const override { ThrowUnused(); }
    void SetPropertyValue(const std::string&, TCIMValue, TCIMContext) override { ThrowUnused(); }
    void EnumerateStaticProperties(TPropertyVisitor, TCIMContext) const override { ThrowUnused(); }
    boost::shared_ptr<ICIMInstance> AllocateInstance(TCIMContext) override { ThrowUnused(); }
    void EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext) override;
    boost::shared_ptr<ICIMMethodDecl> AllocateMethodDecl(const std::string&, TCIMValue::TCIMType, TCIMContext) override
    {
        ThrowUnused();
    }
    boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(const std::string&, TCIMContext) const override { ThrowUnused(); }
    void EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext) const override;
    TCIMValue InvokeMethod(const std::string&, TCIMContext&, TCIMContext) override { ThrowUnused(); }
    bool operator==(const ICIMClass&) const override { ThrowUnused(); }
    bool operator<(const ICIMClass&) const override { ThrowUnused(); }
    ICIMClass& operator=(const ICIMClass&) override { ThrowUnused(); }
    bool hasCollected() const override { return false; }
    void SetCollected() override {}
    void AddChildClass(boost::shared_ptr<ICIMClass>) override { ThrowUnused(); }
    void RemoveChildClass(boost::shared_ptr<ICIMClass>) override { ThrowUnused(); }
    void AddInstance(boost::shared_ptr<ICIMInstance> instance) override { fInstances.push_back(instance); }
    void RemoveInstance(boost::shared_ptr<ICIMInstance> instance) override;
    void AddAssociationClass(boost::shared_ptr<ICIMClass>) override { ThrowUnused(); }
    void RemoveAssociationClass(boost::shared_ptr<ICIMClass>) override { ThrowUnused(); }
    void AddPropertyDecl(boost::shared_ptr<ICIMPropertyDecl>) override { ThrowUnused(); }
    void RemovePropertyDecl(boost::shared_ptr<ICIMPropertyDecl>) override { ThrowUnused(); }
    void AddMethodDecl(boost::shared_ptr<ICIMMethodDecl>) override { ThrowUnused(); }
    void RemoveMethodDecl(boost::shared_ptr<ICIMMethodDecl>) override { ThrowUnused(); }
    // Returns its first input; the outputs are the path, and the inputs again.
    TCIMValue InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                           TCIMContext& outputs, TCIMContext) override
    {
        outputs = inputs;
        outputs["Target"] = TCIMValue(target.GetPath() + " " + name);
        return inputs.empty() ? TCIMValue() : inputs.begin()->second;
    }
    void ClearInstances() override { fInstances.clear(); }

  private:
    std::string fName;
    boost::shared_ptr<ICIMClass> fSuperClass;
    std::vector<boost::shared_ptr<TFakePropertyDecl>> fProperties;
    std::vector<boost::shared_ptr<ICIMMethodDecl>> fMethods;
};

} // namespace NKOLVRX20
