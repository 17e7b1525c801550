// SPDX-License-Identifier: MIT
#include "pegasus/wire/ElementDecoder.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMObjectPathRep.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/common/EmbeddedKind.h"
#include "pegasus/common/ObjectReps.h"
#include "pegasus/wire/MemberList.h"

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;

// The attributes that DSP0201 gives each element; the language of texts is dropped.
constexpr std::string_view kPropertyAttributes[] = {"NAME",           "CLASSORIGIN",    "PROPAGATED", "TYPE",
                                                    "EmbeddedObject", "EMBEDDEDOBJECT", "ARRAYSIZE",  "xml:lang"};
constexpr std::string_view kReferenceAttributes[] = {"NAME", "CLASSORIGIN", "PROPAGATED", "REFERENCECLASS"};
constexpr std::string_view kQualifierAttributes[] = {"NAME",       "TYPE",       "PROPAGATED",   "OVERRIDABLE",
                                                     "TOSUBCLASS", "TOINSTANCE", "TRANSLATABLE", "xml:lang"};
constexpr std::string_view kDeclarationAttributes[] = {"NAME",       "TYPE",       "ISARRAY",      "OVERRIDABLE",
                                                       "TOSUBCLASS", "TOINSTANCE", "TRANSLATABLE", "ARRAYSIZE"};
constexpr std::size_t kFirstFlavor = 3; // OVERRIDABLE in both of the above
constexpr std::string_view kMethodAttributes[] = {"NAME",       "TYPE",           "CLASSORIGIN",
                                                  "PROPAGATED", "EmbeddedObject", "EMBEDDEDOBJECT"};
constexpr std::string_view kParameterAttributes[] = {"NAME",           "TYPE",           "ARRAYSIZE",
                                                     "REFERENCECLASS", "EmbeddedObject", "EMBEDDEDOBJECT"};
constexpr std::string_view kScopeAttributes[] = {"CLASS",  "ASSOCIATION", "REFERENCE", "PROPERTY",
                                                 "METHOD", "PARAMETER",   "INDICATION"};

bool isOneOf(const XmlElement& element, std::initializer_list<std::string_view> names)
{
    for (const std::string_view name : names) {
        if (element.is(name)) {
            return true;
        }
    }
    return false;
}

void expectEnd(const XmlElement& parent, const XmlElement& child)
{
    if (child) {
        child.failIn(parent);
    }
}

[[noreturn]] void failIllegal(const XmlElement& element, std::string_view attribute)
{
    element.fail(Kind::kSemantic,
                 "Illegal value for " + std::string(element.name()) + "." + std::string(attribute) + " attribute");
}

[[noreturn]] void failMissing(const XmlElement& element, std::string_view attribute)
{
    element.fail(Kind::kInvalid,
                 "missing " + std::string(element.name()) + "." + std::string(attribute) + " attribute");
}

// The type of a property's value: embedded objects are known by the attribute, or by the qualifiers alone.
CIMType valueType(CIMType declared, const Array<CIMQualifier>& qualifiers)
{
    switch (embeddedKind(declared, qualifiers)) {
    case EmbeddedKind::kObject:
        return CIMTYPE_OBJECT;
    case EmbeddedKind::kInstance:
        return CIMTYPE_INSTANCE;
    default:
        return declared;
    }
}

// Returns: how many siblings there are from the child on, or the limit.
Uint32 countFrom(XmlElement child, std::size_t limit)
{
    Uint32 count = 0;
    for (; child && count < limit; child = child.nextSibling()) {
        ++count;
    }
    return count;
}

} // namespace

// ---- attributes

const CIMName& ElementDecoder::nameAttribute(const XmlElement& element, std::string_view attribute, XmlAttribute value)
{
    if (!value) {
        failMissing(element, attribute);
    }
    if (const CIMName* known = fNames.find(*value)) {
        return *known;
    }
    countText(value->size());
    try {
        return fNames.add(element.resolved(*value, fScratch));
    } catch (const XmlError&) {
        throw;
    } catch (const Exception&) {
        failIllegal(element, attribute);
    }
}

CIMName ElementDecoder::optionalName(const XmlElement& element, std::string_view attribute, XmlAttribute value)
{
    return !value || value->empty() ? CIMName() : nameAttribute(element, attribute, value);
}

bool ElementDecoder::boolAttribute(const XmlElement& element, std::string_view attribute, XmlAttribute value,
                                   bool ifMissing)
{
    if (!value) {
        return ifMissing;
    }
    if (base::equalNoCase(*value, "true")) {
        return true;
    }
    if (base::equalNoCase(*value, "false")) {
        return false;
    }
    failIllegal(element, attribute);
}

