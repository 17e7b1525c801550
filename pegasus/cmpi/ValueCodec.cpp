#include "pegasus/cmpi/ValueCodec.h"

#include "pegasus/cmpi/ArrayObject.h"
#include "pegasus/cmpi/Broker.h"
#include "pegasus/cmpi/DateTimeObject.h"
#include "pegasus/cmpi/InstanceObject.h"
#include "pegasus/cmpi/ObjectPathObject.h"
#include "pegasus/cmpi/StringObject.h"
#include "pegasus/cmpi/Text.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObject.h>

#include <array>
#include <cstring>

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

// The value's memory may end right after the type's own bytes, and need not be aligned for more.
template <class T> T read(const CMPIValue* value)
{
    T result;
    std::memcpy(&result, value, sizeof(T)); // NOLINT(bugprone-sizeof-expression): pointers are meant too
    return result;
}

template <class Object, class Face> CIMValue decodeObject(const CMPIValue* value, CIMType type)
{
    const Face* face = read<const Face*>(value);
    return face == nullptr ? CIMValue(type, false) : CIMValue(objectOf<Object>(face).value());
}

CIMValue decodeString(const CMPIString* string)
{
    if (string == nullptr || string->hdl == nullptr) {
        return {CIMTYPE_STRING, false};
    }
    return fromUtf8(static_cast<const char*>(string->hdl));
}

CIMValue decodeText(const char* text)
{
    return text == nullptr ? CIMValue(CIMTYPE_STRING, false) : CIMValue(fromUtf8(text));
}

