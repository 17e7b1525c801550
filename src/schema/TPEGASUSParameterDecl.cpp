// SPDX-License-Identifier: MIT
#include "src/schema/TPEGASUSParameterDecl.h"

#include "src/schema/TPEGASUSMethodDecl.h"

#include <utility>

namespace NKOLVRX20 {

TPEGASUSParameterDecl::TPEGASUSParameterDecl(const boost::shared_ptr<TPEGASUSMethodDecl>& owner, std::string name,
                                             TCIMValue::TCIMType type)
    : fOwner(owner), fName(std::move(name)), fType(type)
{
}

void TPEGASUSParameterDecl::Validate(TCIMContext) {}

// The method owns its parameters and a parameter points back weakly, which avoids a circle of owning pointers. A
// host may hold a parameter for longer than its method: adding it throws then, and GetMethodDecl returns null.
void TPEGASUSParameterDecl::AddToMethod(TCIMContext)
{
    boost::shared_ptr<TPEGASUSMethodDecl>(fOwner)->AddParameterDecl(shared_from_this());
}

std::string TPEGASUSParameterDecl::GetName(TCIMContext) const
{
    return fName;
}

boost::shared_ptr<ICIMMethodDecl> TPEGASUSParameterDecl::GetMethodDecl(TCIMContext) const
{
    return fOwner.lock();
}

TCIMValue::TCIMType TPEGASUSParameterDecl::GetType(TCIMContext) const
{
    return fType;
}

bool TPEGASUSParameterDecl::IsArray(TCIMContext) const
{
    return fType.IsArray();
}

bool TPEGASUSParameterDecl::operator==(const ICIMParameterDecl& other) const
{
    return fName == other.GetName({});
}

bool TPEGASUSParameterDecl::operator<(const ICIMParameterDecl& other) const
{
    return fName < other.GetName({});
}

ICIMParameterDecl& TPEGASUSParameterDecl::operator=(const ICIMParameterDecl&)
{
    return *this;
}

} // namespace NKOLVRX20
