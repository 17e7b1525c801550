// SPDX-License-Identifier: MIT
// The properties and methods that a class declares, and the rules for adding one.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/Names.h"
#include "src/schema/TPEGASUSClass.h"
#include "src/schema/TPEGASUSMethodDecl.h"
#include "src/schema/TPEGASUSProperty.h"
#include "src/schema/TPEGASUSPropertyDecl.h"

#include <boost/make_shared.hpp>

namespace NKOLVRX20 {

namespace {

// The host asks every class for this one, in this spelling, and takes null for an answer.
constexpr char kCollectionTimeProperty[] = "DateTimeOfCollection";
// Vendors declare this one twice; the later declaration holds.
constexpr char kRepeatableName[] = "PortType";
constexpr char kKeyQualifier[] = "KEY";

} // namespace

// A declaration other than a key counts as visited, so that the walk goes on.
void TPEGASUSClass::EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext context) const
{
    fPropertyDecls.Visit([&](const boost::shared_ptr<TPEGASUSPropertyDecl>& declaration) {
        const std::string name = declaration->GetName(context);
        return !HasTrueQualifier(*declaration, kKeyQualifier) || visitor(&name);
    });
}

boost::shared_ptr<ICIMPropertyDecl> TPEGASUSClass::AllocatePropertyDecl(const std::string& name, TCIMValue value,
                                                                        TCIMContext)
{
    return boost::make_shared<TPEGASUSPropertyDecl>(shared_from_this(), name, value);
}

boost::shared_ptr<ICIMPropertyDecl> TPEGASUSClass::GetPropertyDecl(const std::string& name, TCIMContext) const
{
    const auto declaration = fPropertyDecls.Find(name);
    if (!declaration && name != kCollectionTimeProperty) {
        throw TVRXException(TVRXStatusCode::kUnknownProperty);
    }
    return declaration;
}

void TPEGASUSClass::EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext) const
{
    fPropertyDecls.Visit(visitor);
}

boost::shared_ptr<ICIMProperty> TPEGASUSClass::GetProperty(const std::string& name, TCIMContext) const
{
    auto property = fProperties.Find(name);
    if (!property) {
        throw TVRXException(TVRXStatusCode::kUnknownProperty);
    }
    return property;
}

void TPEGASUSClass::EnumerateStaticProperties(TPropertyVisitor visitor, TCIMContext) const
{
    fProperties.Visit(visitor);
}

boost::shared_ptr<ICIMMethodDecl> TPEGASUSClass::AllocateMethodDecl(const std::string& name,
                                                                    TCIMValue::TCIMType returnType, TCIMContext)
{
    return boost::make_shared<TPEGASUSMethodDecl>(shared_from_this(), name, returnType);
}

// Null for an unknown method, where an unknown property throws: hosts test the one and catch the other.
boost::shared_ptr<ICIMMethodDecl> TPEGASUSClass::GetMethodDecl(const std::string& name, TCIMContext) const
{
    return fMethodDecls.Find(name);
}

void TPEGASUSClass::EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext) const
{
    fMethodDecls.Visit(visitor);
}

void TPEGASUSClass::AddPropertyDecl(boost::shared_ptr<ICIMPropertyDecl> declaration)
{
    const auto own = boost::dynamic_pointer_cast<TPEGASUSPropertyDecl>(declaration);
    if (!own) {
        LogAndThrow(TVRXStatusCode::kTypeMismatch, "TPEGASUSClass::AddPropertyDecl failed: ", fName,
                    ": null, or not a declaration of this plug-in");
    }
    const std::string name = own->GetName({});
    if (own->GetType({}) == TCIMValue::TCIMType::kReference && !IsAssociation({})) {
        LogFailure("TPEGASUS: Attempt to add reference property ", name, " to non-association class ", fName);
        throw TVRXException(TVRXStatusCode::kReferenceInNonAssociation);
    }
    const std::string key = NormalizedName(name);
    const auto existing = fPropertyDecls.FindAs(key);
    if (!own->GetQualifier(kOverrideQualifier, {})) {
        CheckNewPropertyDecl(existing, name);
    } else {
        CheckOverride(existing, *own);
    }
    fPropertyDecls.PutAs(key, own);
}

void TPEGASUSClass::CheckOverride(const boost::shared_ptr<TPEGASUSPropertyDecl>& existing,
                                  const TPEGASUSPropertyDecl& declaration) const
{
    const std::string name = declaration.GetName({});
    if (!existing) { // vendors' MOF has such classes
        LogFailure("TPEGASUS: Attempt to override property ", name, " in class ", fName,
                   ": property doesn't exist in base class");
    } else if (existing->GetType({}) != declaration.GetType({})) {
        RefuseOverride(name, ": different types", TVRXStatusCode::kTypeMismatch);
    } else if (existing->GetClass({}).get() == this) {
        RefuseOverride(name, ": original was defined in this class", TVRXStatusCode::kAlreadyExists);
    }
}

// Log readers know the second line's text, with "failed" close to the class name.
void TPEGASUSClass::RefuseOverride(const std::string& name, const char* reason, unsigned int status) const
{
    LogFailure("TPEGASUS: Attempt to override property ", name, " in class ", fName, reason);
    const TVRXException refusal(status);
    LogFailure("TPEGASUS: Attempt define property ", name, " in class ", fName, "failed. Reason = ", refusal.what());
    throw refusal;
}

void TPEGASUSClass::CheckNewPropertyDecl(const boost::shared_ptr<TPEGASUSPropertyDecl>& existing,
                                         const std::string& name) const
{
    const bool isRepeatable = name.find(kRepeatableName) != std::string::npos;
    if (existing && !isRepeatable) {
        LogFailure("TPEGASUS: Attempt to add property ", name, " to class ", fName, ": already exists");
        throw TVRXException(TVRXStatusCode::kAlreadyExists);
    }
}

// An override needs something to override, but a new class starts with an empty map. The superclass's declaration is
// shared and keeps its owner, by which CheckOverride knows that it was inherited.
void TPEGASUSClass::AdoptPropertyDecl(const std::string& name)
{
    const auto superClass = fSuperClass.lock();
    const auto inherited = superClass ? superClass->fPropertyDecls.Find(name) : nullptr;
    if (inherited && !fPropertyDecls.Find(name)) {
        fPropertyDecls.Put(name, inherited);
    }
}

void TPEGASUSClass::EnterProperty(const boost::shared_ptr<ICIMPropertyDecl>& declaration, const TCIMValue& value,
                                  bool propagated)
{
    const auto property = boost::make_shared<TPEGASUSProperty>(value, declaration, shared_from_this());
    property->SetPropagated(propagated);
    fProperties.Put(declaration->GetName({}), property);
}

void TPEGASUSClass::EnterMethodDecl(const boost::shared_ptr<TPEGASUSMethodDecl>& declaration)
{
    fMethodDecls.Put(declaration->GetName({}), declaration);
}

// The server alone decides on methods, and on what a class loses.

void TPEGASUSClass::RemovePropertyDecl(boost::shared_ptr<ICIMPropertyDecl>) {}

void TPEGASUSClass::AddMethodDecl(boost::shared_ptr<ICIMMethodDecl>) {}

void TPEGASUSClass::RemoveMethodDecl(boost::shared_ptr<ICIMMethodDecl>) {}

} // namespace NKOLVRX20
