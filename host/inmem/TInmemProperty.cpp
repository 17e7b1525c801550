// SPDX-License-Identifier: MIT
#include "host/inmem/TInmemProperty.h"

#include "display/PropertyText.h"

#include <host/ICIMClass.h>
#include <host/ICIMPropertyDecl.h>

#include <utility>

namespace NKOLVRX20 {

std::string TInmemProperty::GetName() const
{
    return fMember->fName;
}

std::string TInmemProperty::NameOf(const ICIMProperty& property)
{
    if (const auto* own = dynamic_cast<const TInmemProperty*>(&property)) {
        return own->GetName();
    }
    const auto declaration = property.GetDeclaration(TCIMContext());
    return declaration ? declaration->GetName(TCIMContext()) : std::string();
}

TCIMValue::TCIMType TInmemProperty::GetType(TCIMContext context) const
{
    // A value knows its element's code; the property's type is the array's.
    if (fValue.IsArray()) {
        return TCIMValue::TCIMType::ECIMType(fValue.GetType() + TCIMValue::TCIMType::kArrayOffset);
    }
    const auto declaration = fMember->fDeclaration.lock();
    const bool typeless = fValue.GetType() == TCIMValue::TCIMType::kNone;
    return typeless && declaration ? declaration->GetType(context) : fValue.GetType();
}

bool TInmemProperty::IsArray(TCIMContext context) const
{
    return GetType(context).IsArray();
}

bool TInmemProperty::IsDefaultValue(TCIMContext context) const
{
    const auto declaration = fMember->fDeclaration.lock();
    return declaration && declaration->GetDefaultValue(context) == fValue;
}

TCIMValue TInmemProperty::GetValue(TCIMContext) const
{
    return fValue;
}

void TInmemProperty::SetValue(TCIMValue value, TCIMContext)
{
    fValue = std::move(value);
}

bool TInmemProperty::GetPropagated(TCIMContext context) const
{
    const auto declaration = fMember->fDeclaration.lock();
    const auto owner = declaration ? declaration->GetClass(context) : boost::shared_ptr<ICIMClass>();
    return owner && owner != fMember->fClass.lock();
}

boost::shared_ptr<ICIMPropertyDecl> TInmemProperty::GetDeclaration(TCIMContext) const
{
    return fMember->fDeclaration.lock();
}

bool TInmemProperty::operator==(const ICIMProperty& other) const
{
    return fValue == other.GetValue(TCIMContext());
}

bool TInmemProperty::operator<(const ICIMProperty& other) const
{
    return fValue < other.GetValue(TCIMContext());
}

ICIMProperty& TInmemProperty::operator=(const ICIMProperty& other)
{
    fValue = other.GetValue(TCIMContext());
    return *this;
}

TCIMValue TInmemProperty::GetPrevValue() const
{
    return fPrevValue;
}

void TInmemProperty::SetPrevValue(TCIMValue value)
{
    fPrevValue = std::move(value);
}

void TInmemProperty::SetPrevValue()
{
    fPrevValue = fValue;
}

bool TInmemProperty::IsPrevValueDifferent() const
{
    return fPrevValue != fValue;
}

std::string TInmemProperty::ToString() const
{
    return PropertyText(fValue, fMember->fDeclaration.lock());
}

std::string TInmemProperty::PrevValueToString() const
{
    return PropertyText(fPrevValue, fMember->fDeclaration.lock());
}

std::vector<std::string> TInmemProperty::ToStringVector() const
{
    return PropertyTexts(fValue, fMember->fDeclaration.lock());
}

} // namespace NKOLVRX20
