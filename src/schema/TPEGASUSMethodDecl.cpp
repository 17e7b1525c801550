// SPDX-License-Identifier: MIT
#include "src/schema/TPEGASUSMethodDecl.h"

#include "src/schema/TPEGASUSClass.h"
#include "src/schema/TPEGASUSParameterDecl.h"

#include <utility>

namespace NKOLVRX20 {

TPEGASUSMethodDecl::TPEGASUSMethodDecl(const boost::shared_ptr<TPEGASUSClass>& owner, std::string name,
                                       TCIMValue::TCIMType returnType)
    : fOwner(owner), fName(std::move(name)), fReturnType(returnType)
{
}

void TPEGASUSMethodDecl::Validate(TCIMContext) {}

// A class takes its methods from the server alone (TPEGASUSClass::EnterMethodDecl) and ignores one that a host adds.
// The conversion of the weak pointer throws when the class is gone, where lock would give null.
void TPEGASUSMethodDecl::AddToClass(TCIMContext)
{
    boost::shared_ptr<TPEGASUSClass>(fOwner)->AddMethodDecl(shared_from_this());
}

std::string TPEGASUSMethodDecl::GetName(TCIMContext) const
{
    return fName;
}

boost::shared_ptr<ICIMClass> TPEGASUSMethodDecl::GetClass(TCIMContext) const
{
    return fOwner.lock();
}

TCIMValue::TCIMType TPEGASUSMethodDecl::GetReturnType(TCIMContext) const
{
    return fReturnType;
}

// The parameter gets its qualifiers first; TPEGASUSParameterDecl::AddToMethod then enters it.
boost::shared_ptr<ICIMParameterDecl> TPEGASUSMethodDecl::AllocateParameterDecl(const std::string& name,
                                                                               TCIMValue::TCIMType type, TCIMContext)
{
    return boost::make_shared<TPEGASUSParameterDecl>(shared_from_this(), name, type);
}

boost::shared_ptr<ICIMParameterDecl> TPEGASUSMethodDecl::GetParameterDecl(const std::string& name, TCIMContext) const
{
    return fParameters.Find(name);
}

void TPEGASUSMethodDecl::EnumerateParameterDecls(TParameterDeclVisitor visitor, TCIMContext) const
{
    fParameters.Visit(visitor);
}

bool TPEGASUSMethodDecl::operator==(const ICIMMethodDecl& other) const
{
    return fName == other.GetName({});
}

bool TPEGASUSMethodDecl::operator<(const ICIMMethodDecl& other) const
{
    return fName < other.GetName({});
}

ICIMMethodDecl& TPEGASUSMethodDecl::operator=(const ICIMMethodDecl&)
{
    return *this;
}

void TPEGASUSMethodDecl::AddParameterDecl(const boost::shared_ptr<TPEGASUSParameterDecl>& declaration)
{
    fParameters.Put(declaration->GetName({}), declaration);
}

} // namespace NKOLVRX20
