// SPDX-License-Identifier: MIT
#include "host/inmem/InstanceValues.h"
#include "host/inmem/ObjectNames.h"

#include <host/ICIMClass.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/TInmemInstance.h>
#include <host/TVRXException.h>

#include <map>
#include <utility>

namespace NKOLVRX20 {
namespace {

std::string ClassNameOf(const ICIMInstance& instance)
{
    const auto instanceClass = instance.GetClass(TCIMContext());
    return instanceClass ? instanceClass->GetName(TCIMContext()) : std::string();
}

// Returns: the property's value in the type that the class declares for it, so that a key has one text however it was
// set. A value that fails to convert stays as it is.
TCIMValue KeyValue(const ICIMProperty& property)
{
    TCIMValue value = property.GetValue(TCIMContext());
    const auto declaration = property.GetDeclaration(TCIMContext());
    const auto type = declaration ? declaration->GetType(TCIMContext()) : value.GetType();
    if (value.IsNull() || value.GetType() == type) {
        return value;
    }
    try {
        TCIMValue declared(type, 0);
        declared.Set(value.ToString(10));
        return declared;
    } catch (const TVRXException&) {
        return value;
    }
}

std::map<std::string, TCIMValue> ValuesOf(const ICIMInstance& instance)
{
    std::map<std::string, TCIMValue> values;
    instance.EnumerateProperties(
        [&values](boost::shared_ptr<ICIMProperty> property) {
            values[NormalizedName(TInmemProperty::NameOf(*property))] = property->GetValue(TCIMContext());
            return true;
        },
        TCIMContext());
    return values;
}

} // namespace

TInmemInstance::TInmemInstance(boost::shared_ptr<ICIMClass> instanceClass, TCIMContext)
    : fClass(std::move(instanceClass)), fValues(std::make_unique<TInmemValues>(fClass.get()))
{
}

TInmemInstance::~TInmemInstance() = default;

// Every value is accepted, whatever the declarations say.
void TInmemInstance::Validate(TCIMContext) {}

void TInmemInstance::AddToNamespace(TCIMContext)
{
    if (fClass) {
        fClass->AddInstance(shared_from_this());
    }
}

void TInmemInstance::ModifyInstance(boost::shared_ptr<ICIMInstance> newValues, TCIMContext context)
{
    for (const auto& value : ValuesOf(*newValues)) {
        SetPropertyValue(value.first, value.second, context);
    }
}

void TInmemInstance::Delete(TCIMContext)
{
    if (fClass) {
        fClass->RemoveInstance(shared_from_this());
    }
}

TCIMReference TInmemInstance::GetReference(TCIMContext context) const
{
    if (!fClass) {
        return TCIMReference();
    }
    std::vector<TKeyBinding> keys;
    fClass->EnumerateKeyNames(
        [&](const std::string* name) {
            if (const auto property = fValues->Find(*name)) {
                keys.emplace_back(*name, KeyValue(*property));
            }
            return true;
        },
        context);
    TCIMReference reference(fClass->GetNamespace(context), TCIMContext(keys.begin(), keys.end()));
    reference.SetPath(ObjectPathText(fClass->GetName(context), keys));
    return reference;
}

boost::shared_ptr<ICIMClass> TInmemInstance::GetClass(TCIMContext) const
{
    return fClass;
}

std::string TInmemInstance::GetPegasusNSPStr() const
{
    return "";
}

void TInmemInstance::EnumerateAssociatedInstances(TInstanceVisitor, const std::string&, const std::string&,
                                                  const std::string&, const std::string&, TCIMContext)
{
}

void TInmemInstance::EnumerateAssociationInstances(TInstanceVisitor, const std::string&, const std::string&,
                                                   TCIMContext)
{
}

boost::shared_ptr<ICIMProperty> TInmemInstance::GetProperty(const std::string& name, TCIMContext) const
{
    auto property = fValues->Find(name);
    if (!property) {
        throw TVRXException(TVRXStatusCode::kUnknownProperty);
    }
    return property;
}

void TInmemInstance::SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context)
{
    fValues->Set(name, std::move(value), fClass, context);
}

void TInmemInstance::EnumerateProperties(TPropertyVisitor visitor, TCIMContext) const
{
    fValues->Visit(visitor);
}

TCIMValue TInmemInstance::InvokeMethod(const std::string&, TCIMContext&, TCIMContext)
{
    throw TVRXException(TVRXStatusCode::kNotSupported);
}

bool TInmemInstance::operator==(const ICIMInstance& other) const
{
    return ClassNameOf(*this) == ClassNameOf(other) && ValuesOf(*this) == ValuesOf(other);
}

bool TInmemInstance::operator<(const ICIMInstance& other) const
{
    const std::string name = ClassNameOf(*this), otherName = ClassNameOf(other);
    return name != otherName ? name < otherName : ValuesOf(*this) < ValuesOf(other);
}

ICIMInstance& TInmemInstance::operator=(const ICIMInstance& other)
{
    if (this == &other) {
        return *this;
    }
    const boost::shared_ptr<ICIMClass> otherClass = other.GetClass(TCIMContext());
    auto values = std::make_unique<TInmemValues>(otherClass.get());
    for (const auto& value : ValuesOf(other)) {
        values->Set(value.first, TCIMValue(value.second), otherClass, TCIMContext());
    }
    fValues = std::move(values); // before the class, which the old values rely on
    fClass = otherClass;
    return *this;
}

} // namespace NKOLVRX20
