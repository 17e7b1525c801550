// SPDX-License-Identifier: MIT
#include "tests/providers/TestBrokerValues.h"

#include "tests/providers/TestBrokerObjects.h"

#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>

namespace lnx {

namespace {

std::size_t sizeOf(CMPIType type)
{
    switch (type) {
    case CMPI_boolean:
    case CMPI_uint8:
    case CMPI_sint8:
        return 1;
    case CMPI_char16:
    case CMPI_uint16:
    case CMPI_sint16:
        return 2;
    case CMPI_uint32:
    case CMPI_sint32:
    case CMPI_real32:
        return 4;
    case CMPI_uint64:
    case CMPI_sint64:
    case CMPI_real64:
        return 8;
    default:
        return 0;
    }
}

std::string hexOf(const void* bytes, std::size_t size)
{
    std::string text;
    for (std::size_t i = 0; i < size; ++i) {
        char digits[3];
        std::snprintf(digits, sizeof digits, "%02x", static_cast<const unsigned char*>(bytes)[i]);
        text += digits;
    }
    return text;
}

std::string textOfArray(const ArrayObject& array)
{
    std::string text;
    for (const ArrayObject::Element& element : array.content) {
        text += element.kept != nullptr ? of<StringObject>(element.kept).text() : element.value.text;
        text += ',';
    }
    return text;
}

bool isKnown(CMPIType type)
{
    const CMPIType element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    return sizeOf(element) != 0 || element == CMPI_chars || element == CMPI_string || element == CMPI_dateTime ||
           element == CMPI_ref;
}

} // namespace

BrokerValue read(const CMPIValue* value, CMPIType type)
{
    BrokerValue result{type, false, {}, nullptr};
    if (value == nullptr) {
        result.isNull = true;
    } else if (type == CMPI_chars) {
        result.type = CMPI_string;
        result.text = reinterpret_cast<const char*>(value);
    } else if (type == CMPI_string) {
        result.text = of<StringObject>(value->string).text();
    } else if (type == CMPI_dateTime) {
        result.text = of<DateTimeObject>(value->dateTime).content;
    } else if (type == CMPI_ref) {
        result.path = std::make_shared<PathContent>(of<PathObject>(value->ref).content);
    } else if ((type & CMPI_ARRAY) != 0) {
        result.text = textOfArray(of<ArrayObject>(value->array));
    } else if (const std::size_t size = sizeOf(type); size != 0) {
        result.text = hexOf(value, size);
    } else {
        result.isNull = true;
    }
    return result;
}

CMPIStatus setValue(BrokerValues& values, const char* name, const CMPIValue* value, CMPIType type)
{
    if (name == nullptr || !isKnown(type)) {
        return refusal(name == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER : CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
    values[name] = read(value, type);
    return kOk;
}

CMPIData dataOf(TestBroker& owner, const BrokerValues& values, const char* name, CMPIStatus* rc, CMPIrc missing)
{
    const auto found = values.find(name);
    CMPIData data{CMPI_null, CMPI_nullValue | CMPI_notFound, {}};
    leave(rc, found == values.end() || owner.fails("a getter") ? missing : CMPI_RC_OK);
    if (found == values.end() || !owner.report().failed.empty()) {
        return data;
    }
    data.type = found->second.type;
    data.state = found->second.isNull ? CMPI_nullValue : CMPI_goodValue;
    if (found->second.path != nullptr) {
        data.value.ref = owner.make(std::make_unique<PathObject>(*found->second.path), false);
    } else if (data.type == CMPI_string && !found->second.isNull) {
        data.value.string = owner.make(std::make_unique<StringObject>(found->second.text), false);
    }
    return data;
}

} // namespace lnx
