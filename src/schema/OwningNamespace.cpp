// SPDX-License-Identifier: MIT
#include "src/schema/OwningNamespace.h"

// Upwards, on purpose: a class holds its namespace by the namespace's own type. This is the one source of the
// folder that includes it.
#include "src/namespace/TPEGASUSNamespace.h"

namespace NKOLVRX20 {

TOwningNamespace::TOwningNamespace(const boost::shared_ptr<TPEGASUSNamespace>& ns) : fNamespace(ns) {}

boost::shared_ptr<TPEGASUSNamespace> TOwningNamespace::Lock() const
{
    return boost::shared_ptr<TPEGASUSNamespace>(fNamespace);
}

boost::shared_ptr<ICIMNamespace> TOwningNamespace::Get() const
{
    return fNamespace.lock();
}

bool TOwningNamespace::IsConnected() const
{
    return Lock()->isConnected();
}

// The client belongs to the namespace, and the lock ends with this function. The namespace outlives the call all the
// same: the one thread that could drop it is here.
Pegasus::CIMClient& TOwningNamespace::ConnectedClient() const
{
    return Lock()->ConnectedClient();
}

boost::shared_ptr<ICIMClass> TOwningNamespace::GetClass(const std::string& name, const TCIMContext& context) const
{
    return Lock()->GetClass(name, context);
}

boost::shared_ptr<TPEGASUSClass> TOwningNamespace::GetRootClass() const
{
    return Lock()->GetRootClass();
}

void TOwningNamespace::AddClass(const boost::shared_ptr<TPEGASUSClass>& newClass) const
{
    Lock()->AddClass(newClass);
}

boost::shared_ptr<ICIMQualifierDecl> TOwningNamespace::AllocateQualifierDecl(const std::string& name,
                                                                             const TCIMValue& defaultValue,
                                                                             ICIMQualifierDecl::EScope scope,
                                                                             ICIMQualifierDecl::EFlavor flavor) const
{
    return Lock()->AllocateQualifierDecl(name, defaultValue, scope, flavor, {});
}

boost::shared_ptr<TPEGASUSQualifierDecl> TOwningNamespace::FindQualifierDecl(const std::string& name) const
{
    return Lock()->FindQualifierDecl(name);
}

void TOwningNamespace::AddQualifierDecl(const boost::shared_ptr<TPEGASUSQualifierDecl>& declaration) const
{
    Lock()->AddQualifierDecl(declaration);
}

TQualifierValues& TOwningNamespace::GetQualifierValues() const
{
    return Lock()->GetQualifierValues();
}

} // namespace NKOLVRX20