CIMType ElementDecoder::typeAttribute(const XmlElement& element, std::string_view attribute, XmlAttribute value)
{
    if (!value) {
        failMissing(element, attribute);
    }
    if (*value == "string") {
        return CIMTYPE_STRING;
    }
    for (int type = CIMTYPE_BOOLEAN; type <= CIMTYPE_REFERENCE; ++type) {
        if (*value == cimTypeToString(CIMType(type))) {
            return CIMType(type);
        }
    }
    failIllegal(element, attribute);
}

Uint32 ElementDecoder::sizeAttribute(const XmlElement& element, XmlAttribute value)
{
    if (!value) {
        return 0;
    }
    const auto size = base::parseUnsigned(*value);
    if (!size || *size > fLimits.maxArrayElements) {
        failIllegal(element, "ARRAYSIZE");
    }
    return static_cast<Uint32>(*size);
}

// `values` begin with OVERRIDABLE, TOSUBCLASS, TOINSTANCE, TRANSLATABLE.
CIMFlavor ElementDecoder::flavor(const XmlElement& element, const XmlAttribute* values)
{
    CIMFlavor flavor;
    flavor.addFlavor(boolAttribute(element, "OVERRIDABLE", values[0], true) ? CIMFlavor::OVERRIDABLE
                                                                            : CIMFlavor::DISABLEOVERRIDE);
    flavor.addFlavor(boolAttribute(element, "TOSUBCLASS", values[1], true) ? CIMFlavor::TOSUBCLASS
                                                                           : CIMFlavor::RESTRICTED);
    if (boolAttribute(element, "TOINSTANCE", values[2], false)) {
        flavor.addFlavor(CIMFlavor::TOINSTANCE);
    }
    if (boolAttribute(element, "TRANSLATABLE", values[3], false)) {
        flavor.addFlavor(CIMFlavor::TRANSLATABLE);
    }
    return flavor;
}

String ElementDecoder::toString(const XmlElement& element, std::string_view utf8)
{
    countText(utf8.size());
    try {
        return base::fromUtf8(utf8);
    } catch (const Exception&) {
        element.fail(Kind::kNotWellFormed, "text that is not UTF-8 in " + std::string(element.name()) + " element");
    }
}

// ---- memory

void ElementDecoder::countText(std::size_t units)
{
    if (units > 0) {
        countPiece(sizeof(StringRep) + (units + 1) * sizeof(Char16));
    }
}

// ---- qualifiers

CIMQualifier ElementDecoder::decodeQualifier(const XmlElement& element)
{
    XmlAttribute values[std::size(kQualifierAttributes)];
    element.attributes(kQualifierAttributes, values);
    const CIMName name = nameAttribute(element, "NAME", values[0]);
    const CIMType type = typeAttribute(element, "TYPE", values[1]);
    const bool propagated = boolAttribute(element, "PROPAGATED", values[2], false);
    const XmlElement child = element.firstChild();
    if (child && !isOneOf(child, {"VALUE", "VALUE.ARRAY"})) {
        child.failIn(element);
    }
    if (child) {
        expectEnd(element, child.nextSibling());
    }
    const CIMValue value = child ? decodeValue(child, type) : CIMValue(type, false);
    countObject(sizeof(CIMQualifierRep));
    return CIMQualifier(name, value, flavor(element, values + kFirstFlavor), propagated);
}

// Returns: the first child after the qualifiers.
XmlElement ElementDecoder::decodeQualifiers(XmlElement child, Array<CIMQualifier>& qualifiers)
{
    MemberList<CIMQualifier> members(qualifiers, fLimits.maxMembers);
    for (; child.is("QUALIFIER"); child = child.nextSibling()) {
        members.add(child, decodeQualifier(child));
    }
    countList(qualifiers);
    return child;
}

CIMScope ElementDecoder::decodeScope(const XmlElement& element)
{
    const CIMScope kinds[] = {CIMScope::CLASS,  CIMScope::ASSOCIATION, CIMScope::REFERENCE, CIMScope::PROPERTY,
                              CIMScope::METHOD, CIMScope::PARAMETER,   CIMScope::INDICATION};
    XmlAttribute values[std::size(kScopeAttributes)];
    element.attributes(kScopeAttributes, values);
    element.expectNoChildren();
    CIMScope scope;
    for (std::size_t i = 0; i < std::size(kinds); ++i) {
        if (boolAttribute(element, kScopeAttributes[i], values[i], false)) {
            scope.addScope(kinds[i]);
        }
    }
    return scope;
}

