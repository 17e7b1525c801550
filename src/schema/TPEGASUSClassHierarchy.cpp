// SPDX-License-Identifier: MIT
// A class among its superclasses, subclasses and associations.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/schema/TPEGASUSClass.h"

#include <algorithm>

namespace NKOLVRX20 {

bool TPEGASUSClass::IsAssociation(TCIMContext) const
{
    return HasTrueQualifier(*this, "ASSOCIATION");
}

bool TPEGASUSClass::IsAbstract(TCIMContext) const
{
    return HasTrueQualifier(*this, "ABSTRACT");
}

bool TPEGASUSClass::IsRootClass(TCIMContext) const
{
    return fNamespace.IsConnected() && fNamespace.GetRootClass().get() == this;
}

boost::shared_ptr<ICIMClass> TPEGASUSClass::GetSuperClass(TCIMContext context) const
{
    if (!fNamespace.IsConnected() || fName == kRootClassName) {
        return nullptr;
    }
    std::string superName;
    try {
        Pegasus::CIMClient& client = fNamespace.ConnectedClient();
        // The client is shared, and an earlier call may have left it a timeout of minutes.
        client.setTimeout(kGetClassTimeoutMs);
        const Pegasus::CIMClass answer =
            client.getClass(fPegasusNsp, Pegasus::CIMName(fName.c_str()), true, true, false);
        superName = ToStdString(answer.getSuperClassName().getString());
    } catch (const Pegasus::Exception& exception) {
        LogFailure("TPEGASUSClass::GetSuperClass from Pegasus for: ", fName,
                   " returned exception: ", ToStdString(exception.getMessage()));
        throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
    }
    // A class of the same name in another server namespace would be a different class.
    context.emplace(kNspKey, fPegasusNspText);
    return fNamespace.GetClass(superName, context);
}

// The walk runs on a copy and keeps this class alive: the visitor may make the namespace fetch more classes, or drop
// it. The visitor is wrapped, so that a parent's walk sees that a child's walk was ended.
void TPEGASUSClass::EnumerateSubClasses(TClassVisitor visitor, bool deep, TCIMContext context) const
{
    const auto self = shared_from_this();
    bool goesOn = true;
    const TClassVisitor remembered = [&](boost::shared_ptr<ICIMClass> child) { return goesOn = visitor(child); };
    const auto children = fChildClasses;
    for (const auto& child : children) {
        try {
            remembered(child);
        } catch (const std::exception& exception) {
            LogFailure("TPEGASUSClass::EnumerateSubClasses : ", fName, "  ", exception.what());
            continue;
        }
        if (goesOn && deep) {
            child->EnumerateSubClasses(remembered, deep, context);
        }
        if (!goesOn) {
            return;
        }
    }
}

// Follows the weak links: a superclass that has been destroyed ends the chain.
bool TPEGASUSClass::IsSubclassOf(boost::shared_ptr<const ICIMClass> other, TCIMContext context) const
{
    if (!other) {
        return false;
    }
    const std::string wanted = other->GetName(context);
    if (fName == wanted) {
        return true;
    }
    for (auto ancestor = fSuperClass.lock(); ancestor; ancestor = ancestor->fSuperClass.lock()) {
        if (ancestor->fName == wanted) {
            return wanted != kRootClassName;
        }
    }
    return false;
}

void TPEGASUSClass::EnumerateAssociatedClasses(TClassVisitor, const std::string&, const std::string&,
                                               const std::string&, const std::string&, TCIMContext)
{
}

void TPEGASUSClass::EnumerateAssociationClasses(TClassVisitor, const std::string&, const std::string&, TCIMContext) {}

void TPEGASUSClass::AddChildClass(boost::shared_ptr<ICIMClass> child)
{
    if (!child) {
        LogAndThrow(TVRXStatusCode::kTypeMismatch, "TPEGASUSClass::AddChildClass failed: ", fName, ": null");
    }
    const auto hasName = [name = child->GetName({})](const auto& other) { return other->GetName({}) == name; };
    if (std::none_of(fChildClasses.begin(), fChildClasses.end(), hasName)) {
        fChildClasses.push_back(child);
    }
}

void TPEGASUSClass::LeaveSuperClass()
{
    if (const auto superClass = fSuperClass.lock()) {
        auto& siblings = superClass->fChildClasses;
        const auto isThis = [this](const auto& sibling) { return sibling.get() == this; };
        siblings.erase(std::remove_if(siblings.begin(), siblings.end(), isThis), siblings.end());
    }
}

void TPEGASUSClass::TakePlaceOf(TPEGASUSClass& replaced)
{
    fChildClasses = replaced.fChildClasses;
    for (const auto& child : fChildClasses) {
        if (const auto own = boost::dynamic_pointer_cast<TPEGASUSClass>(child)) {
            own->fSuperClass = shared_from_this(); // a weak link, which the replaced class would leave dangling
        }
    }
    replaced.LeaveSuperClass();
    if (const auto superClass = fSuperClass.lock()) {
        superClass->AddChildClass(shared_from_this());
    }
}

void TPEGASUSClass::RemoveChildClass(boost::shared_ptr<ICIMClass>) {}

void TPEGASUSClass::AddAssociationClass(boost::shared_ptr<ICIMClass>) {}

void TPEGASUSClass::RemoveAssociationClass(boost::shared_ptr<ICIMClass>) {}

} // namespace NKOLVRX20
