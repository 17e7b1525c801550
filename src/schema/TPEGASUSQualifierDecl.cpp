// SPDX-License-Identifier: MIT
#include "src/schema/TPEGASUSQualifierDecl.h"

#include "src/common/CoreLog.h"
#include "src/schema/DeclarationAttributes.h"

#include <utility>

namespace NKOLVRX20 {

// The order of the members matters: the type is read from the default before the default is moved.
TPEGASUSQualifierDecl::TPEGASUSQualifierDecl(const boost::shared_ptr<TPEGASUSNamespace>& ns, std::string name,
                                             TCIMValue defaultValue, EScope scope, EFlavor flavor)
    : fName(std::move(name)), fType(DeclaredType(defaultValue)), fDefaultValue(std::move(defaultValue)), fScope(scope),
      fFlavor(flavor), fNamespace(ns)
{
}

void TPEGASUSQualifierDecl::Validate(TCIMContext) {}

// Allocation and entry are two steps, because the namespace refuses a second declaration of a name.
void TPEGASUSQualifierDecl::AddToNamespace(TCIMContext)
{
    fNamespace.AddQualifierDecl(shared_from_this());
}

void TPEGASUSQualifierDecl::RemoveQualifierDecl(TCIMContext)
{
    LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSQualifierDecl::RemoveQualifierDecl failed: ", fName,
                ": not supported");
}

std::string TPEGASUSQualifierDecl::GetName(TCIMContext) const
{
    return fName;
}

boost::shared_ptr<ICIMNamespace> TPEGASUSQualifierDecl::GetNamespace(TCIMContext) const
{
    return fNamespace.Get();
}

TCIMValue::TCIMType TPEGASUSQualifierDecl::GetType(TCIMContext) const
{
    return fType;
}

bool TPEGASUSQualifierDecl::IsArray(TCIMContext) const
{
    return fType.IsArray();
}

TCIMValue TPEGASUSQualifierDecl::GetDefaultValue(TCIMContext) const
{
    return fDefaultValue;
}

void TPEGASUSQualifierDecl::SetDefaultValue(TCIMValue value, TCIMContext)
{
    fDefaultValue = std::move(value);
}

ICIMQualifierDecl::EScope TPEGASUSQualifierDecl::GetScope(TCIMContext) const
{
    return fScope;
}

// Flavors are bits: setting some keeps the others. A qualifier copied its flavor when it was made, and stays as it is.
void TPEGASUSQualifierDecl::SetFlavor(EFlavor flavor, TCIMContext)
{
    fFlavor = WithBits(fFlavor, flavor);
}

void TPEGASUSQualifierDecl::UnsetFlavor(EFlavor flavor, TCIMContext)
{
    fFlavor = WithoutBits(fFlavor, flavor);
}

ICIMQualifierDecl::EFlavor TPEGASUSQualifierDecl::GetFlavor(TCIMContext) const
{
    return fFlavor;
}

bool TPEGASUSQualifierDecl::operator==(const ICIMQualifierDecl& other) const
{
    return fName == other.GetName({});
}

bool TPEGASUSQualifierDecl::operator<(const ICIMQualifierDecl& other) const
{
    return fName < other.GetName({});
}

ICIMQualifierDecl& TPEGASUSQualifierDecl::operator=(const ICIMQualifierDecl&)
{
    return *this;
}

} // namespace NKOLVRX20
