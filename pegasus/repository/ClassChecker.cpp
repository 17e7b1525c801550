// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/ClassRules.h"

namespace Pegasus::repository {

namespace {

const CIMName kAssociation("Association");
const CIMName kIndication("Indication");
const CIMName kKey("Key");

template <typename Owner> bool isTrue(const Owner& owner, const CIMName& qualifier)
{
    const Uint32 index = owner.findQualifier(qualifier);
    if (index == PEG_NOT_FOUND) {
        return false;
    }
    const CIMValue value = owner.getQualifier(index).getValue();
    Boolean isSet = false;
    if (!value.isNull() && !value.isArray() && value.getType() == CIMTYPE_BOOLEAN) {
        value.get(isSet);
    }
    return isSet;
}

// A class is an association or an indication when it, or any class above it, says so.
bool isKind(const CIMConstClass& newClass, const CIMConstClass& superClass, const CIMName& qualifier)
{
    return isTrue(newClass, qualifier) || (!superClass.isUninitialized() && isTrue(superClass, qualifier));
}

// Checks one class, part by part.
class Checker
{
  public:
    Checker(const CIMConstClass& superClass, const QualifierLookup& lookup) : fSuperClass(superClass), fLookup(lookup)
    {
    }

    template <typename To, typename From> void checkQualifiers(To& to, const From& from, const CIMScope& scope) const
    {
        for (Uint32 i = 0; i < from.getQualifierCount(); ++i) {
            to.addQualifier(checkedQualifier(from.getQualifier(i), scope, fLookup));
        }
    }

    CIMProperty checkProperty(const CIMConstProperty& property, bool isAssociation) const;
    CIMMethod checkMethod(const CIMConstMethod& method) const;

  private:
    CIMParameter checkParameter(const CIMConstParameter& parameter) const;

    const CIMConstClass& fSuperClass;
    const QualifierLookup& fLookup;
};

template <typename Element> void checkOverrides(const Element& element, const Element& inherited)
{
    for (Uint32 i = 0; i < element.getQualifierCount(); ++i) {
        const CIMConstQualifier use = element.getQualifier(i);
        const Uint32 index = inherited.findQualifier(use.getName());
        if (index != PEG_NOT_FOUND) {
            checkOverride(use, inherited.getQualifier(index));
        }
    }
}

// A string may be overridden by one that holds embedded objects, as the DMTF schema does.
bool isSameKind(const CIMConstProperty& property, const CIMConstProperty& inherited)
{
    const auto travelsAsString = [](const CIMConstProperty& any) {
        const CIMType type = any.getType();
        return type == CIMTYPE_STRING || type == CIMTYPE_OBJECT || type == CIMTYPE_INSTANCE;
    };
    const bool isSameType =
        property.getType() == inherited.getType() || (travelsAsString(property) && travelsAsString(inherited));
    return isSameType && property.isArray() == inherited.isArray();
}

void checkOverriddenProperty(const CIMConstProperty& property, const CIMConstClass& superClass)
{
    const Uint32 index = superClass.findProperty(property.getName());
    if (index == PEG_NOT_FOUND) {
        return;
    }
    const CIMConstProperty inherited = superClass.getProperty(index);
    if (!isSameKind(property, inherited)) {
        fail(CIM_ERR_FAILED, "type mismatch");
    }
    checkOverrides(property, inherited);
}

void checkOverriddenMethod(const CIMConstMethod& method, const CIMConstClass& superClass)
{
    const Uint32 index = superClass.findMethod(method.getName());
    if (index == PEG_NOT_FOUND) {
        return;
    }
    const CIMConstMethod inherited = superClass.getMethod(index);
    if (method.getType() != inherited.getType()) {
        fail(CIM_ERR_FAILED, "type mismatch");
    }
    checkOverrides(method, inherited);
}

CIMProperty Checker::checkProperty(const CIMConstProperty& property, bool isAssociation) const
{
    const bool isReference = property.getType() == CIMTYPE_REFERENCE;
    if (isReference && !isAssociation) {
        fail(CIM_ERR_INVALID_PARAMETER, "Non-association class contains reference property");
    }
    if (property.isArray() && isTrue(property, kKey)) {
        fail(CIM_ERR_INVALID_PARAMETER, "key property " + base::utf8(property.getName()) + " is an array");
    }
    CIMProperty checked(property.getName(), embeddedValue(property), property.getArraySize(),
                        property.getReferenceClassName());
    checkQualifiers(checked, property, isReference ? CIMScope::REFERENCE : CIMScope::PROPERTY);
    if (!fSuperClass.isUninitialized()) {
        checkOverriddenProperty(property, fSuperClass);
    }
    return checked;
}

CIMMethod Checker::checkMethod(const CIMConstMethod& method) const
{
    CIMMethod checked(method.getName(), method.getType());
    checkQualifiers(checked, method, CIMScope::METHOD);
    for (Uint32 i = 0; i < method.getParameterCount(); ++i) {
        checked.addParameter(checkParameter(method.getParameter(i)));
    }
    if (!fSuperClass.isUninitialized()) {
        checkOverriddenMethod(method, fSuperClass);
    }
    return checked;
}

CIMParameter Checker::checkParameter(const CIMConstParameter& parameter) const
{
    CIMParameter checked(parameter.getName(), parameter.getType(), parameter.isArray(), parameter.getArraySize(),
                         parameter.getReferenceClassName());
    checkQualifiers(checked, parameter, CIMScope::PARAMETER);
    return checked;
}

CIMScope scopeOf(bool isAssociation, bool isIndication)
{
    if (isAssociation) {
        return CIMScope::ASSOCIATION;
    }
    return isIndication ? CIMScope::INDICATION : CIMScope::CLASS;
}

} // namespace

CIMClass checkClass(const CIMConstClass& newClass, const CIMConstClass& superClass, const QualifierLookup& lookup)
{
    const bool isAssociation = isKind(newClass, superClass, kAssociation);
    const bool isIndication = isKind(newClass, superClass, kIndication);
    const Checker checker(superClass, lookup);
    CIMClass checked(newClass.getClassName(), newClass.getSuperClassName());
    checker.checkQualifiers(checked, newClass, scopeOf(isAssociation, isIndication));
    if (!superClass.isUninitialized()) {
        checkOverrides(newClass, superClass);
    }
    for (Uint32 i = 0; i < newClass.getPropertyCount(); ++i) {
        checked.addProperty(checker.checkProperty(newClass.getProperty(i), isAssociation));
    }
    for (Uint32 i = 0; i < newClass.getMethodCount(); ++i) {
        checked.addMethod(checker.checkMethod(newClass.getMethod(i)));
    }
    return checked;
}

} // namespace Pegasus::repository