CIMQualifierDecl ElementDecoder::decodeQualifierDeclaration(const XmlElement& element)
{
    element.expectName("QUALIFIER.DECLARATION");
    XmlAttribute values[std::size(kDeclarationAttributes)];
    element.attributes(kDeclarationAttributes, values);
    const CIMName name = nameAttribute(element, "NAME", values[0]);
    const CIMType type = typeAttribute(element, "TYPE", values[1]);
    const bool isArray = boolAttribute(element, "ISARRAY", values[2], false);
    const Uint32 arraySize = sizeAttribute(element, values[7]);
    XmlElement child = element.firstChild();
    CIMScope scope;
    if (child.is("SCOPE")) {
        scope = decodeScope(child);
        child = child.nextSibling();
    }
    CIMValue value = nullValue(type, isArray, arraySize);
    if (isOneOf(child, {"VALUE", "VALUE.ARRAY"})) {
        value = decodeValue(child, type);
        child = child.nextSibling();
    }
    expectEnd(element, child);
    countObject(sizeof(CIMQualifierDeclRep));
    return CIMQualifierDecl(name, value, scope, flavor(element, values + kFirstFlavor), arraySize);
}

// ---- properties

CIMProperty ElementDecoder::decodeProperty(const XmlElement& element)
{
    CIMProperty property = ObjectAccess::wrap<CIMProperty>(new CIMPropertyRep());
    countObject(sizeof(CIMPropertyRep));
    CIMPropertyRep& rep = ObjectAccess::rep(property);
    if (element.is("PROPERTY.REFERENCE")) {
        readReferenceProperty(element, rep);
    } else {
        readTypedProperty(element, element.is("PROPERTY.ARRAY"), rep);
    }
    return property;
}

// `values` begin with NAME, CLASSORIGIN, PROPAGATED. Returns: the first child after the qualifiers.
XmlElement ElementDecoder::beginProperty(const XmlElement& element, const XmlAttribute* values, CIMPropertyRep& rep)
{
    rep.fName = nameAttribute(element, "NAME", values[0]);
    rep.fClassOrigin = optionalName(element, "CLASSORIGIN", values[1]);
    rep.fPropagated = boolAttribute(element, "PROPAGATED", values[2], false);
    return decodeQualifiers(element.firstChild(), rep.fQualifiers);
}

void ElementDecoder::readTypedProperty(const XmlElement& element, bool isArray, CIMPropertyRep& rep)
{
    XmlAttribute values[std::size(kPropertyAttributes)];
    element.attributes(kPropertyAttributes, values);
    const XmlElement child = beginProperty(element, values, rep);
    const CIMType declared = embeddedType(element, typeAttribute(element, "TYPE", values[3]), values[4], values[5]);
    const CIMType type = valueType(declared, rep.fQualifiers);
    if (isArray) {
        rep.fArraySize = sizeAttribute(element, values[6]);
    }
    const bool hasValue = child.is(isArray ? "VALUE.ARRAY" : "VALUE");
    rep.fValue = hasValue ? decodeValue(child, type) : nullValue(type, isArray, rep.fArraySize);
    expectEnd(element, hasValue ? child.nextSibling() : child);
}

void ElementDecoder::readReferenceProperty(const XmlElement& element, CIMPropertyRep& rep)
{
    XmlAttribute values[std::size(kReferenceAttributes)];
    element.attributes(kReferenceAttributes, values);
    const XmlElement child = beginProperty(element, values, rep);
    rep.fReferenceClassName = optionalName(element, "REFERENCECLASS", values[3]);
    const bool hasValue = child.is("VALUE.REFERENCE");
    rep.fValue = hasValue ? referenceValue(decodeReference(child)) : CIMValue(CIMTYPE_REFERENCE, false);
    expectEnd(element, hasValue ? child.nextSibling() : child);
}

// Nulls of one scalar type are one representation.
CIMValue ElementDecoder::nullValue(CIMType type, bool isArray, Uint32 arraySize)
{
    if (isArray) {
        countObject(sizeof(CIMValueRep));
    }
    return CIMValue(type, isArray, arraySize);
}

// Returns: the first child after the properties.
XmlElement ElementDecoder::decodeProperties(XmlElement child, Array<CIMProperty>& properties)
{
    properties.reserveCapacity(countFrom(child, fLimits.maxMembers));
    MemberList<CIMProperty> members(properties, fLimits.maxMembers);
    for (; isOneOf(child, {"PROPERTY", "PROPERTY.ARRAY", "PROPERTY.REFERENCE"}); child = child.nextSibling()) {
        members.add(child, decodeProperty(child));
    }
    countList(properties);
    return child;
}

// ---- classes

