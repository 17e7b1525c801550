#include "pegasus/cmpi/objects/ArrayObject.h"

#include "pegasus/cmpi/objects/StringObject.h"

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
    return answer(rc, CMPIType{CMPI_null}, [&] { return objectOf<ArrayObject>(self).elementType(); });
}

CMPIData getElementAt(const CMPIArray* self, CMPICount index, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] { return objectOf<ArrayObject>(self).at(index); });
}

CMPIStatus setElementAt(const CMPIArray* self, CMPICount index, const CMPIValue* value, CMPIType type)
{
    return perform([&] { objectOf<ArrayObject>(self).set(index, value, type); });
}

std::vector<CIMValue> nulls(CMPICount size, CMPIType type)
{
    if (size > kMaxElements) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, "newArray: more than 16777216 elements"};
    }
    return std::vector<CIMValue>(size, CIMValue(cimTypeOf(type), false));
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
    : CMPIArray{nullptr, &kArrayTable}, fBroker(broker), fType(static_cast<CMPIType>(type & ~CMPI_ARRAY)),
      fElements(std::move(elements))
{
    hdl = this;
}

CMPIData ArrayObject::at(CMPICount index) const
{
    requireIndex(index);
    CMPIData data = encodeValue(fBroker, fElements[index]);
    data.type = fType;
    if (fType == CMPI_chars && data.state == CMPI_goodValue) {
        data.value.chars = static_cast<char*>(data.value.string->hdl);
    }
    return data;
}

void ArrayObject::set(CMPICount index, const CMPIValue* value, CMPIType type)
{
    requireIndex(index);
    if (type == CMPI_null) {
        value = nullptr;
    } else if (cimTypeOf(type) != cimTypeOf(fType) || (type & CMPI_ARRAY) != 0) {
        throw CmpiError{CMPI_RC_ERR_TYPE_MISMATCH, {}};
    }
    fElements[index] = decodeValue(value, type == CMPI_null ? fType : type);
}

void ArrayObject::requireIndex(CMPICount index) const
{
    if (index >= fElements.size()) {
        throw CmpiError{CMPI_RC_ERR_NO_SUCH_PROPERTY, {}};
    }
}

} // namespace Pegasus::cmpi
