// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ArrayObject.h"

#include "pegasus/cmpi/objects/DateTimeObject.h"
#include "pegasus/cmpi/objects/Habits.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <Pegasus/Common/CIMDateTime.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObjectPath.h>

#include <type_traits>
#include <utility>

namespace Pegasus::cmpi {
namespace {

// Keeps a provider's mistaken count from taking the host's memory.
constexpr CMPICount kMaxElements = 16U * 1024 * 1024;

CMPICount getSize(const CMPIArray* self, CMPIStatus* rc)
{
    return answer(rc, CMPICount{0},
                  [&] { return static_cast<CMPICount>(objectOf<ArrayObject>(self).elements().size()); });
}

CMPIType getSimpleType(const CMPIArray* self, CMPIStatus* rc)
{
    return answer(rc, CMPIType{CMPI_null}, [&] { return objectOf<ArrayObject>(self).namedType(); });
}

CMPIData getElementAt(const CMPIArray* self, CMPICount index, CMPIStatus* rc)
{
    return answer(rc, kNull, [&] { return objectOf<ArrayObject>(self).at(index); });
}

CMPIStatus setElementAt(const CMPIArray* self, CMPICount index, const CMPIValue* value, CMPIType type)
{
    return perform([&] { objectOf<ArrayObject>(self).set(index, value, type); });
}

// Returns: the CIM type of a CMPI type. Of a type that CIM lacks an array is made all the same, as on OpenPegasus; its
// elements stay null.
CIMType elementTypeOf(CMPIType type)
{
    try {
        return cimTypeOf(type);
    } catch (const CmpiError&) {
        return CIMTYPE_BOOLEAN;
    }
}

std::vector<CIMValue> nulls(CMPICount size, CMPIType type)
{
    if (size > kMaxElements) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, "newArray: more than 16777216 elements"};
    }
    return std::vector<CIMValue>(size, CIMValue(elementTypeOf(type), false));
}

template <typename T> T valueOf(const CIMValue& value)
{
    T result{};
    value.get(result);
    return result;
}

template <typename T> CIMValue typedArray(const std::vector<CIMValue>& elements)
{
    Array<T> array;
    array.reserveCapacity(static_cast<Uint32>(elements.size()));
    for (const CIMValue& element : elements) {
        if (std::is_same_v<T, CIMDateTime> && element.isNull()) {
            tolerate(Habit::kNullDateTimeElement);
        }
        array.append(element.isNull() ? T{} : valueOf<T>(element));
    }
    return CIMValue(array);
}

template <typename T> void appendElements(const CIMValue& array, std::vector<CIMValue>& elements)
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
template <typename Visitor> auto visitElementType(CIMType type, Visitor&& visit)
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
        throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
}

} // namespace

const CMPIArrayFT kArrayTable{kTableVersion,
                              releaseObject<ArrayObject, CMPIArray>,
                              cloneObject<ArrayObject, CMPIArray>,
                              getSize,
                              getSimpleType,
                              getElementAt,
                              setElementAt};

ArrayObject::ArrayObject(Broker& broker, CMPICount size, CMPIType type) : ArrayObject(broker, type, nulls(size, type))
{
}

ArrayObject::ArrayObject(Broker& broker, CMPIType type, std::vector<CIMValue> elements)
    : CMPIArray{nullptr, &kArrayTable}, fBroker(broker), fType(type), fElements(std::move(elements))
{
    hdl = this;
}

CMPIData ArrayObject::at(CMPICount index) const
{
    requireIndex(index);
    CMPIData data = encodeValue(fBroker, fElements[index]);
    data.type = elementType();
    if (data.type == CMPI_chars && data.state == CMPI_goodValue) {
        data.value.chars = static_cast<char*>(data.value.string->hdl);
    }
    return data;
}

void ArrayObject::set(CMPICount index, const CMPIValue* value, CMPIType type)
{
    requireIndex(index);
    if (value == nullptr) {
        tolerate(Habit::kNullElement);
    }
    if (type == CMPI_null) {
        value = nullptr;
        type = elementType();
    } else if (cimTypeOf(type) != cimTypeOf(fType) || (type & CMPI_ARRAY) != 0) {
        throw CmpiError{CMPI_RC_ERR_TYPE_MISMATCH, {}};
    }
    if (value != nullptr && type != elementType()) {
        if (elementType() != CMPI_string) {
            throw CmpiError{CMPI_RC_ERR_TYPE_MISMATCH, {}};
        }
        tolerate(Habit::kCharsInStringArray);
    }
    fElements[index] = decodeValue(value, type);
    if (value != nullptr && (type == CMPI_string || type == CMPI_dateTime)) {
        keepHandle(*value, type);
    }
}

// OpenPegasus keeps the handle itself; this notes on the element that an unused array holds it.
void ArrayObject::keepHandle(const CMPIValue& value, CMPIType type)
{
    if (!fUnused) {
        fUnused = std::make_shared<bool>(true);
    }
    if (type == CMPI_string && value.string != nullptr) {
        static_cast<StringObject&>(*value.string).holder = fUnused;
    } else if (type == CMPI_dateTime && value.dateTime != nullptr) {
        static_cast<DateTimeObject&>(*value.dateTime).holder = fUnused;
    }
}

void ArrayObject::markUsed() const
{
    if (fUnused) {
        *fUnused = false;
    }
}

ArrayObject::~ArrayObject()
{
    markUsed();
}

void ArrayObject::requireIndex(CMPICount index) const
{
    if (index >= fElements.size()) {
        throw CmpiError{CMPI_RC_ERR_NO_SUCH_PROPERTY, {}};
    }
}

CIMValue arrayOf(CIMType type, const std::vector<CIMValue>& elements)
{
    return visitElementType(type, [&](auto sample) { return typedArray<decltype(sample)>(elements); });
}

std::vector<CIMValue> elementsOf(const CIMValue& array)
{
    std::vector<CIMValue> elements;
    if (!array.isNull()) {
        visitElementType(array.getType(), [&](auto sample) { appendElements<decltype(sample)>(array, elements); });
    }
    return elements;
}

} // namespace Pegasus::cmpi
