// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ValueCodec.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/ArrayObject.h"
#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/DateTimeObject.h"
#include "pegasus/cmpi/objects/Habits.h"
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/objects/KeyCodec.h"
#include "pegasus/cmpi/objects/ObjectPathObject.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObject.h>

#include <array>
#include <cmath>

namespace Pegasus::cmpi {
namespace {

struct TypePair
{
    CIMType cim;
    CMPIType cmpi;
};

constexpr std::array kTypes{
    TypePair{CIMTYPE_BOOLEAN, CMPI_boolean}, TypePair{CIMTYPE_UINT8, CMPI_uint8},
    TypePair{CIMTYPE_SINT8, CMPI_sint8},     TypePair{CIMTYPE_UINT16, CMPI_uint16},
    TypePair{CIMTYPE_SINT16, CMPI_sint16},   TypePair{CIMTYPE_UINT32, CMPI_uint32},
    TypePair{CIMTYPE_SINT32, CMPI_sint32},   TypePair{CIMTYPE_UINT64, CMPI_uint64},
    TypePair{CIMTYPE_SINT64, CMPI_sint64},   TypePair{CIMTYPE_REAL32, CMPI_real32},
    TypePair{CIMTYPE_REAL64, CMPI_real64},   TypePair{CIMTYPE_CHAR16, CMPI_char16},
    TypePair{CIMTYPE_STRING, CMPI_string},   TypePair{CIMTYPE_DATETIME, CMPI_dateTime},
    TypePair{CIMTYPE_REFERENCE, CMPI_ref},   TypePair{CIMTYPE_INSTANCE, CMPI_instance},
    TypePair{CIMTYPE_OBJECT, CMPI_instance}, TypePair{CIMTYPE_STRING, CMPI_chars},
    TypePair{CIMTYPE_STRING, CMPI_charsptr},
};

// The element of an array that was made with another type than it is passed with.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE for a value that does not fit, and for other types than integers.
CIMValue convertInteger(const CIMValue& element, CIMType wanted)
{
    if (isInteger(wanted) && isInteger(element.getType())) {
        CIMValue converted = convertKey(element, wanted);
        if (!converted.isNull()) {
            return converted;
        }
    }
    throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, "an element of the array does not fit the array's new type"};
}

template <typename Object, typename Face> CIMValue decodeObject(const CMPIValue* value, CIMType type)
{
    const Face* face = readValue<const Face*>(value);
    return face == nullptr ? CIMValue(type, false) : CIMValue(objectOf<Object>(face).value());
}

CIMValue decodeChars(const char* text)
{
    return text == nullptr ? CIMValue(CIMTYPE_STRING, false) : CIMValue(decodeText(text));
}

CIMValue decodeString(const CMPIString* string)
{
    return decodeChars(string == nullptr ? nullptr : static_cast<const char*>(string->hdl));
}

template <typename Real> CIMValue decodeReal(Real value)
{
    if (value != 0 && !std::isnormal(value)) {
        tolerate(Habit::kRealNotNormal);
    }
    return CIMValue(value);
}

CIMValue decodeChar16(CMPIChar16 value)
{
    if (value >= 0xD800 && value <= 0xDFFF) {
        tolerate(Habit::kHalfSurrogate);
    }
    return CIMValue(Char16(value));
}

CIMValue decodeArray(const CMPIArray* array, CMPIType type)
{
    if (array == nullptr) {
        return {cimTypeOf(type), true};
    }
    const ArrayObject& object = objectOf<ArrayObject>(array);
    object.markUsed();
    const CIMType wanted = cimTypeOf(type);
    if (cimTypeOf(object.elementType()) == wanted) {
        return arrayOf(wanted, object.elements());
    }
    std::vector<CIMValue> converted;
    for (const CIMValue& element : object.elements()) {
        converted.push_back(element.isNull() ? CIMValue(wanted, false) : convertInteger(element, wanted));
    }
    return arrayOf(wanted, converted);
}

CIMValue decodeScalar(const CMPIValue* value, CMPIType type)
{
    switch (type) {
    case CMPI_boolean:
        return CIMValue(Boolean{readValue<CMPIBoolean>(value) != 0});
    case CMPI_char16:
        return decodeChar16(readValue<CMPIChar16>(value));
    case CMPI_uint8:
        return CIMValue(readValue<Uint8>(value));
    case CMPI_uint16:
        return CIMValue(readValue<Uint16>(value));
    case CMPI_uint32:
        return CIMValue(readValue<Uint32>(value));
    case CMPI_uint64:
        return CIMValue(readValue<Uint64>(value));
    case CMPI_sint8:
        return CIMValue(readValue<Sint8>(value));
    case CMPI_sint16:
        return CIMValue(readValue<Sint16>(value));
    case CMPI_sint32:
        return CIMValue(readValue<Sint32>(value));
    case CMPI_sint64:
        return CIMValue(readValue<Sint64>(value));
    case CMPI_real32:
        return decodeReal(readValue<Real32>(value));
    case CMPI_real64:
        return decodeReal(readValue<Real64>(value));
    case CMPI_string:
        return decodeString(readValue<const CMPIString*>(value));
    case CMPI_chars:
        return decodeChars(reinterpret_cast<const char*>(value));
    case CMPI_charsptr:
        return decodeChars(readValue<const char*>(value));
    case CMPI_dateTime:
        return decodeObject<DateTimeObject, CMPIDateTime>(value, CIMTYPE_DATETIME);
    case CMPI_ref:
        return decodeObject<ObjectPathObject, CMPIObjectPath>(value, CIMTYPE_REFERENCE);
    case CMPI_instance:
        return decodeObject<InstanceObject, CMPIInstance>(value, CIMTYPE_INSTANCE);
    default:
        throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
}

template <typename T> T valueOf(const CIMValue& value)
{
    T result{};
    value.get(result);
    return result;
}

template <typename T> CMPIData plainData(CMPIType type, T value)
{
    CMPIData data{type, CMPI_goodValue, {}};
    std::memcpy(&data.value, &value, sizeof(T)); // NOLINT(bugprone-sizeof-expression): pointers are meant too
    return data;
}

CMPIData encodeScalar(Broker& broker, const CIMValue& value)
{
    Frame& frame = Frame::current();
    switch (value.getType()) {
    case CIMTYPE_BOOLEAN:
        return plainData<CMPIBoolean>(CMPI_boolean, valueOf<Boolean>(value) ? 1 : 0);
    case CIMTYPE_UINT8:
        return plainData<Uint8>(CMPI_uint8, valueOf<Uint8>(value));
    case CIMTYPE_SINT8:
        return plainData<Sint8>(CMPI_sint8, valueOf<Sint8>(value));
    case CIMTYPE_UINT16:
        return plainData<Uint16>(CMPI_uint16, valueOf<Uint16>(value));
    case CIMTYPE_SINT16:
        return plainData<Sint16>(CMPI_sint16, valueOf<Sint16>(value));
    case CIMTYPE_UINT32:
        return plainData<Uint32>(CMPI_uint32, valueOf<Uint32>(value));
    case CIMTYPE_SINT32:
        return plainData<Sint32>(CMPI_sint32, valueOf<Sint32>(value));
    case CIMTYPE_UINT64:
        return plainData<Uint64>(CMPI_uint64, valueOf<Uint64>(value));
    case CIMTYPE_SINT64:
        return plainData<Sint64>(CMPI_sint64, valueOf<Sint64>(value));
    case CIMTYPE_REAL32:
        return plainData<Real32>(CMPI_real32, valueOf<Real32>(value));
    case CIMTYPE_REAL64:
        return plainData<Real64>(CMPI_real64, valueOf<Real64>(value));
    case CIMTYPE_CHAR16:
        return plainData<CMPIChar16>(CMPI_char16, valueOf<Char16>(value));
    case CIMTYPE_STRING:
        return plainData<CMPIString*>(CMPI_string, frame.make<StringObject>(base::utf8(valueOf<String>(value))));
    case CIMTYPE_DATETIME:
        return plainData<CMPIDateTime*>(CMPI_dateTime, frame.make<DateTimeObject>(valueOf<CIMDateTime>(value)));
    case CIMTYPE_REFERENCE:
        return plainData<CMPIObjectPath*>(CMPI_ref,
                                          frame.make<ObjectPathObject>(broker, valueOf<CIMObjectPath>(value)));
    case CIMTYPE_INSTANCE:
        return plainData<CMPIInstance*>(CMPI_instance, frame.make<InstanceObject>(broker, valueOf<CIMInstance>(value)));
    case CIMTYPE_OBJECT:
        return plainData<CMPIInstance*>(CMPI_instance,
                                        frame.make<InstanceObject>(broker, CIMInstance(valueOf<CIMObject>(value))));
    default:
        throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
}

CMPIData encodeArray(Broker& broker, const CIMValue& value)
{
    const CMPIType type = cmpiTypeOf(value.getType(), true);
    const CMPIType element = cmpiTypeOf(value.getType(), false);
    auto* array = Frame::current().make<ArrayObject>(broker, element, elementsOf(value));
    return plainData<CMPIArray*>(type, array);
}

} // namespace

CMPIType cmpiTypeOf(CIMType type, bool isArray)
{
    for (const TypePair& pair : kTypes) {
        if (pair.cim == type) {
            return static_cast<CMPIType>(isArray ? pair.cmpi | CMPI_ARRAY : pair.cmpi);
        }
    }
    return CMPI_null;
}

CIMType cimTypeOf(CMPIType type)
{
    const auto simple = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    for (const TypePair& pair : kTypes) {
        if (pair.cmpi == simple) {
            return pair.cim;
        }
    }
    throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
}

String decodeText(std::string_view text)
{
    if (!base::isUtf8(text)) {
        tolerate(Habit::kTextNotUtf8);
    }
    return base::fromUtf8Repaired(text);
}

CIMValue decodeValue(const CMPIValue* value, CMPIType type)
{
    const bool isArray = (type & CMPI_ARRAY) != 0;
    if (value == nullptr) {
        return {cimTypeOf(type), isArray};
    }
    return isArray ? decodeArray(readValue<const CMPIArray*>(value), type) : decodeScalar(value, type);
}

CMPIData encodeValue(Broker& broker, const CIMValue& value)
{
    if (value.isNull()) {
        return {cmpiTypeOf(value.getType(), value.isArray()), CMPI_nullValue, {}};
    }
    return value.isArray() ? encodeArray(broker, value) : encodeScalar(broker, value);
}

} // namespace Pegasus::cmpi
