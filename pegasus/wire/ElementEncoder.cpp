// SPDX-License-Identifier: MIT
#include "pegasus/wire/ElementEncoder.h"

#include "pegasus/wire/ElementAttributes.h"

namespace Pegasus::wire {
namespace {

void appendNameIfAny(std::string& out, std::string_view attribute, const CIMName& name)
{
    if (!name.isNull()) {
        appendAttribute(out, attribute, name.getString());
    }
}

void appendTrueIf(std::string& out, std::string_view attribute, bool condition)
{
    if (condition) {
        appendAttribute(out, attribute, "true");
    }
}

void appendArraySize(std::string& out, Uint32 size)
{
    if (size > 0) {
        appendAttribute(out, "ARRAYSIZE", std::to_string(size).c_str());
    }
}

// ---- qualifiers

void appendFlavor(std::string& out, const CIMFlavor& flavor)
{
    if (!flavor.hasFlavor(CIMFlavor::OVERRIDABLE)) {
        appendAttribute(out, "OVERRIDABLE", "false");
    }
    if (!flavor.hasFlavor(CIMFlavor::TOSUBCLASS)) {
        appendAttribute(out, "TOSUBCLASS", "false");
    }
    appendTrueIf(out, "TOINSTANCE", flavor.hasFlavor(CIMFlavor::TOINSTANCE));
    appendTrueIf(out, "TRANSLATABLE", flavor.hasFlavor(CIMFlavor::TRANSLATABLE));
}

void appendQualifier(std::string& out, const CIMConstQualifier& qualifier)
{
    out += "<QUALIFIER";
    appendAttribute(out, "NAME", qualifier.getName().getString());
    appendType(out, "TYPE", qualifier.getType());
    appendTrueIf(out, "PROPAGATED", qualifier.getPropagated() != 0);
    appendFlavor(out, qualifier.getFlavor());
    out += ">\n";
    appendValue(out, qualifier.getValue());
    out += "</QUALIFIER>\n";
}

template <typename Holder> void appendQualifiers(std::string& out, const Holder& holder)
{
    for (Uint32 i = 0; i < holder.getQualifierCount(); ++i) {
        appendQualifier(out, holder.getQualifier(i));
    }
}

void appendScope(std::string& out, const CIMScope& scope)
{
    const struct
    {
        const char* name;
        const CIMScope& scope;
    } kinds[] = {
        {"CLASS", CIMScope::CLASS},           {"ASSOCIATION", CIMScope::ASSOCIATION},
        {"REFERENCE", CIMScope::REFERENCE},   {"PROPERTY", CIMScope::PROPERTY},
        {"METHOD", CIMScope::METHOD},         {"PARAMETER", CIMScope::PARAMETER},
        {"INDICATION", CIMScope::INDICATION},
    };
    if (scope.equal(CIMScope::NONE)) {
        return;
    }
    out += "<SCOPE";
    for (const auto& kind : kinds) {
        appendTrueIf(out, kind.name, scope.hasScope(kind.scope));
    }
    out += "/>";
}

// ---- properties, methods

void appendOriginAndPropagated(std::string& out, const CIMConstProperty& property)
{
    appendNameIfAny(out, "CLASSORIGIN", property.getClassOrigin());
    appendTrueIf(out, "PROPAGATED", property.getPropagated());
}

const char* propertyElement(const CIMConstProperty& property)
{
    if (property.getType() == CIMTYPE_REFERENCE) {
        return "PROPERTY.REFERENCE";
    }
    return property.isArray() ? "PROPERTY.ARRAY" : "PROPERTY";
}

const char* parameterElement(const CIMConstParameter& parameter)
{
    if (parameter.getType() == CIMTYPE_REFERENCE) {
        return parameter.isArray() ? "PARAMETER.REFARRAY" : "PARAMETER.REFERENCE";
    }
    return parameter.isArray() ? "PARAMETER.ARRAY" : "PARAMETER";
}

void appendParameter(std::string& out, const CIMConstParameter& parameter)
{
    const char* element = parameterElement(parameter);
    out.append("<").append(element);
    appendAttribute(out, "NAME", parameter.getName().getString());
    if (parameter.getType() == CIMTYPE_REFERENCE) {
        appendNameIfAny(out, "REFERENCECLASS", parameter.getReferenceClassName());
    } else {
        appendType(out, "TYPE", parameter.getType());
        appendEmbeddedMark(out, parameter.getType());
    }
    appendArraySize(out, parameter.getArraySize());
    out += ">\n";
    appendQualifiers(out, parameter);
    out.append("</").append(element).append(">\n");
}

void appendMethod(std::string& out, const CIMConstMethod& method)
{
    out += "<METHOD";
    appendAttribute(out, "NAME", method.getName().getString());
    appendType(out, "TYPE", method.getType());
    appendNameIfAny(out, "CLASSORIGIN", method.getClassOrigin());
    appendTrueIf(out, "PROPAGATED", method.getPropagated());
    out += ">\n";
    appendQualifiers(out, method);
    for (Uint32 i = 0; i < method.getParameterCount(); ++i) {
        appendParameter(out, method.getParameter(i));
    }
    out += "</METHOD>\n";
}

} // namespace

void appendClass(std::string& out, const CIMConstClass& cimClass)
{
    out += "<CLASS";
    appendAttribute(out, "NAME", cimClass.getClassName().getString());
    out += ' ';
    if (!cimClass.getSuperClassName().isNull()) {
        appendAttribute(out, "SUPERCLASS", cimClass.getSuperClassName().getString());
        out += ' ';
    }
    out += ">\n";
    appendQualifiers(out, cimClass);
    for (Uint32 i = 0; i < cimClass.getPropertyCount(); ++i) {
        appendProperty(out, cimClass.getProperty(i));
    }
    for (Uint32 i = 0; i < cimClass.getMethodCount(); ++i) {
        appendMethod(out, cimClass.getMethod(i));
    }
    out += "</CLASS>\n";
}

void appendInstanceStart(std::string& out, const CIMName& className)
{
    out += "<INSTANCE";
    appendAttribute(out, "CLASSNAME", className.getString());
    out += " >\n";
}

void appendInstance(std::string& out, const CIMConstInstance& instance, Blanks blanks)
{
    appendInstanceStart(out, instance.getClassName());
    appendQualifiers(out, instance);
    for (Uint32 i = 0; i < instance.getPropertyCount(); ++i) {
        appendProperty(out, instance.getProperty(i), blanks);
    }
    out += "</INSTANCE>\n";
}

void appendNamedInstance(std::string& out, const CIMConstInstance& instance, Blanks blanks)
{
    out += "<VALUE.NAMEDINSTANCE>\n";
    appendInstanceName(out, instance.getPath(), blanks);
    appendInstance(out, instance, blanks);
    out += "</VALUE.NAMEDINSTANCE>\n";
}

void appendQualifierDeclaration(std::string& out, const CIMConstQualifierDecl& declaration)
{
    out += "<QUALIFIER.DECLARATION";
    appendAttribute(out, "NAME", declaration.getName().getString());
    appendType(out, "TYPE", declaration.getType());
    appendTrueIf(out, "ISARRAY", declaration.isArray());
    appendArraySize(out, declaration.getArraySize());
    appendFlavor(out, declaration.getFlavor());
    out += ">\n";
    appendScope(out, declaration.getScope());
    appendValue(out, declaration.getValue());
    out += "</QUALIFIER.DECLARATION>\n";
}

// Two blanks follow the name, as OpenPegasus writes them.
void appendPropertyStart(std::string& out, const CIMConstProperty& property)
{
    const CIMType type = property.getType();
    out.append("<").append(propertyElement(property));
    appendAttribute(out, "NAME", property.getName().getString());
    out += ' ';
    if (type == CIMTYPE_REFERENCE) {
        appendNameIfAny(out, "REFERENCECLASS", property.getReferenceClassName());
        appendOriginAndPropagated(out, property);
    } else if (property.isArray()) {
        appendType(out, "TYPE", type);
        appendEmbeddedMark(out, type);
        appendArraySize(out, property.getArraySize());
        appendOriginAndPropagated(out, property);
    } else {
        appendOriginAndPropagated(out, property);
        appendType(out, "TYPE", type);
        appendEmbeddedMark(out, type);
    }
    out += ">\n";
}

void appendProperty(std::string& out, const CIMConstProperty& property, Blanks blanks)
{
    appendPropertyStart(out, property);
    appendQualifiers(out, property);
    appendValue(out, property.getValue(), blanks);
    out.append("</").append(propertyElement(property)).append(">\n");
}

} // namespace Pegasus::wire
