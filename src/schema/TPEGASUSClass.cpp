// SPDX-License-Identifier: MIT
#include "src/schema/TPEGASUSClass.h"

#include "src/common/CoreLog.h"

#include <utility>

namespace NKOLVRX20 {

// Initialize links the superclass, and enters this class among its children once the server has given the class. A
// class that the server refuses stays out of the tree.
TPEGASUSClass::TPEGASUSClass(const boost::shared_ptr<TPEGASUSNamespace>& ns, std::string name,
                             const boost::shared_ptr<TPEGASUSClass>&)
    : fNamespace(ns), fName(std::move(name))
{
}

TPEGASUSClass::~TPEGASUSClass() = default;

void TPEGASUSClass::Validate(TCIMContext) {}

void TPEGASUSClass::AddToNamespace(TCIMContext)
{
    fNamespace.AddClass(shared_from_this());
}

void TPEGASUSClass::RemoveFromNamespace(TCIMContext)
{
    LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSClass::RemoveFromNamespace failed: ", fName, ": not supported");
}

void TPEGASUSClass::ModifyClass(boost::shared_ptr<ICIMClass>, TCIMContext)
{
    LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSClass::ModifyClass failed: ", fName, ": not supported");
}

std::string TPEGASUSClass::GetName(TCIMContext) const
{
    return fName;
}

boost::shared_ptr<ICIMNamespace> TPEGASUSClass::GetNamespace(TCIMContext) const
{
    return fNamespace.Get();
}

void TPEGASUSClass::SetPropertyValue(const std::string& name, TCIMValue, TCIMContext)
{
    LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSClass::SetPropertyValue failed: ", fName, ".", name,
                ": not supported");
}

bool TPEGASUSClass::operator==(const ICIMClass& other) const
{
    return fName == other.GetName({});
}

bool TPEGASUSClass::operator<(const ICIMClass& other) const
{
    return fName < other.GetName({});
}

// The server alone defines a class: an assignment by the host is ignored.
ICIMClass& TPEGASUSClass::operator=(const ICIMClass&)
{
    return *this;
}

bool TPEGASUSClass::hasCollected() const
{
    return false;
}

void TPEGASUSClass::SetCollected() {}

// The links to the namespace and the superclass are weak and may stay.
void TPEGASUSClass::ReleaseLinks()
{
    fProvider.reset();
    fInstanceOwners.clear();
    fInstances.clear();
    fChildClasses.clear();
}

// Declarations serve this slot (TQualifiedElement); hosts expect a class to refuse it.
boost::shared_ptr<ICIMQualifier> TPEGASUSClass::GetQualifier(const std::string& name, bool&, TCIMContext) const
{
    LogAndThrow(TVRXStatusCode::kOperationNotSupported, "TPEGASUSClass::GetQualifier failed: ", name, " of ", fName,
                ": not supported with a found flag");
}

} // namespace NKOLVRX20
