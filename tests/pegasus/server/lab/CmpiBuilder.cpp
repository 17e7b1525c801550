// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/lab/CmpiBuilder.h"

#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/Exception.h>

#include <cstring>
#include <stdexcept>

namespace lab {

using namespace Pegasus;

namespace {

// Calls `visit` with a C++ object of the value's type.
template <typename Visitor> Argument visitType(CIMType type, Visitor&& visit)
{
    switch (type) {
    case CIMTYPE_BOOLEAN:
        return visit(Boolean{}, CMPI_boolean);
    case CIMTYPE_UINT8:
        return visit(Uint8{}, CMPI_uint8);
    case CIMTYPE_SINT8:
        return visit(Sint8{}, CMPI_sint8);
    case CIMTYPE_UINT16:
        return visit(Uint16{}, CMPI_uint16);
    case CIMTYPE_SINT16:
        return visit(Sint16{}, CMPI_sint16);
    case CIMTYPE_UINT32:
        return visit(Uint32{}, CMPI_uint32);
    case CIMTYPE_SINT32:
        return visit(Sint32{}, CMPI_sint32);
    case CIMTYPE_UINT64:
        return visit(Uint64{}, CMPI_uint64);
    case CIMTYPE_SINT64:
        return visit(Sint64{}, CMPI_sint64);
    case CIMTYPE_REAL32:
        return visit(Real32{}, CMPI_real32);
    case CIMTYPE_REAL64:
        return visit(Real64{}, CMPI_real64);
    case CIMTYPE_CHAR16:
        return visit(Char16{}, CMPI_char16);
    case CIMTYPE_STRING:
        return visit(String{}, CMPI_string);
    case CIMTYPE_DATETIME:
        return visit(CIMDateTime{}, CMPI_dateTime);
    case CIMTYPE_REFERENCE:
        return visit(CIMObjectPath{}, CMPI_ref);
    case CIMTYPE_INSTANCE:
        return visit(CIMInstance{}, CMPI_instance);
    case CIMTYPE_OBJECT:
        return visit(CIMObject{}, CMPI_instance);
    }
    throw std::logic_error("no such type");
}

// CMPI has its broker copy whatever a value points to, so one call's worth of text is enough.
template <typename T> void put(CMPIValue& value, T plain)
{
    std::memcpy(&value, &plain, sizeof plain);
}

const char* c_str(const CString& text)
{
    return static_cast<const char*>(text);
}

} // namespace

Argument CmpiBuilder::argument(const CIMValue& value) const
{
    if (value.isArray()) {
        return array(value);
    }
    return visitType(value.getType(), [&](auto content, CMPIType type) {
        using T = decltype(content);
        Argument result{type, value.isNull(), {}};
        if (result.isNull) {
            return result;
        }
        value.get(content);
        if constexpr (std::is_same_v<T, String>) {
            put(result.value, fBroker->eft->newString(fBroker, c_str(content.getCString()), nullptr));
        } else if constexpr (std::is_same_v<T, CIMDateTime>) {
            put(result.value,
                fBroker->eft->newDateTimeFromChars(fBroker, c_str(content.toString().getCString()), nullptr));
        } else if constexpr (std::is_same_v<T, CIMObjectPath>) {
            put(result.value, path(content));
        } else if constexpr (std::is_same_v<T, CIMInstance>) {
            put(result.value, embedded(content));
        } else if constexpr (std::is_same_v<T, CIMObject>) {
            put(result.value, embedded(CIMInstance(content)));
        } else if constexpr (std::is_same_v<T, Char16>) {
            put(result.value, static_cast<Uint16>(content));
        } else {
            put(result.value, content);
        }
        return result;
    });
}

Argument CmpiBuilder::array(const CIMValue& value) const
{
    return visitType(value.getType(), [&](auto sample, CMPIType type) {
        Argument result{static_cast<CMPIType>(type | CMPI_ARRAY), value.isNull(), {}};
        if (result.isNull) {
            return result;
        }
        Array<decltype(sample)> elements;
        value.get(elements);
        CMPIArray* made = fBroker->eft->newArray(fBroker, elements.size(), type, nullptr);
        for (Uint32 i = 0; i < elements.size(); ++i) {
            const Argument element = argument(CIMValue(elements[i]));
            made->ft->setElementAt(made, i, element.pointer(), element.type);
        }
        put(result.value, made);
        return result;
    });
}

CMPIObjectPath* CmpiBuilder::path(const CIMObjectPath& from, const CIMInstance* instance) const
{
    const CIMNamespaceName nameSpace = from.getNameSpace();
    CMPIObjectPath* made =
        fBroker->eft->newObjectPath(fBroker, nameSpace.isNull() ? "" : c_str(nameSpace.getString().getCString()),
                                    c_str(from.getClassName().getString().getCString()), nullptr);
    if (nameSpace.isNull()) {
        made->ft->setNameSpace(made, ""); // the broker gave it the request's
    }
    if (from.getHost().size() != 0) {
        made->ft->setHostname(made, c_str(from.getHost().getCString()));
    }
    const Array<CIMKeyBinding> keys = from.getKeyBindings();
    for (Uint32 i = 0; i < keys.size(); ++i) {
        const Uint32 at = instance == nullptr ? PEG_NOT_FOUND : instance->findProperty(keys[i].getName());
        CIMValue value(keys[i].getValue());
        if (at != PEG_NOT_FOUND) {
            value = instance->getProperty(at).getValue();
        } else if (keys[i].getType() == CIMKeyBinding::REFERENCE) {
            value = CIMValue(CIMObjectPath(keys[i].getValue()));
        } else if (keys[i].getType() == CIMKeyBinding::NUMERIC) {
            value = CIMValue(Sint64(std::atoll(c_str(keys[i].getValue().getCString()))));
        }
        const Argument key = argument(value);
        made->ft->addKey(made, c_str(keys[i].getName().getString().getCString()), key.pointer(), key.type);
    }
    return made;
}

CMPIInstance* CmpiBuilder::instance(const CIMInstance& from) const
{
    CIMObjectPath named = from.getPath();
    named.setNameSpace(CIMNamespaceName(String(fNameSpace)));
    CMPIInstance* made = fBroker->eft->newInstance(fBroker, path(named, &from), nullptr);
    setProperties(*made, from);
    return made;
}

CMPIInstance* CmpiBuilder::embedded(const CIMInstance& from) const
{
    const CIMObjectPath named(String(), CIMNamespaceName(String(fNameSpace)), from.getClassName());
    CMPIInstance* made = fBroker->eft->newInstance(fBroker, path(named), nullptr);
    setProperties(*made, from);
    return made;
}

void CmpiBuilder::setProperties(const CMPIInstance& to, const CIMInstance& from) const
{
    for (Uint32 i = 0; i < from.getPropertyCount(); ++i) {
        const CIMConstProperty property = from.getProperty(i);
        const Argument value = argument(property.getValue());
        to.ft->setProperty(&to, c_str(property.getName().getString().getCString()), value.pointer(), value.type);
    }
}

} // namespace lab
