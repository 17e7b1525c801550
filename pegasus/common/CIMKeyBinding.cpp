// SPDX-License-Identifier: MIT
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMObjectPathRep.h"

#include <Pegasus/Common/CIMValue.h>
#include <Pegasus/Common/Exception.h>

namespace Pegasus {

template class RepPointer<CIMKeyBindingRep>;

namespace {

using Type = CIMKeyBinding::Type;

RepPointer<CIMKeyBindingRep> make(const CIMName& name, const String& value, Type type)
{
    RepPointer<CIMKeyBindingRep> rep(new CIMKeyBindingRep());
    rep->fName = name;
    rep->fValue = value;
    rep->fType = type;
    return rep;
}

// Throws: TypeMismatchException for a value that cannot be a key.
Type typeOf(const CIMValue& value)
{
    if (value.isArray()) {
        throw TypeMismatchException();
    }
    switch (value.getType()) {
    case CIMTYPE_BOOLEAN:
        return CIMKeyBinding::BOOLEAN;
    case CIMTYPE_CHAR16:
    case CIMTYPE_STRING:
    case CIMTYPE_DATETIME:
        return CIMKeyBinding::STRING;
    case CIMTYPE_REFERENCE:
        return CIMKeyBinding::REFERENCE;
    case CIMTYPE_OBJECT:
    case CIMTYPE_INSTANCE:
        throw TypeMismatchException();
    default:
        return CIMKeyBinding::NUMERIC;
    }
}

Boolean sameNumber(const String& x, const String& y)
{
    const std::string text1 = base::utf8(x);
    const std::string text2 = base::utf8(y);
    const auto unsigned1 = base::parseUnsigned(text1);
    const auto unsigned2 = base::parseUnsigned(text2);
    if (unsigned1 && unsigned2) {
        return *unsigned1 == *unsigned2;
    }
    const auto signed1 = base::parseSigned(text1);
    const auto signed2 = base::parseSigned(text2);
    return signed1 && signed2 ? *signed1 == *signed2 : x == y;
}

Boolean samePath(const String& x, const String& y)
{
    try {
        return CIMObjectPath(x) == CIMObjectPath(y);
    } catch (const MalformedObjectNameException&) {
        return x == y;
    }
}

Boolean sameText(const String& x, const String& y, Type type)
{
    switch (type) {
    case CIMKeyBinding::NUMERIC:
        return sameNumber(x, y);
    case CIMKeyBinding::BOOLEAN:
        return String::equalNoCase(x, y);
    case CIMKeyBinding::REFERENCE:
        return samePath(x, y);
    default:
        return x == y;
    }
}

} // namespace

CIMKeyBinding::CIMKeyBinding(const CIMName& name, const String& value, Type type) : fRep(make(name, value, type)) {}

CIMKeyBinding::CIMKeyBinding(const CIMName& name, const CIMValue& value)
    : fRep(make(name, value.toString(), typeOf(value)))
{
}

const CIMName& CIMKeyBinding::getName() const
{
    return fRep.checked().fName;
}

void CIMKeyBinding::setName(const CIMName& name)
{
    writable(fRep).fName = name;
}

const String& CIMKeyBinding::getValue() const
{
    return fRep.checked().fValue;
}

void CIMKeyBinding::setValue(const String& value)
{
    writable(fRep).fValue = value;
}

CIMKeyBinding::Type CIMKeyBinding::getType() const
{
    return fRep.checked().fType;
}

void CIMKeyBinding::setType(Type type)
{
    writable(fRep).fType = type;
}

Boolean CIMKeyBinding::equal(CIMValue value)
{
    return getType() == typeOf(value) && sameText(getValue(), value.toString(), getType());
}

Boolean operator==(const CIMKeyBinding& x, const CIMKeyBinding& y)
{
    return x.getName().equal(y.getName()) && x.getType() == y.getType() &&
           sameText(x.getValue(), y.getValue(), x.getType());
}

} // namespace Pegasus
