// SPDX-License-Identifier: MIT
// The declarations of a class in memory: plain data behind the contract's interfaces. What the data cannot answer (an
// operation that changes a declaration, or leads to its owner) throws TVRXException 31.
#pragma once

#include "host/inmem/ObjectNames.h"

#include <host/ICIMClass.h>
#include <host/ICIMMethodDecl.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <boost/weak_ptr.hpp>

#include <map>
#include <vector>

namespace NKOLVRX20 {

[[noreturn]] inline void ThrowNotInMemory()
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

// It has no declaration of its own.
class TInmemQualifier : public ICIMQualifier
{
  public:
    TInmemQualifier(const std::string& name, const TCIMValue& value) : fName(name), fValue(value) {}
    void Validate(TCIMContext) override {}
    void AddToClassOrProperty(TCIMContext) override { ThrowNotInMemory(); }
    void RemoveFromClassOrProperty(TCIMContext) override { ThrowNotInMemory(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMNamedElement> GetClassOrProperty(TCIMContext) const override { ThrowNotInMemory(); }
    TCIMValue::TCIMType GetType(TCIMContext) const override { return fValue.GetType(); }
    bool IsArray(TCIMContext) const override { return fValue.IsArray(); }
    boost::shared_ptr<const ICIMQualifierDecl> GetDeclaration(TCIMContext) const override { ThrowNotInMemory(); }
    TCIMValue GetValue(TCIMContext) const override { return fValue; }
    void SetValue(TCIMValue value, TCIMContext) override { fValue = value; }
    void SetFlavor(ICIMQualifierDecl::EFlavor, TCIMContext) override { ThrowNotInMemory(); }
    void UnsetFlavor(ICIMQualifierDecl::EFlavor, TCIMContext) override { ThrowNotInMemory(); }
    ICIMQualifierDecl::EFlavor GetFlavor(TCIMContext) const override { ThrowNotInMemory(); }
    bool operator==(const ICIMQualifier&) const override { ThrowNotInMemory(); }
    bool operator<(const ICIMQualifier&) const override { ThrowNotInMemory(); }
    bool GetPropagated(TCIMContext) const override { return false; }
    ICIMQualifier& operator=(const ICIMQualifier&) override { ThrowNotInMemory(); }

  private:
    std::string fName;
    TCIMValue fValue;
};

// The qualifiers of an element.
template <typename Interface> class TInmemElement : public Interface
{
  public:
    TInmemElement() = default;
    Interface& operator=(const Interface&) override { ThrowNotInMemory(); }
    void SetQualifier(const std::string& name, const TCIMValue& value)
    {
        fQualifiers[NormalizedName(name)] = boost::make_shared<TInmemQualifier>(name, value);
    }
    void AddQualifier(boost::shared_ptr<ICIMQualifier>, TCIMContext) override { ThrowNotInMemory(); }
    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl>, TCIMValue,
                                                       TCIMContext) override
    {
        ThrowNotInMemory();
    }
    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl>, TCIMValue,
                                                       ICIMQualifierDecl::EFlavor, TCIMContext) override
    {
        ThrowNotInMemory();
    }
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, TCIMContext) const override
    {
        const auto found = fQualifiers.find(NormalizedName(name));
        return found == fQualifiers.end() ? boost::shared_ptr<ICIMQualifier>() : found->second;
    }
    void EnumerateQualifiers(TQualifierVisitor visitor, TCIMContext) const override
    {
        for (const auto& qualifier : fQualifiers) {
            if (!visitor(qualifier.second)) {
                return;
            }
        }
    }
    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, bool& found,
                                                  TCIMContext context) const override
    {
        const auto qualifier = GetQualifier(name, context);
        found = qualifier != nullptr;
        return qualifier;
    }

  private:
    std::map<std::string, boost::shared_ptr<ICIMQualifier>> fQualifiers; // by normalised name
};

class TInmemPropertyDecl : public TInmemElement<ICIMPropertyDecl>
{
  public:
    TInmemPropertyDecl(const std::string& name, TCIMValue::TCIMType type, bool isKey)
        : fName(name), fType(type), fIsKey(isKey)
    {
    }
    bool IsKey() const { return fIsKey; }
    void SetClass(const boost::shared_ptr<ICIMClass>& owner) { fClass = owner; }

