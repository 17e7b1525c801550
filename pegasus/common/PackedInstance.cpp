// SPDX-License-Identifier: MIT
#include "pegasus/common/PackedInstance.h"

#include "pegasus/base/Text.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/common/ObjectReps.h"

namespace Pegasus {
namespace {

template <typename T> T takeElement(PackedReader& values)
{
    if constexpr (std::is_same_v<T, String>) {
        return base::fromUtf8(values.takeText());
    } else if constexpr (std::is_same_v<T, CIMDateTime>) {
        const std::string_view text = values.takeText();
        return text.empty() ? CIMDateTime() : CIMDateTime(base::fromUtf8(text));
    } else {
        return values.take<T>();
    }
}

template <typename T> CIMValue takeValue(PackedReader& values, bool isArray)
{
    if (!isArray) {
        return ValueAccess::make(takeElement<T>(values));
    }
    const auto size = values.take<Uint32>();
    Array<T> array;
    array.reserveCapacity(size);
    for (Uint32 i = 0; i < size; ++i) {
        array.append(takeElement<T>(values));
    }
    return ValueAccess::make(std::move(array));
}

// Returns: a property with its value, which may follow.
CIMProperty makeProperty(const CIMProperty& declared, PackedState state, PackedReader& values)
{
    auto* made = new CIMPropertyRep(ObjectAccess::rep(declared));
    CIMProperty property = ObjectAccess::wrap<CIMProperty>(made);
    if (state == PackedState::kNull) {
        made->fValue.setNullValue(made->fValue.getType(), made->fValue.isArray(), made->fArraySize);
    }
    if (state != PackedState::kValue) {
        return property;
    }
    visitType(made->fValue.getType(), [&](auto tag) {
        using T = typename decltype(tag)::Type;
        if constexpr (kIsPackable<T>) {
            made->fValue = takeValue<T>(values, made->fValue.isArray());
        }
    });
    return property;
}

} // namespace

void PackedInstance::unpack(CIMObjectPath& path, Array<CIMProperty>& properties) const
{
    PackedReader values(reinterpret_cast<const char*>(this + 1));
    Array<CIMKeyBinding> keys;
    for (const InstanceLayout::Key& key : fLayout->fKeys) {
        keys.append(CIMKeyBinding(key.fName, takeElement<String>(values), key.fType));
    }
    path = CIMObjectPath(String(), CIMNamespaceName(), fLayout->fClassName, keys);
    properties.reserveCapacity(static_cast<Uint32>(fLayout->fProperties.size()));
    for (const CIMProperty& declared : fLayout->fProperties) {
        const PackedState state = values.takeState();
        if (state != PackedState::kAbsent) {
            properties.append(makeProperty(declared, state, values));
        }
    }
}

} // namespace Pegasus
