// SPDX-License-Identifier: MIT
#include "src/schema/TPEGASUSProperty.h"

#include "display/PropertyText.h"
#include "src/schema/DeclarationAttributes.h"

#include <host/ICIMPropertyDecl.h>

#include <utility>

namespace NKOLVRX20 {

TPEGASUSProperty::TPEGASUSProperty(TCIMValue value, const boost::shared_ptr<ICIMPropertyDecl>& declaration,
                                   const boost::shared_ptr<ICIMClass>& owner)
    : fValue(std::move(value)), fDeclaration(declaration), fOwner(owner)
{
}

// The declaration comes first: a null value of an array property carries no array code.
TCIMValue::TCIMType TPEGASUSProperty::GetType(TCIMContext context) const
{
    const auto declaration = fDeclaration.lock();
    return declaration ? declaration->GetType(context) : DeclaredType(fValue);
}

bool TPEGASUSProperty::IsArray(TCIMContext context) const
{
    return GetType(context).IsArray();
}

bool TPEGASUSProperty::IsDefaultValue(TCIMContext context) const
{
    const auto declaration = fDeclaration.lock();
    return declaration && declaration->GetDefaultValue(context) == fValue;
}

TCIMValue TPEGASUSProperty::GetValue(TCIMContext) const
{
    return fValue;
}

void TPEGASUSProperty::SetValue(TCIMValue value, TCIMContext)
{
    fValue = std::move(value);
}

// Either is enough: the server's mark, or a declaration that belongs to another class.
bool TPEGASUSProperty::GetPropagated(TCIMContext context) const
{
    const auto declaration = fDeclaration.lock();
    return fPropagated || (declaration && declaration->GetClass(context) != fOwner.lock());
}

boost::shared_ptr<ICIMPropertyDecl> TPEGASUSProperty::GetDeclaration(TCIMContext) const
{
    return fDeclaration.lock();
}

bool TPEGASUSProperty::operator==(const ICIMProperty& other) const
{
    return fValue == other.GetValue({});
}

bool TPEGASUSProperty::operator<(const ICIMProperty& other) const
{
    return fValue < other.GetValue({});
}

ICIMProperty& TPEGASUSProperty::operator=(const ICIMProperty& other)
{
    fValue = other.GetValue({});
    return *this;
}

// The previous value belongs to the host, which alone sets it and compares two inventories with it.
TCIMValue TPEGASUSProperty::GetPrevValue() const
{
    return fPrevValue;
}

void TPEGASUSProperty::SetPrevValue(TCIMValue value)
{
    fPrevValue = std::move(value);
}

void TPEGASUSProperty::SetPrevValue()
{
    fPrevValue = fValue;
}

bool TPEGASUSProperty::IsPrevValueDifferent() const
{
    return fPrevValue != fValue;
}

std::string TPEGASUSProperty::ToString() const
{
    return PropertyText(fValue, fDeclaration.lock());
}

std::string TPEGASUSProperty::PrevValueToString() const
{
    return PropertyText(fPrevValue, fDeclaration.lock());
}

std::vector<std::string> TPEGASUSProperty::ToStringVector() const
{
    return PropertyTexts(fValue, fDeclaration.lock());
}

} // namespace NKOLVRX20
