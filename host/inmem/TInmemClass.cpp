// SPDX-License-Identifier: MIT
#include "host/inmem/TInmemClass.h"

#include <algorithm>
#include <cctype>

namespace NKOLVRX20 {
namespace {

// Elements may be added while they are visited, so a copy is.
template <typename Elements, typename Visitor> void VisitEach(const Elements elements, const Visitor& visitor)
{
    for (const auto& element : elements) {
        if (!visitor(element)) {
            return;
        }
    }
}

} // namespace

boost::shared_ptr<TInmemPropertyDecl> TInmemClass::Declare(const std::string& name, TCIMValue::TCIMType type,
                                                           bool isKey)
{
    const auto declared = boost::make_shared<TInmemPropertyDecl>(name, type, isKey);
    declared->SetClass(shared_from_this());
    fProperties.push_back(declared);
    fPropertiesByName[NormalizedName(name)] = declared;
    return declared;
}

boost::shared_ptr<TInmemMethodDecl> TInmemClass::DeclareMethod(const std::string& name, TCIMValue::TCIMType returnType)
{
    fMethods.push_back(boost::make_shared<TInmemMethodDecl>(name, returnType));
    return fMethods.back();
}

bool TInmemClass::IsQualified(const char* qualifier) const
{
    const auto found = GetQualifier(qualifier, TCIMContext());
    return found && found->GetValue(TCIMContext()) == TCIMValue(true);
}

void TInmemClass::EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext) const
{
    for (const auto& property : fProperties) {
        const std::string name = property->GetName(TCIMContext());
        if (property->IsKey() && !visitor(&name)) {
            return;
        }
    }
}

boost::shared_ptr<ICIMPropertyDecl> TInmemClass::GetPropertyDecl(const std::string& name, TCIMContext) const
{
    if (!name.empty() && std::isdigit(static_cast<unsigned char>(name[0]))) {
        throw TVRXException(TVRXStatusCode::kInvalidName);
    }
    const auto found = fPropertiesByName.find(NormalizedName(name));
    if (found == fPropertiesByName.end()) {
        throw TVRXException(TVRXStatusCode::kUnknownProperty);
    }
    return found->second;
}

boost::shared_ptr<ICIMMethodDecl> TInmemClass::GetMethodDecl(const std::string& name, TCIMContext context) const
{
    const auto found = std::find_if(fMethods.begin(), fMethods.end(), [&](const auto& method) {
        return NormalizedName(method->GetName(context)) == NormalizedName(name);
    });
    return found == fMethods.end() ? nullptr : *found;
}

void TInmemClass::EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext) const
{
    VisitEach(fProperties, visitor);
}

void TInmemClass::EnumerateInstances(TInstanceVisitor visitor, bool, TCIMContext)
{
    VisitEach(fInstances, visitor);
}

void TInmemClass::EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext) const
{
    VisitEach(fMethods, visitor);
}

void TInmemClass::RemoveInstance(boost::shared_ptr<ICIMInstance> instance)
{
    fInstances.erase(std::remove(fInstances.begin(), fInstances.end(), instance), fInstances.end());
}

} // namespace NKOLVRX20
