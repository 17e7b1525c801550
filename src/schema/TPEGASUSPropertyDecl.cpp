// SPDX-License-Identifier: MIT
#include "src/schema/TPEGASUSPropertyDecl.h"

#include "src/common/CoreLog.h"
#include "src/schema/DeclarationAttributes.h"
#include "src/schema/TPEGASUSClass.h"

#include <utility>

namespace NKOLVRX20 {

// The order of the members matters: the type is read from the default before the default is moved.
TPEGASUSPropertyDecl::TPEGASUSPropertyDecl(const boost::shared_ptr<TPEGASUSClass>& owner, std::string name,
                                           TCIMValue defaultValue)
    : fOwner(owner), fName(std::move(name)), fType(DeclaredType(defaultValue)), fDefaultValue(std::move(defaultValue))
{
}

void TPEGASUSPropertyDecl::Validate(TCIMContext) {}

void TPEGASUSPropertyDecl::AddToClass(TCIMContext)
{
    boost::shared_ptr<TPEGASUSClass>(fOwner)->AddPropertyDecl(shared_from_this());
}

void TPEGASUSPropertyDecl::RemoveFromClass(TCIMContext)
{
    LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSPropertyDecl::RemoveFromClass failed: ", fName,
                ": not supported");
}

std::string TPEGASUSPropertyDecl::GetName(TCIMContext) const
{
    return fName;
}

boost::shared_ptr<ICIMClass> TPEGASUSPropertyDecl::GetClass(TCIMContext) const
{
    return fOwner.lock();
}

TCIMValue::TCIMType TPEGASUSPropertyDecl::GetType(TCIMContext) const
{
    return fType;
}

bool TPEGASUSPropertyDecl::IsArray(TCIMContext) const
{
    return fType.IsArray();
}

TCIMValue TPEGASUSPropertyDecl::GetDefaultValue(TCIMContext) const
{
    return fDefaultValue;
}

// The type was fixed at construction: a null that replaces an empty array carries no type of its own.
void TPEGASUSPropertyDecl::SetDefaultValue(TCIMValue value, TCIMContext)
{
    fDefaultValue = std::move(value);
}

bool TPEGASUSPropertyDecl::operator==(const ICIMPropertyDecl& other) const
{
    return fName == other.GetName({});
}

bool TPEGASUSPropertyDecl::operator<(const ICIMPropertyDecl& other) const
{
    return fName < other.GetName({});
}

ICIMPropertyDecl& TPEGASUSPropertyDecl::operator=(const ICIMPropertyDecl&)
{
    return *this;
}

} // namespace NKOLVRX20
