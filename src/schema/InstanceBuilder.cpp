// SPDX-License-Identifier: MIT
#include "src/schema/InstanceBuilder.h"

#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/Names.h"
#include "src/instance/TPEGASUSInstance.h"
#include "src/instance/ValueConversion.h"
#include "src/schema/TPEGASUSClass.h"

#include <host/ICIMProperty.h>
#include <host/TCIMValue.h>

#include <optional>

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

boost::shared_ptr<ICIMClass> ReferencedClass(const TPEGASUSClass& holder, const Pegasus::CIMInstance& source,
                                             const std::string& property, const std::string& operation)
{
    const auto name = ReferencedClassName(ToStdString(source.getPath().toString()), property);
    if (name && !IsCimName(*name)) {
        LogProgress("TPEGASUSClass::", operation, " keeps reference property ", property, " of ", holder.GetName({}),
                    " without its class: \"", *name, "\" is not a class name");
        return nullptr;
    }
    return name ? holder.GetOwningNamespace().GetClass(*name, {{kNspKey, holder.GetPegasusNSPStr()}}) : nullptr;
}

// One property on its way from the server's instance to the host's.
class TPropertyTransfer
{
  public:
    TPropertyTransfer(TPEGASUSClass& instanceClass, const Pegasus::CIMInstance& source,
                      const Pegasus::CIMConstProperty& property, const std::string& operation)
        : fClass(instanceClass), fSource(source), fProperty(property), fOperation(operation),
          fServerName(ToStdString(property.getName().getString()))
    {
    }

    // Returns: the name as the log gives it: normalised, or in the server's spelling where that is an invalid name.
    const std::string& Name() const { return fName.empty() ? fServerName : fName; }

    void To(TPEGASUSInstance& target)
    {
        fName = NormalizedName(fServerName);
        target.SetPropertyValue(fName, Value(), {});
        if (fServerName == kSlotNumber && fClass.GetName({}) == kSlotClass) {
            Narrow(target);
        }
    }

  private:
    TCIMValue Value() const
    {
        TCIMValue value;
        const bool isReference = fProperty.getType() == Pegasus::CIMTYPE_REFERENCE;
        const auto referenced = isReference ? ReferencedClass(fClass, fSource, fServerName, fOperation) : nullptr;
        if (!fProperty.getValue().isNull()) {
            pegValToVRX(fName, fProperty.getValue(), fProperty.getType(), fProperty.isArray(), value,
                        fClass.shared_from_this());
        }
        if (referenced) {
            value.SetReferencedClass(referenced);
        }
        if (fServerName.find(kInstanceIdName) != std::string::npos && value.ToString(kDecimal).empty()) {
            value.Set("");
        }
        return value;
    }

    // Servers disagree on the width of a slot's number; the host knows it as 16 bits.
    void Narrow(TPEGASUSInstance& target) const
    {
        const int number = target.GetProperty(fName, {})->GetValue({});
        target.SetPropertyValue(fName, static_cast<unsigned short>(number), {});
    }

    TPEGASUSClass& fClass;
    const Pegasus::CIMInstance& fSource;
    const Pegasus::CIMConstProperty& fProperty;
    const std::string& fOperation; // the function's name, as the log has it
    const std::string fServerName;
    std::string fName;
};

} // namespace

boost::shared_ptr<TPEGASUSInstance> BuildInstance(TPEGASUSClass& instanceClass, const Pegasus::CIMInstance& source,
                                                  const std::string& operation)
{
    auto target = boost::dynamic_pointer_cast<TPEGASUSInstance>(instanceClass.AllocateInstance({}));
    for (Pegasus::Uint32 i = 0; i < source.getPropertyCount(); ++i) {
        const Pegasus::CIMConstProperty property = source.getProperty(i);
        TPropertyTransfer transfer(instanceClass, source, property, operation);
        try {
            transfer.To(*target);
        } catch (...) { // one property must not cost the others
            LogProgress("4TPEGASUSClass::", operation, " - Unable to retrieve property: ", transfer.Name());
        }
    }
    target->setPegNameSpace(instanceClass.GetPegasusNSP());
    target->setPegInstanceName(source.getPath());
    return target;
}

} // namespace NKOLVRX20
