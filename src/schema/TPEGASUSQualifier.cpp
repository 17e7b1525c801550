#include "src/schema/TPEGASUSQualifier.h"

#include "src/common/CoreLog.h"
#include "src/schema/QualifierBits.h"

#include <host/ICIMNamedElement.h>

#include <utility>

namespace NKOLVRX20 {

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

ICIMQualifier& TPEGASUSQualifier::operator=(const ICIMQualifier& other)
{
    fValue = other.GetValue({});
    return *this;
}

} // namespace NKOLVRX20
