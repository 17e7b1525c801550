// The class itself: its name, its place, its instances, and what is not served.
#include "src/schema/TPEGASUSClass.h"

#include "src/instance/TPEGASUSInstance.h"
#include "src/namespace/TPEGASUSNamespace.h"

#include <host/ICIMInstance.h>
#include <host/TVRXException.h>

#include <utility>

namespace NKOLVRX20 {

TPEGASUSClass::TPEGASUSClass(const boost::shared_ptr<TPEGASUSNamespace>& ns, std::string name,
                             const boost::shared_ptr<TPEGASUSClass>&)
    : fNamespace(ns), fName(std::move(name))
{
}

TPEGASUSClass::~TPEGASUSClass() = default;

void TPEGASUSClass::Validate(TCIMContext) {}

void TPEGASUSClass::AddToNamespace(TCIMContext)
{
    LockNamespace()->AddClass(shared_from_this());
}

void TPEGASUSClass::RemoveFromNamespace(TCIMContext)
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

void TPEGASUSClass::ModifyClass(boost::shared_ptr<ICIMClass>, TCIMContext)
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

std::string TPEGASUSClass::GetName(TCIMContext) const
{
    return fName;
}

boost::shared_ptr<ICIMNamespace> TPEGASUSClass::GetNamespace(TCIMContext) const
{
    return fNamespace.lock();
}

boost::shared_ptr<TPEGASUSNamespace> TPEGASUSClass::LockNamespace() const
{
    return boost::shared_ptr<TPEGASUSNamespace>(fNamespace);
}

void TPEGASUSClass::SetPropertyValue(const std::string&, TCIMValue, TCIMContext)
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

boost::shared_ptr<ICIMInstance> TPEGASUSClass::AllocateInstance(TCIMContext context)
{
    return boost::make_shared<TPEGASUSInstance>(shared_from_this(), context);
}

bool TPEGASUSClass::operator==(const ICIMClass& other) const
{
    return fName == other.GetName({});
}

bool TPEGASUSClass::operator<(const ICIMClass& other) const
{
    return fName < other.GetName({});
}

ICIMClass& TPEGASUSClass::operator=(const ICIMClass&)
{
    return *this;
}

bool TPEGASUSClass::hasCollected() const
{
    return false;
}

void TPEGASUSClass::SetCollected() {}

void TPEGASUSClass::AddInstance(boost::shared_ptr<ICIMInstance> instance)
{
    const auto owner = instance->GetClass({});
    if (owner && owner.get() != this) {
        fInstanceOwners.insert(owner);
    }
    fInstances.emplace(instance->GetReference({}).GetPath(), instance);
}

// By identity: the path may have changed since the instance was added.
void TPEGASUSClass::RemoveInstance(boost::shared_ptr<ICIMInstance> instance)
{
    for (auto entry = fInstances.begin(); entry != fInstances.end();) {
        entry = entry->second == instance ? fInstances.erase(entry) : std::next(entry);
    }
}

// The containers are emptied first: two classes may hold each other's instances.
void TPEGASUSClass::ClearInstances()
{
    const auto owners = std::exchange(fInstanceOwners, {});
    const auto instances = std::exchange(fInstances, {});
    for (const auto& owner : owners) {
        owner->ClearInstances();
    }
    for (const auto& child : fChildClasses) {
        child->ClearInstances();
    }
}

void TPEGASUSClass::ReleaseLinks()
{
    fProvider.reset();
    fInstanceOwners.clear();
    fInstances.clear();
    fChildClasses.clear();
}

boost::shared_ptr<ICIMQualifier> TPEGASUSClass::GetQualifier(const std::string&, bool&, TCIMContext) const
{
    throw TVRXException(TVRXStatusCode::kOperationNotSupported);
}

} // namespace NKOLVRX20