CIMValue decodeArray(const CMPIArray* array, CMPIType type)
{
    if (array == nullptr) {
        return {cimTypeOf(type), true};
    }
    const ArrayObject& object = objectOf<ArrayObject>(array);
    if (cimTypeOf(object.elementType()) != cimTypeOf(type)) {
        throw SlotError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
    return arrayOf(cimTypeOf(type), object.elements());
}

CIMValue decodeScalar(const CMPIValue* value, CMPIType type)
{
    switch (type) {
    case CMPI_boolean:
        return CIMValue(Boolean{read<CMPIBoolean>(value) != 0});
    case CMPI_char16:
        return CIMValue(Char16(read<CMPIChar16>(value)));
    case CMPI_uint8:
        return CIMValue(read<Uint8>(value));
    case CMPI_uint16:
        return CIMValue(read<Uint16>(value));
    case CMPI_uint32:
        return CIMValue(read<Uint32>(value));
    case CMPI_uint64:
        return CIMValue(read<Uint64>(value));
    case CMPI_sint8:
        return CIMValue(read<Sint8>(value));
    case CMPI_sint16:
        return CIMValue(read<Sint16>(value));
    case CMPI_sint32:
        return CIMValue(read<Sint32>(value));
    case CMPI_sint64:
        return CIMValue(read<Sint64>(value));
    case CMPI_real32:
        return CIMValue(read<Real32>(value));
    case CMPI_real64:
        return CIMValue(read<Real64>(value));
    case CMPI_string:
        return decodeString(read<const CMPIString*>(value));
    case CMPI_chars:
        return decodeText(reinterpret_cast<const char*>(value));
    case CMPI_charsptr:
        return decodeText(read<const char*>(value));
    case CMPI_dateTime:
        return decodeObject<DateTimeObject, CMPIDateTime>(value, CIMTYPE_DATETIME);
    case CMPI_ref:
        return decodeObject<ObjectPathObject, CMPIObjectPath>(value, CIMTYPE_REFERENCE);
    case CMPI_instance:
        return decodeObject<InstanceObject, CMPIInstance>(value, CIMTYPE_INSTANCE);
    default:
        throw SlotError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
}

template <class T> T valueOf(const CIMValue& value)
{
    T result{};
    value.get(result);
    return result;
}

template <class T> CIMValue typedArray(const std::vector<CIMValue>& elements)
{
    Array<T> array;
    array.reserveCapacity(static_cast<Uint32>(elements.size()));
    for (const CIMValue& element : elements) {
        array.append(element.isNull() ? T{} : valueOf<T>(element));
    }
    return CIMValue(array);
}

template <class T> void appendElements(const CIMValue& array, std::vector<CIMValue>& elements)
{
    Array<T> values;
    array.get(values);
    const T* const data = values.getData();
    elements.reserve(values.size());
    for (Uint32 i = 0; i < values.size(); ++i) {
        elements.emplace_back(data[i]);
    }
}

// Calls the template with the C++ type of each CIM type that an array may have.
template <class Visitor> auto visitType(CIMType type, Visitor&& visit)
{
    switch (type) {
    case CIMTYPE_BOOLEAN:
        return visit(Boolean{});
    case CIMTYPE_UINT8:
        return visit(Uint8{});
    case CIMTYPE_SINT8:
        return visit(Sint8{});
    case CIMTYPE_UINT16:
        return visit(Uint16{});
    case CIMTYPE_SINT16:
        return visit(Sint16{});
    case CIMTYPE_UINT32:
        return visit(Uint32{});
    case CIMTYPE_SINT32:
        return visit(Sint32{});
    case CIMTYPE_UINT64:
        return visit(Uint64{});
    case CIMTYPE_SINT64:
        return visit(Sint64{});
    case CIMTYPE_REAL32:
        return visit(Real32{});
    case CIMTYPE_REAL64:
        return visit(Real64{});
    case CIMTYPE_CHAR16:
        return visit(Char16{});
    case CIMTYPE_STRING:
        return visit(String{});
    case CIMTYPE_DATETIME:
        return visit(CIMDateTime{});
    case CIMTYPE_REFERENCE:
        return visit(CIMObjectPath{});
    case CIMTYPE_INSTANCE:
        return visit(CIMInstance{});
    default:
        throw SlotError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
}

template <class T> CMPIData plainData(CMPIType type, T value)
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
    case CIMTYPE_CHAR16:
        return plainData<CMPIChar16>(CMPI_char16, valueOf<Char16>(value));
    case CIMTYPE_STRING:
        return plainData<CMPIString*>(CMPI_string, frame.make<StringObject>(utf8(valueOf<String>(value))));
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
        return visitType(value.getType(), [&](auto sample) -> CMPIData {
            using T = decltype(sample);
            if constexpr (std::is_arithmetic_v<T>) {
                return plainData<T>(cmpiTypeOf(value.getType(), false), valueOf<T>(value));
            } else {
                throw SlotError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
            }
        });
    }
}

CMPIData encodeArray(Broker& broker, const CIMValue& value)
{
    const CMPIType type = cmpiTypeOf(value.getType(), true);
    auto* array = Frame::current().make<ArrayObject>(broker, type, elementsOf(value));
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
    throw SlotError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
}

CIMValue decodeValue(const CMPIValue* value, CMPIType type)
{
    const bool isArray = (type & CMPI_ARRAY) != 0;
    if (value == nullptr) {
        return {cimTypeOf(type), isArray};
    }
    return isArray ? decodeArray(read<const CMPIArray*>(value), type) : decodeScalar(value, type);
}

CMPIData encodeValue(Broker& broker, const CIMValue& value)
{
    if (value.isNull()) {
        return {cmpiTypeOf(value.getType(), value.isArray()), CMPI_nullValue, {}};
    }
    return value.isArray() ? encodeArray(broker, value) : encodeScalar(broker, value);
}

CIMValue arrayOf(CIMType type, const std::vector<CIMValue>& elements)
{
    return visitType(type, [&](auto sample) { return typedArray<decltype(sample)>(elements); });
}

std::vector<CIMValue> elementsOf(const CIMValue& array)
{
    std::vector<CIMValue> elements;
    if (!array.isNull()) {
        visitType(array.getType(), [&](auto sample) { appendElements<decltype(sample)>(array, elements); });
    }
    return elements;
}

} // namespace Pegasus::cmpi
