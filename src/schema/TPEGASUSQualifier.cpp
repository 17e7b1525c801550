// SPDX-License-Identifier: MIT
#include "src/schema/TPEGASUSQualifier.h"

#include "src/common/CoreLog.h"
#include "src/schema/DeclarationAttributes.h"

#include <host/ICIMNamedElement.h>

#include <utility>

namespace NKOLVRX20 {

// The declaration is shared, because the qualifier takes its name and type from it; the element is weak, because it
// owns the qualifier.
TPEGASUSQualifier::TPEGASUSQualifier(const boost::shared_ptr<ICIMNamedElement>& element,
                                     boost::shared_ptr<const ICIMQualifierDecl> declaration, TCIMValue value,
                                     ICIMQualifierDecl::EFlavor flavor)
    : fElement(element), fDeclaration(std::move(declaration)), fValue(std::move(value)), fFlavor(flavor)
{
}

void TPEGASUSQualifier::Validate(TCIMContext) {}

void TPEGASUSQualifier::AddToClassOrProperty(TCIMContext context)
{
    boost::shared_ptr<ICIMNamedElement>(fElement)->AddQualifier(shared_from_this(), context);
}

void TPEGASUSQualifier::RemoveFromClassOrProperty(TCIMContext context)
{
    LogAndThrow(TVRXStatusCode::kNotSupported,
                "TPEGASUSQualifier::RemoveFromClassOrProperty failed: ", GetName(context), ": not supported");
}

std::string TPEGASUSQualifier::GetName(TCIMContext context) const
{
    return fDeclaration->GetName(context);
}

boost::shared_ptr<ICIMNamedElement> TPEGASUSQualifier::GetClassOrProperty(TCIMContext) const
{
    return fElement.lock();
}

TCIMValue::TCIMType TPEGASUSQualifier::GetType(TCIMContext context) const
{
    return fDeclaration->GetType(context);
}

bool TPEGASUSQualifier::IsArray(TCIMContext context) const
{
    return fDeclaration->IsArray(context);
}

boost::shared_ptr<const ICIMQualifierDecl> TPEGASUSQualifier::GetDeclaration(TCIMContext) const
{
    return fDeclaration;
}

TCIMValue TPEGASUSQualifier::GetValue(TCIMContext) const
{
    return fValue;
}

void TPEGASUSQualifier::SetValue(TCIMValue value, TCIMContext)
{
    fValue = std::move(value);
}

// Flavors are bits: setting some keeps the others.
void TPEGASUSQualifier::SetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext)
{
    fFlavor = WithBits(fFlavor, flavor);
}

void TPEGASUSQualifier::UnsetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext)
{
    fFlavor = WithoutBits(fFlavor, flavor);
}

ICIMQualifierDecl::EFlavor TPEGASUSQualifier::GetFlavor(TCIMContext) const
{
    return fFlavor;
}

bool TPEGASUSQualifier::operator==(const ICIMQualifier& other) const
{
    return GetName({}) == other.GetName({}) && fValue == other.GetValue({});
}

bool TPEGASUSQualifier::operator<(const ICIMQualifier& other) const
{
    const std::string name = GetName({}), otherName = other.GetName({});
    return name != otherName ? name < otherName : fValue < other.GetValue({});
}

bool TPEGASUSQualifier::GetPropagated(TCIMContext) const
{
    return fPropagated;
}

// The value alone: name and type are the declaration's, and the flavor says how this element holds the qualifier.
ICIMQualifier& TPEGASUSQualifier::operator=(const ICIMQualifier& other)
{
    fValue = other.GetValue({});
    return *this;
}

} // namespace NKOLVRX20
