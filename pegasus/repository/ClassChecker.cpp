// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/common/NameIndex.h"
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

template <typename Element> void checkOverrides(const Element& element, const Element& inherited)
{
    const Array<CIMQualifier>& above = qualifiersOf(inherited);
    const NameIndex<CIMQualifier> index(above);
    for (Uint32 i = 0; i < element.getQualifierCount(); ++i) {
        const CIMConstQualifier use = element.getQualifier(i);
        const Uint32 overridden = index.find(use.getName());
        if (overridden != PEG_NOT_FOUND) {
            checkOverride(use, above[overridden]);
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

void checkOverriddenProperty(const CIMProperty& property, const CIMProperty& inherited)
{
    if (!isSameKind(property, inherited)) {
        fail(CIM_ERR_FAILED, "type mismatch");
    }
    checkOverrides(property, inherited);
}

void checkOverriddenMethod(const CIMMethod& method, const CIMMethod& inherited)
{
    if (method.getType() != inherited.getType()) {
        fail(CIM_ERR_FAILED, "type mismatch");
    }
    checkOverrides(method, inherited);
}

// Checks one class, part by part. Checked parts are appended without a search for an equal name: the class came from a
// decoder or a builder that keeps its names distinct.
class Checker
{
  public:
    Checker(const CIMClassRep& superClass, const QualifierLookup& lookup)
        : fSuperClass(superClass), fProperties(superClass.fProperties), fMethods(superClass.fMethods), fLookup(lookup)
    {
    }

    Array<CIMQualifier> checkQualifiers(const Array<CIMQualifier>& uses, const CIMScope& scope) const;
    CIMProperty checkProperty(const CIMProperty& property, bool isAssociation) const;
    CIMMethod checkMethod(const CIMMethod& method) const;

  private:
    CIMParameter checkParameter(const CIMParameter& parameter) const;

    const CIMClassRep& fSuperClass;
    const NameIndex<CIMProperty> fProperties; // of the superclass
    const NameIndex<CIMMethod> fMethods;
    const QualifierLookup& fLookup;
};

Array<CIMQualifier> Checker::checkQualifiers(const Array<CIMQualifier>& uses, const CIMScope& scope) const
{
    Array<CIMQualifier> checked;
    checked.reserveCapacity(uses.size());
    for (Uint32 i = 0; i < uses.size(); ++i) {
        checked.append(checkedQualifier(uses[i], scope, fLookup));
    }
    return checked;
}

CIMProperty Checker::checkProperty(const CIMProperty& property, bool isAssociation) const
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
    ObjectAccess::rep(checked).fQualifiers =
        checkQualifiers(qualifiersOf(property), isReference ? CIMScope::REFERENCE : CIMScope::PROPERTY);
    const Uint32 index = fProperties.find(property.getName());
    if (index != PEG_NOT_FOUND) {
        checkOverriddenProperty(property, fSuperClass.fProperties[index]);
    }
    return checked;
}

CIMMethod Checker::checkMethod(const CIMMethod& method) const
{
    CIMMethod checked(method.getName(), method.getType());
    CIMMethodRep& to = ObjectAccess::rep(checked);
    to.fQualifiers = checkQualifiers(qualifiersOf(method), CIMScope::METHOD);
    const Array<CIMParameter>& parameters = ObjectAccess::rep(method).fParameters;
    for (Uint32 i = 0; i < parameters.size(); ++i) {
        to.fParameters.append(checkParameter(parameters[i]));
    }
    const Uint32 index = fMethods.find(method.getName());
    if (index != PEG_NOT_FOUND) {
        checkOverriddenMethod(method, fSuperClass.fMethods[index]);
    }
    return checked;
}

CIMParameter Checker::checkParameter(const CIMParameter& parameter) const
{
    CIMParameter checked(parameter.getName(), parameter.getType(), parameter.isArray(), parameter.getArraySize(),
                         parameter.getReferenceClassName());
    ObjectAccess::rep(checked).fQualifiers = checkQualifiers(qualifiersOf(parameter), CIMScope::PARAMETER);
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
    const CIMClassRep nothing;
    const CIMClassRep& from = ObjectAccess::rep(newClass);
    const Checker checker(superClass.isUninitialized() ? nothing : ObjectAccess::rep(superClass), lookup);
    CIMClass checked(newClass.getClassName(), newClass.getSuperClassName());
    CIMClassRep& to = ObjectAccess::rep(checked);
    to.fQualifiers = checker.checkQualifiers(from.fQualifiers, scopeOf(isAssociation, isIndication));
    if (!superClass.isUninitialized()) {
        checkOverrides(newClass, superClass);
    }
    to.fProperties.reserveCapacity(from.fProperties.size());
    for (Uint32 i = 0; i < from.fProperties.size(); ++i) {
        to.fProperties.append(checker.checkProperty(from.fProperties[i], isAssociation));
    }
    for (Uint32 i = 0; i < from.fMethods.size(); ++i) {
        to.fMethods.append(checker.checkMethod(from.fMethods[i]));
    }
    return checked;
}

} // namespace Pegasus::repository