CIMParameter ElementDecoder::decodeParameter(const XmlElement& element)
{
    XmlAttribute values[std::size(kParameterAttributes)];
    element.attributes(kParameterAttributes, values);
    const bool isReference = isOneOf(element, {"PARAMETER.REFERENCE", "PARAMETER.REFARRAY"});
    CIMParameter parameter = ObjectAccess::wrap<CIMParameter>(new CIMParameterRep());
    countObject(sizeof(CIMParameterRep));
    CIMParameterRep& rep = ObjectAccess::rep(parameter);
    rep.fName = nameAttribute(element, "NAME", values[0]);
    rep.fIsArray = isOneOf(element, {"PARAMETER.ARRAY", "PARAMETER.REFARRAY"});
    rep.fArraySize = sizeAttribute(element, values[2]);
    rep.fReferenceClassName = optionalName(element, "REFERENCECLASS", values[3]);
    rep.fType = isReference ? CIMTYPE_REFERENCE
                            : embeddedType(element, typeAttribute(element, "TYPE", values[1]), values[4], values[5]);
    expectEnd(element, decodeQualifiers(element.firstChild(), rep.fQualifiers));
    return parameter;
}

CIMMethod ElementDecoder::decodeMethod(const XmlElement& element)
{
    XmlAttribute values[std::size(kMethodAttributes)];
    element.attributes(kMethodAttributes, values);
    CIMMethod method = ObjectAccess::wrap<CIMMethod>(new CIMMethodRep());
    countObject(sizeof(CIMMethodRep));
    CIMMethodRep& rep = ObjectAccess::rep(method);
    rep.fName = nameAttribute(element, "NAME", values[0]);
    rep.fType = embeddedType(element, typeAttribute(element, "TYPE", values[1]), values[4], values[5]);
    rep.fClassOrigin = optionalName(element, "CLASSORIGIN", values[2]);
    rep.fPropagated = boolAttribute(element, "PROPAGATED", values[3], false);
    XmlElement child = decodeQualifiers(element.firstChild(), rep.fQualifiers);
    MemberList<CIMParameter> parameters(rep.fParameters, fLimits.maxMembers);
    for (; isOneOf(child, {"PARAMETER", "PARAMETER.ARRAY", "PARAMETER.REFERENCE", "PARAMETER.REFARRAY"});
         child = child.nextSibling())
    {
        parameters.add(child, decodeParameter(child));
    }
    countList(rep.fParameters);
    expectEnd(element, child);
    return method;
}

CIMClass ElementDecoder::decodeClass(const XmlElement& element)
{
    element.expectName("CLASS");
    XmlAttribute values[2];
    element.attributes({"NAME", "SUPERCLASS"}, values);
    const CIMName name = nameAttribute(element, "NAME", values[0]);
    CIMClass cimClass(name, optionalName(element, "SUPERCLASS", values[1]));
    CIMClassRep& rep = ObjectAccess::rep(cimClass);
    countObject(sizeof(CIMClassRep));
    countPiece(sizeof(CIMObjectPathRep));
    XmlElement child = decodeQualifiers(element.firstChild(), rep.fQualifiers);
    child = decodeProperties(child, rep.fProperties);
    MemberList<CIMMethod> methods(rep.fMethods, fLimits.maxMembers);
    for (; child.is("METHOD"); child = child.nextSibling()) {
        methods.add(child, decodeMethod(child));
    }
    countList(rep.fMethods);
    expectEnd(element, child);
    return cimClass;
}

// ---- instances

CIMInstance ElementDecoder::decodeInstance(const XmlElement& element)
{
    element.expectName("INSTANCE");
    XmlAttribute values[2];
    element.attributes({"CLASSNAME", "xml:lang"}, values);
    CIMInstance instance(nameAttribute(element, "CLASSNAME", values[0]));
    CIMInstanceRep& rep = ObjectAccess::rep(instance);
    countObject(sizeof(CIMInstanceRep));
    countPiece(sizeof(CIMObjectPathRep));
    XmlElement child = decodeQualifiers(element.firstChild(), rep.fQualifiers);
    child = decodeProperties(child, rep.fProperties);
    expectEnd(element, child);
    return instance;
}

CIMInstance ElementDecoder::decodeNamedInstance(const XmlElement& element)
{
    element.expectName("VALUE.NAMEDINSTANCE");
    const XmlElement name = element.firstChild();
    if (!name) {
        element.fail(Kind::kInvalid, "expected INSTANCENAME element");
    }
    const CIMObjectPath path = decodeInstanceName(name);
    const XmlElement child = name.nextSibling();
    if (!child) {
        element.fail(Kind::kInvalid, "expected INSTANCE element");
    }
    CIMInstance instance = decodeInstance(child);
    expectEnd(element, child.nextSibling());
    instance.setPath(path);
    return instance;
}

} // namespace Pegasus::wire
