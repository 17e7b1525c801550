// SPDX-License-Identifier: MIT
// The definitions of this namespace, classes and qualifier declarations: making them and entering them.
#include "src/common/CoreLog.h"
#include "src/common/Names.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/schema/TPEGASUSClass.h"
#include "src/schema/TPEGASUSQualifierDecl.h"

#include <host/TVRXException.h>

#include <boost/make_shared.hpp>

namespace NKOLVRX20 {

namespace {

// The line has severity 3; log readers rely on it.
[[noreturn]] void RefuseSecondDefinition(const char* kind, const std::string& name)
{
    LogProgress("TPEGASUSNamespace: ", kind, " ", name, " already defined");
    throw TVRXException(TVRXStatusCode::kAlreadyExists);
}

} // namespace

std::string TPEGASUSNamespace::NormalizeName(const std::string& name)
{
    return NormalizedName(name);
}

boost::shared_ptr<ICIMClass> TPEGASUSNamespace::AllocateClass(const std::string&, boost::shared_ptr<ICIMClass>,
                                                              TCIMContext)
{
    return nullptr;
}

boost::shared_ptr<ICIMClass> TPEGASUSNamespace::AllocateClass(const std::string& name, const std::string& cimNamespace,
                                                              const std::string& timeout,
                                                              boost::shared_ptr<ICIMClass> superClass, TCIMContext&)
{
    const auto parent = superClass ? boost::dynamic_pointer_cast<TPEGASUSClass>(superClass) : fRootClass;
    const auto allocated = boost::make_shared<TPEGASUSClass>(shared_from_this(), name, parent);
    allocated->Initialize(cimNamespace, timeout, parent);
    return allocated;
}

void TPEGASUSNamespace::AddClass(boost::shared_ptr<TPEGASUSClass> newClass)
{
    if (!newClass) {
        LogAndThrow(TVRXStatusCode::kTypeMismatch, "TPEGASUSNamespace::AddClass failed: null");
    }
    const std::string name = newClass->GetName({});
    boost::shared_ptr<TPEGASUSClass> present;
    try {
        present = fClasses.Find(name);
        if (present && !fAllowRedefinition) {
            RefuseSecondDefinition("class", name);
        }
    } catch (const TVRXException&) {
        if (present != newClass) {
            newClass->LeaveSuperClass(); // or the tree would show a class that the cache does not have
        }
        throw;
    }
    if (present && present != newClass) {
        newClass->TakePlaceOf(*present);
    }
    fClasses.Put(name, newClass);
}

void TPEGASUSNamespace::EnumerateRootClasses(TClassVisitor visitor, TCIMContext context)
{
    if (isConnected() && fRootClass) {
        fRootClass->EnumerateSubClasses(visitor, true, context);
    }
}

boost::shared_ptr<ICIMQualifierDecl> TPEGASUSNamespace::AllocateQualifierDecl(const std::string& name,
                                                                              TCIMValue defaultValue,
                                                                              ICIMQualifierDecl::EScope scope,
                                                                              ICIMQualifierDecl::EFlavor flavor,
                                                                              TCIMContext)
{
    return boost::make_shared<TPEGASUSQualifierDecl>(shared_from_this(), name, defaultValue, scope, flavor);
}

void TPEGASUSNamespace::AddQualifierDecl(boost::shared_ptr<TPEGASUSQualifierDecl> declaration)
{
    if (!declaration) {
        LogAndThrow(TVRXStatusCode::kTypeMismatch, "TPEGASUSNamespace::AddQualifierDecl failed: null");
    }
    const std::string name = declaration->GetName({});
    if (fQualifierDecls.Find(name) && !fAllowRedefinition) {
        RefuseSecondDefinition("qualifier", name);
    }
    fQualifierDecls.Put(name, declaration);
}

boost::shared_ptr<TPEGASUSQualifierDecl> TPEGASUSNamespace::FindQualifierDecl(const std::string& name) const
{
    return fQualifierDecls.Find(name);
}

// The upcall namespace answers for the host's whole model; this namespace's own declarations serve its classes.
boost::shared_ptr<ICIMQualifierDecl> TPEGASUSNamespace::GetQualifierDecl(const std::string& name, TCIMContext context)
{
    return GetUpcallNamespace()->GetQualifierDecl(name, context);
}

void TPEGASUSNamespace::EnumerateQualifierDecls(TQualifierDeclVisitor visitor, TCIMContext)
{
    fQualifierDecls.Visit(visitor);
}

} // namespace NKOLVRX20