    void Validate(TCIMContext) override {}
    void AddToClass(TCIMContext) override { ThrowNotInMemory(); }
    void RemoveFromClass(TCIMContext) override { ThrowNotInMemory(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext) const override { return fClass.lock(); }
    TCIMValue::TCIMType GetType(TCIMContext) const override { return fType; }
    bool IsArray(TCIMContext) const override { return fType.IsArray(); }
    TCIMValue GetDefaultValue(TCIMContext) const override { return fDefault; }
    void SetDefaultValue(TCIMValue value, TCIMContext) override { fDefault = value; }
    bool operator==(const ICIMPropertyDecl&) const override { ThrowNotInMemory(); }
    bool operator<(const ICIMPropertyDecl&) const override { ThrowNotInMemory(); }
    ICIMPropertyDecl& operator=(const ICIMPropertyDecl&) override { ThrowNotInMemory(); }

  private:
    std::string fName;
    TCIMValue::TCIMType fType;
    bool fIsKey;
    TCIMValue fDefault;
    boost::weak_ptr<ICIMClass> fClass;
};

class TInmemParameterDecl : public TInmemElement<ICIMParameterDecl>
{
  public:
    TInmemParameterDecl(const std::string& name, TCIMValue::TCIMType type) : fName(name), fType(type) {}
    void Validate(TCIMContext) override {}
    void AddToMethod(TCIMContext) override { ThrowNotInMemory(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(TCIMContext) const override { ThrowNotInMemory(); }
    TCIMValue::TCIMType GetType(TCIMContext) const override { return fType; }
    bool IsArray(TCIMContext) const override { return fType.IsArray(); }
    bool operator==(const ICIMParameterDecl&) const override { ThrowNotInMemory(); }
    bool operator<(const ICIMParameterDecl&) const override { ThrowNotInMemory(); }
    ICIMParameterDecl& operator=(const ICIMParameterDecl&) override { ThrowNotInMemory(); }

  private:
    std::string fName;
    TCIMValue::TCIMType fType;
};

class TInmemMethodDecl : public TInmemElement<ICIMMethodDecl>
{
  public:
    TInmemMethodDecl(const std::string& name, TCIMValue::TCIMType type) : fName(name), fType(type) {}

    boost::shared_ptr<TInmemParameterDecl> Declare(const std::string& name, TCIMValue::TCIMType type)
    {
        fParameters.push_back(boost::make_shared<TInmemParameterDecl>(name, type));
        return fParameters.back();
    }

    void Validate(TCIMContext) override {}
    void AddToClass(TCIMContext) override { ThrowNotInMemory(); }
    std::string GetName(TCIMContext) const override { return fName; }
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext) const override { ThrowNotInMemory(); }
    TCIMValue::TCIMType GetReturnType(TCIMContext) const override { return fType; }
    boost::shared_ptr<ICIMParameterDecl> AllocateParameterDecl(const std::string&, TCIMValue::TCIMType,
                                                               TCIMContext) override
    {
        ThrowNotInMemory();
    }
    boost::shared_ptr<ICIMParameterDecl> GetParameterDecl(const std::string&, TCIMContext) const override
    {
        ThrowNotInMemory();
    }
    void EnumerateParameterDecls(TParameterDeclVisitor visitor, TCIMContext) const override
    {
        for (const auto& parameter : fParameters) {
            if (!visitor(parameter)) {
                return;
            }
        }
    }
    bool operator==(const ICIMMethodDecl&) const override { ThrowNotInMemory(); }
    bool operator<(const ICIMMethodDecl&) const override { ThrowNotInMemory(); }
    ICIMMethodDecl& operator=(const ICIMMethodDecl&) override { ThrowNotInMemory(); }

  private:
    std::string fName;
    TCIMValue::TCIMType fType;
    std::vector<boost::shared_ptr<TInmemParameterDecl>> fParameters;
};

} // namespace NKOLVRX20
