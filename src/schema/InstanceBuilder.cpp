// SPDX-License-Identifier: MIT
#include "src/schema/InstanceBuilder.h"

#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/Names.h"
#include "src/instance/TPEGASUSInstance.h"
#include "src/instance/ValueConversion.h"

#include <host/ICIMProperty.h>
#include <host/TCIMValue.h>

#include <algorithm>
#include <optional>
#include <utility>

namespace NKOLVRX20 {

namespace {

constexpr char kInstanceIdName[] = "InstanceID";
constexpr char kSlotClass[] = "OMC_ProcessorSlot";
constexpr char kSlotNumber[] = "Number";

// Returns: the text after the first character of the first match; nullopt when the text lacks it.
std::optional<std::string> TextAfter(const std::string& text, const std::string& wanted)
{
    const auto match = text.find(wanted);
    return match == std::string::npos ? std::nullopt : std::make_optional(text.substr(match + 1));
}

// Reads the class that a key reference names out of the path of the instance that holds it:
// Holder.Property="ns:Class.Key=...".
// Returns: nullopt when the path has another shape.
std::optional<std::string> ReferencedClassName(const std::string& path, const std::string& property)
{
    const auto fromProperty = TextAfter(path, property);
    const auto fromClass = fromProperty ? TextAfter(*fromProperty, ":") : std::nullopt;
    const auto dot = fromClass ? fromClass->find('.') : std::string::npos;
    return dot == std::string::npos ? std::nullopt : std::make_optional(fromClass->substr(0, dot));
}

// Returns: the name as the log gives it: normalised, or in the server's spelling where that is an invalid name.
std::string LoggedName(const Pegasus::CIMConstProperty& property)
{
    const std::string name = ToStdString(property.getName().getString());
    const std::string normalized = LowerCase(name);
    return IsCimName(normalized) ? normalized : name;
}

// Servers disagree on the width of a slot's number; the host knows it as 16 bits.
void Narrow(TPEGASUSInstance& target, const std::string& name)
{
    const int number = target.GetProperty(name, {})->GetValue({});
    target.SetPropertyValue(name, static_cast<unsigned short>(number), {});
}

} // namespace

TInstanceBuilder::TInstanceBuilder(TPEGASUSClass& instanceClass, std::string operation)
    : fClass(instanceClass), fOperation(std::move(operation))
{
}

// Throws: TVRXException 25, after a log line, for an invalid name.
TInstanceBuilder::TMember& TInstanceBuilder::MemberAt(Pegasus::Uint32 place, const Pegasus::String& served)
{
    if (place < fMembers.size() && IsSameText(fMembers[place].fServed, served)) {
        return fMembers[place];
    }
    TMember member;
    member.fServed = served;
    member.fServerName = ToStdString(served);
    member.fKey = NormalizedName(member.fServerName);
    member.fIsInstanceId = member.fServerName.find(kInstanceIdName) != std::string::npos;
    member.fIsSlotNumber = member.fServerName == kSlotNumber && fClass.GetName({}) == kSlotClass;
    fMembers.resize(std::max<std::size_t>(fMembers.size(), place + 1));
    return fMembers[place] = std::move(member);
}

boost::shared_ptr<ICIMClass> TInstanceBuilder::ReferencedClass(const Pegasus::CIMInstance& source,
                                                               const std::string& property) const
{
    const auto name = ReferencedClassName(ToStdString(source.getPath().toString()), property);
    if (name && !IsCimName(*name)) {
        LogProgress("TPEGASUSClass::", fOperation, " keeps reference property ", property, " of ", fClass.GetName({}),
                    " without its class: \"", *name, "\" is not a class name");
        return nullptr;
    }
    return name ? fClass.GetOwningNamespace().GetClass(*name, {{kNspKey, fClass.GetPegasusNSPStr()}}) : nullptr;
}

// Throws: what ToHostValue throws.
TCIMValue TInstanceBuilder::Converted(const Pegasus::CIMValue& served, Pegasus::CIMType type, bool isArray,
                                      TMember& member) const
{
    if (member.fFirst.IsOf(served)) {
        return member.fFirst.Get();
    }
    TCIMValue value;
    ToHostValue(served, type, isArray, &fClass, value);
    if (!member.fFirst.IsKept()) {
        member.fFirst.Keep(served, type, value);
    }
    return value;
}

TCIMValue TInstanceBuilder::Value(const Pegasus::CIMInstance& source, TMember& member,
                                  const Pegasus::CIMConstProperty& property) const
{
    const Pegasus::CIMValue& served = property.getValue();
    const Pegasus::CIMType type = property.getType();
    const auto referenced = type == Pegasus::CIMTYPE_REFERENCE ? ReferencedClass(source, member.fServerName)
                                                               : boost::shared_ptr<ICIMClass>();
    TCIMValue value = served.isNull() ? TCIMValue() : Converted(served, type, property.isArray(), member);
    if (referenced) {
        value.SetReferencedClass(referenced);
    }
    if (member.fIsInstanceId && value.ToString(kDecimal).empty()) {
        value.Set("");
    }
    return value;
}

void TInstanceBuilder::Transfer(const Pegasus::CIMInstance& source, Pegasus::Uint32 place,
                                const Pegasus::CIMConstProperty& property, TPEGASUSInstance& target)
{
    TMember& member = MemberAt(place, property.getName().getString());
    target.SetPropertyValue(member.fKey, Value(source, member, property), {});
    if (member.fIsSlotNumber) {
        Narrow(target, member.fKey);
    }
}

boost::shared_ptr<TPEGASUSInstance> TInstanceBuilder::Build(const Pegasus::CIMInstance& source)
{
    auto target = boost::dynamic_pointer_cast<TPEGASUSInstance>(fClass.AllocateInstance({}));
    const Pegasus::Uint32 count = source.getPropertyCount();
    for (Pegasus::Uint32 place = 0; place < count; ++place) {
        const Pegasus::CIMConstProperty property = source.getProperty(place);
        try {
            Transfer(source, place, property, *target);
        } catch (...) { // one property must not cost the others
            LogProgress("4TPEGASUSClass::", fOperation, " - Unable to retrieve property: ", LoggedName(property));
        }
    }
    target->setPegNameSpace(fClass.GetPegasusNSP());
    target->setPegInstanceName(source.getPath());
    fBuilt = target;
    return target;
}

} // namespace NKOLVRX20
