#include "pegasus/cmpi/objects/ArrayElements.h"

#include "pegasus/cmpi/objects/TableFunction.h"

#include <Pegasus/Common/CIMDateTime.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMObjectPath.h>

namespace Pegasus::cmpi {
namespace {

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
template <typename Visitor> auto visitType(CIMType type, Visitor&& visit)
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
