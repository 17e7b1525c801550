// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/KeyCodec.h"

#include "pegasus/cmpi/objects/ValueCodec.h"

#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/Exception.h>

#include <limits>

namespace Pegasus::cmpi {
namespace {

// An integer of either sign: the bits of an Uint64, or of a Sint64 when negative.
struct WideInteger
{
    bool isNegative;
    Uint64 bits;
};

template <typename T> CIMValue narrowed(WideInteger wide, CIMType type)
{
    using Limits = std::numeric_limits<T>;
    const bool fits = wide.isNegative ? Limits::is_signed && static_cast<Sint64>(wide.bits) >= Sint64{Limits::min()}
                                      : wide.bits <= static_cast<Uint64>(Limits::max());
    return fits ? CIMValue(static_cast<T>(wide.bits)) : CIMValue(type, false);
}

CIMValue integerOf(WideInteger wide, CIMType type)
{
    switch (type) {
    case CIMTYPE_UINT8:
        return narrowed<Uint8>(wide, type);
    case CIMTYPE_SINT8:
        return narrowed<Sint8>(wide, type);
    case CIMTYPE_UINT16:
        return narrowed<Uint16>(wide, type);
    case CIMTYPE_SINT16:
        return narrowed<Sint16>(wide, type);
    case CIMTYPE_UINT32:
        return narrowed<Uint32>(wide, type);
    case CIMTYPE_SINT32:
        return narrowed<Sint32>(wide, type);
    case CIMTYPE_UINT64:
        return narrowed<Uint64>(wide, type);
    case CIMTYPE_SINT64:
        return narrowed<Sint64>(wide, type);
    case CIMTYPE_CHAR16:
        return wide.isNegative || wide.bits > 0xFFFF ? CIMValue(type, false)
                                                     : CIMValue(Char16(static_cast<Uint16>(wide.bits)));
    default:
        return {type, false};
    }
}

template <typename T> WideInteger widened(const CIMValue& value)
{
    T narrow{};
    value.get(narrow);
    return {narrow < T{}, static_cast<Uint64>(narrow)};
}

bool readInteger(const CIMValue& value, WideInteger& wide)
{
    switch (value.getType()) {
    case CIMTYPE_UINT8:
        wide = widened<Uint8>(value);
        return true;
    case CIMTYPE_SINT8:
        wide = widened<Sint8>(value);
        return true;
    case CIMTYPE_UINT16:
        wide = widened<Uint16>(value);
        return true;
    case CIMTYPE_SINT16:
        wide = widened<Sint16>(value);
        return true;
    case CIMTYPE_UINT32:
        wide = widened<Uint32>(value);
        return true;
    case CIMTYPE_SINT32:
        wide = widened<Sint32>(value);
        return true;
    case CIMTYPE_UINT64:
        wide = widened<Uint64>(value);
        return true;
    case CIMTYPE_SINT64:
        wide = widened<Sint64>(value);
        return true;
    case CIMTYPE_CHAR16: {
        Char16 character;
        value.get(character);
        wide = {false, Uint16(character)};
        return true;
    }
    default:
        return false;
    }
}

// A string key may stand for a datetime or a reference: all three have the same form in a path.
CIMValue valueOfText(const String& text, CIMType type)
{
    try {
        if (type == CIMTYPE_DATETIME) {
            return CIMValue(CIMDateTime(text));
        }
        if (type == CIMTYPE_REFERENCE) {
            return CIMValue(CIMObjectPath(text));
        }
    } catch (const Exception&) {
        // the text is of another kind: the null below
    }
    return {type, false};
}

} // namespace

bool isInteger(CIMType type)
{
    return type >= CIMTYPE_UINT8 && type <= CIMTYPE_SINT64;
}

CIMValue convertKey(const CIMValue& value, CIMType type)
{
    if (value.isNull() || value.isArray()) {
        return {type, false};
    }
    if (value.getType() == type) {
        return value;
    }
    WideInteger wide{};
    if (readInteger(value, wide)) {
        return integerOf(wide, type);
    }
    if (value.getType() == CIMTYPE_STRING) {
        String text;
        value.get(text);
        return valueOfText(text, type);
    }
    return {type, false};
}

CMPIData encodeKey(Broker& broker, const CIMValue& value)
{
    CMPIData data{};
    WideInteger wide{};
    if (!value.isNull() && readInteger(value, wide)) {
        data.type = CMPI_keyInteger;
        data.value.uint64 = wide.bits;
    } else {
        data = encodeValue(broker, value);
    }
    data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
    return data;
}

} // namespace Pegasus::cmpi
