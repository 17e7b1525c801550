// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectReps.h"

namespace Pegasus {

template class RepPointer<CIMParamValueRep>;

namespace {

const String& notEmpty(const String& name)
{
    if (name.size() == 0) {
        throw UninitializedObjectException();
    }
    return name;
}

RepPointer<CIMParamValueRep> make(const String& name, const CIMValue& value, bool isTyped)
{
    RepPointer<CIMParamValueRep> rep(new CIMParamValueRep());
    rep->fName = notEmpty(name);
    rep->fValue = value;
    rep->fIsTyped = isTyped;
    return rep;
}

} // namespace

CIMParamValue::CIMParamValue(String parameterName, CIMValue value, Boolean isTyped)
    : fRep(make(parameterName, value, isTyped))
{
}

String CIMParamValue::getParameterName() const
{
    return fRep.checked().fName;
}

CIMValue CIMParamValue::getValue() const
{
    return fRep.checked().fValue;
}

Boolean CIMParamValue::isTyped() const
{
    return fRep.checked().fIsTyped;
}

void CIMParamValue::setParameterName(String& parameterName)
{
    fRep.checked().fName = notEmpty(parameterName);
}

void CIMParamValue::setValue(CIMValue& value)
{
    fRep.checked().fValue = value;
}

void CIMParamValue::setIsTyped(Boolean isTyped)
{
    fRep.checked().fIsTyped = isTyped;
}

CIMParamValue CIMParamValue::clone() const
{
    const CIMParamValueRep& rep = fRep.checked();
    return CIMParamValue(rep.fName, rep.fValue, rep.fIsTyped);
}

Boolean CIMParamValue::isUninitialized() const
{
    return !fRep;
}

} // namespace Pegasus
