// SPDX-License-Identifier: MIT
#include "tests/host/support/FakeModel.h"

#include <algorithm>
#include <cctype>

#include <strings.h>

namespace NKOLVRX20 {

boost::shared_ptr<TFakePropertyDecl> TFakeClass::Declare(const std::string& name, TCIMValue::TCIMType type, bool isKey)
{
    fProperties.push_back(boost::make_shared<TFakePropertyDecl>(name, type, isKey));
    fProperties.back()->SetClass(shared_from_this());
    return fProperties.back();
}

void TFakeClass::EnumerateKeyNames(TKeyNameVisitor visitor, TCIMContext) const
{
    for (const auto& property : fProperties) {
        const std::string name = property->GetName(TCIMContext());
        if (property->IsKey() && !visitor(&name)) {
            return;
        }
    }
}

boost::shared_ptr<ICIMPropertyDecl> TFakeClass::GetPropertyDecl(const std::string& name, TCIMContext) const
{
    if (!name.empty() && std::isdigit(static_cast<unsigned char>(name[0]))) {
        throw TVRXException(TVRXStatusCode::kInvalidName);
    }
    for (const auto& property : fProperties) {
        if (strcasecmp(property->GetName(TCIMContext()).c_str(), name.c_str()) == 0) {
            return property;
        }
    }
    throw TVRXException(TVRXStatusCode::kUnknownProperty);
}

void TFakeClass::EnumeratePropertyDecls(TPropertyDeclVisitor visitor, TCIMContext) const
{
    for (const auto& property : fProperties) {
        if (!visitor(property)) {
            return;
        }
    }
}

void TFakeClass::EnumerateInstances(TInstanceVisitor visitor, bool, TCIMContext)
{
    if (fEnumerate) {
        return fEnumerate(visitor);
    }
    for (const auto& instance : fInstances) {
        if (!visitor(instance)) {
            return;
        }
    }
}

void TFakeClass::EnumerateMethodDecls(TMethodDeclVisitor visitor, TCIMContext) const
{
    for (const auto& method : fMethods) {
        if (!visitor(method)) {
            return;
        }
    }
}

void TFakeClass::RemoveInstance(boost::shared_ptr<ICIMInstance> instance)
{
    fInstances.erase(std::remove(fInstances.begin(), fInstances.end(), instance), fInstances.end());
}

} // namespace NKOLVRX20
