// SPDX-License-Identifier: MIT
#include "host/inmem/TInmemNamespace.h"

#include "host/inmem/ObjectNames.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/INamespaceProvider.h>
#include <host/IProvider.h>
#include <host/TVRXException.h>

namespace NKOLVRX20 {
namespace {

[[noreturn]] void ThrowNotSupported()
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

template <typename Object>
boost::shared_ptr<Object> Find(const std::map<std::string, boost::shared_ptr<Object>>& objects, const std::string& key)
{
    const auto found = objects.find(key);
    return found == objects.end() ? boost::shared_ptr<Object>() : found->second;
}

// Visitors may change the namespace, so a copy of the entries is visited.
template <typename Objects, typename Visitor> void VisitEntries(const Objects objects, const Visitor& visitor)
{
    for (const auto& object : objects) {
        if (!visitor(object.second)) {
            return;
        }
    }
}

} // namespace

TInmemNamespace::~TInmemNamespace()
{
    for (const auto& each : fClasses) {
        each.second->ClearInstances();
    }
}

void TInmemNamespace::AddClass(const boost::shared_ptr<ICIMClass>& newClass)
{
    fClasses[NormalizedName(newClass->GetName(TCIMContext()))] = newClass;
}

void TInmemNamespace::AddQualifierDecl(const boost::shared_ptr<ICIMQualifierDecl>& declaration)
{
    fQualifierDecls[NormalizedName(declaration->GetName(TCIMContext()))] = declaration;
}

void TInmemNamespace::AddInstance(const boost::shared_ptr<ICIMInstance>& instance)
{
    fInstances[instance->GetReference(TCIMContext()).GetPath()] = instance;
}

boost::shared_ptr<INamespaceProvider> TInmemNamespace::GetNamespaceProvider(TCIMContext)
{
    return nullptr;
}

void TInmemNamespace::SetUpcallNamespace(boost::shared_ptr<ICIMNamespace> upcall, TCIMContext)
{
    fUpcall = upcall;
}

void TInmemNamespace::AddUnderlyingNamespace(boost::shared_ptr<ICIMNamespace>, TCIMContext)
{
    ThrowNotSupported();
}

boost::shared_ptr<ICIMClass> TInmemNamespace::AllocateClass(const std::string&, boost::shared_ptr<ICIMClass>,
                                                            TCIMContext)
{
    ThrowNotSupported();
}

boost::shared_ptr<ICIMClass> TInmemNamespace::GetClass(const std::string& name, TCIMContext)
{
    return Find(fClasses, NormalizedName(name));
}

void TInmemNamespace::EnumerateRootClasses(TClassVisitor visitor, TCIMContext context)
{
    VisitEntries(fClasses, [&](const boost::shared_ptr<ICIMClass>& each) {
        return each->GetSuperClass(context) ? true : visitor(each);
    });
}

void TInmemNamespace::EnumerateProviders(TProviderVisitor visitor, TCIMContext)
{
    const auto providers = fProviders; // the visitor may change the namespace
    for (const auto& provider : providers) {
        if (!visitor(provider)) {
            return;
        }
    }
}

boost::shared_ptr<ICIMQualifierDecl> TInmemNamespace::AllocateQualifierDecl(const std::string&, TCIMValue,
                                                                            ICIMQualifierDecl::EScope,
                                                                            ICIMQualifierDecl::EFlavor, TCIMContext)
{
    ThrowNotSupported();
}

boost::shared_ptr<ICIMQualifierDecl> TInmemNamespace::GetQualifierDecl(const std::string& name, TCIMContext)
{
    return Find(fQualifierDecls, NormalizedName(name));
}

void TInmemNamespace::EnumerateQualifierDecls(TQualifierDeclVisitor visitor, TCIMContext)
{
    VisitEntries(fQualifierDecls, visitor);
}

void TInmemNamespace::Subscribe(boost::shared_ptr<ICIMIndicationFilter>, TInstanceVisitor, TCIMContext)
{
    ThrowNotSupported();
}

boost::shared_ptr<ICIMInstance> TInmemNamespace::GetInstance(const TCIMReference& reference, TCIMContext)
{
    return Find(fInstances, reference.GetPath());
}

void TInmemNamespace::DeleteInstance(const TCIMReference& reference, TCIMContext)
{
    if (fInstances.erase(reference.GetPath()) == 0) {
        throw TVRXException(TVRXStatusCode::kNotFound);
    }
}

void TInmemNamespace::ModifyInstance(const TCIMReference& reference, TCIMContext values, TCIMContext context)
{
    const auto instance = Find(fInstances, reference.GetPath());
    if (!instance) {
        throw TVRXException(TVRXStatusCode::kNotFound);
    }
    for (const auto& value : values) {
        instance->SetPropertyValue(value.first, value.second, context);
    }
}

void TInmemNamespace::ExecuteQuery(TInstanceVisitor, std::string&, std::string&, TCIMContext)
{
    ThrowNotSupported();
}

void TInmemNamespace::ClearInstances()
{
    fInstances.clear();
}

} // namespace NKOLVRX20
