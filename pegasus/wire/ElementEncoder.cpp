#include "pegasus/wire/ElementEncoder.h"

#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/wire/XmlText.h"

#include <cmath>

namespace Pegasus::wire {
namespace {

void appendAttribute(std::string& out, const char* name, const String& value)
{
    out += ' ';
    out += name;
    out += "=\"";
    appendEscaped(out, value);
    out += '"';
}

void appendAttribute(std::string& out, const char* name, const char* value)
{
    out += ' ';
    out += name;
    out += "=\"";
    out += value;
    out += '"';
}

void appendNameIfAny(std::string& out, const char* attribute, const CIMName& name)
{
    if (!name.isNull()) {
        appendAttribute(out, attribute, name.getString());
    }
}

void appendTrueIf(std::string& out, const char* attribute, bool condition)
{
    if (condition) {
        appendAttribute(out, attribute, "true");
    }
}

// Embedded objects travel as strings, marked in both spellings that peers know.
void appendType(std::string& out, const char* attribute, CIMType type)
{
    const bool isEmbedded = type == CIMTYPE_OBJECT || type == CIMTYPE_INSTANCE;
    appendAttribute(out, attribute, isEmbedded ? "string" : cimTypeToString(type));
}

void appendEmbeddedMark(std::string& out, CIMType type)
{
    if (type != CIMTYPE_OBJECT && type != CIMTYPE_INSTANCE) {
        return;
    }
    appendAttribute(out, "EmbeddedObject", cimTypeToString(type));
    appendAttribute(out, "EMBEDDEDOBJECT", cimTypeToString(type));
}

void appendArraySize(std::string& out, Uint32 size)
{
    if (size > 0) {
        appendAttribute(out, "ARRAYSIZE", std::to_string(size).c_str());
    }
}

// ---- values

void appendText(std::string& out, Boolean x)
{
    out += x ? "TRUE" : "FALSE";
}

void appendReal(std::string& out, Real64 x, int digits)
{
    if (std::isnan(x)) {
        out += "NaN";
    } else if (std::isinf(x)) {
        out += x < 0 ? "-INF" : "INF";
    } else {
        out += base::formatReal(x, digits);
    }
}

void appendText(std::string& out, Real32 x)
{
    appendReal(out, Real64(x), 7);
}

void appendText(std::string& out, Real64 x)
{
    appendReal(out, x, 16);
}

void appendText(std::string& out, const Char16& x)
{
    std::string utf8;
    base::appendUtf8(utf8, &x, 1);
    appendEscaped(out, utf8);
}

void appendText(std::string& out, const String& x)
{
    appendEscaped(out, x);
}

void appendText(std::string& out, const CIMDateTime& x)
{
    base::appendUtf8(out, x.toString());
}

void appendText(std::string& out, const CIMInstance& x)
{
    std::string xml;
    appendInstance(xml, x);
    appendEscaped(out, xml);
}

void appendText(std::string& out, const CIMObject& x)
{
    appendEscaped(out, x.toString());
}

template <typename T> void appendText(std::string& out, const T& x)
{
    static_assert(std::is_integral_v<T>, "a number");
    out += std::to_string(x);
}

template <typename T> void appendOne(std::string& out, const T& x)
{
    if constexpr (std::is_same_v<T, CIMObjectPath>) {
        appendReference(out, x);
    } else {
        out += "<VALUE>";
        appendText(out, x);
        out += "</VALUE>\n";
    }
}

template <typename T> void appendAll(std::string& out, const Array<T>& array)
{
    const char* const name = std::is_same_v<T, CIMObjectPath> ? "VALUE.REFARRAY" : "VALUE.ARRAY";
    out.append("<").append(name).append(">\n");
    for (Uint32 i = 0; i < array.size(); ++i) {
        appendOne(out, array[i]);
    }
    out.append("</").append(name).append(">\n");
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

// Two blanks follow the name, as OpenPegasus writes them.
void appendPropertyStart(std::string& out, const char* element, const CIMConstProperty& property)
{
    out.append("<").append(element);
    appendAttribute(out, "NAME", property.getName().getString());
    out += ' ';
}

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

// ---- paths

const char* keyTypeName(CIMKeyBinding::Type type)
{
    switch (type) {
    case CIMKeyBinding::BOOLEAN:
        return "boolean";
    case CIMKeyBinding::NUMERIC:
        return "numeric";
    default:
        return "string";
    }
}

// The one key of a path may come without its name (DSP0201, INSTANCENAME).
void appendKeyBinding(std::string& out, const CIMKeyBinding& key)
{
    const bool isNamed = !key.getName().isNull();
    if (isNamed) {
        out += "<KEYBINDING";
        appendAttribute(out, "NAME", key.getName().getString());
        out += ">\n";
    }
    if (key.getType() == CIMKeyBinding::REFERENCE) {
        appendReference(out, CIMObjectPath(key.getValue()));
    } else {
        out += "<KEYVALUE";
        appendAttribute(out, "VALUETYPE", keyTypeName(key.getType()));
        out += '>';
        appendEscaped(out, key.getValue());
        out += "</KEYVALUE>\n";
    }
    if (isNamed) {
        out += "</KEYBINDING>\n";
    }
}

// INSTANCENAME for a path with keys, else CLASSNAME.
void appendName(std::string& out, const CIMObjectPath& path)
{
    if (path.getKeyBindings().size() > 0) {
        appendInstanceName(out, path);
    } else {
        appendClassName(out, path.getClassName());
    }
}

void appendPathIn(std::string& out, const CIMObjectPath& path)
{
    const std::string kind = path.getKeyBindings().size() > 0 ? "INSTANCEPATH" : "CLASSPATH";
    const bool isLocal = path.getHost().size() == 0;
    const std::string element = (isLocal ? "LOCAL" : "") + kind;
    out += "<" + element + ">\n";
    if (!isLocal) {
        out += "<NAMESPACEPATH>\n<HOST>";
        appendEscaped(out, path.getHost());
        out += "</HOST>\n";
    }
    appendLocalNamespacePath(out, path.getNameSpace());
    if (!isLocal) {
        out += "</NAMESPACEPATH>\n";
    }
    appendName(out, path);
    out += "</" + element + ">\n";
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

void appendInstance(std::string& out, const CIMConstInstance& instance)
{
    out += "<INSTANCE";
    appendAttribute(out, "CLASSNAME", instance.getClassName().getString());
    out += " >\n";
    appendQualifiers(out, instance);
    for (Uint32 i = 0; i < instance.getPropertyCount(); ++i) {
        appendProperty(out, instance.getProperty(i));
    }
    out += "</INSTANCE>\n";
}

void appendNamedInstance(std::string& out, const CIMConstInstance& instance)
{
    out += "<VALUE.NAMEDINSTANCE>\n";
    appendInstanceName(out, instance.getPath());
    appendInstance(out, instance);
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

void appendProperty(std::string& out, const CIMConstProperty& property)
{
    const char* element = propertyElement(property);
    const CIMType type = property.getType();
    appendPropertyStart(out, element, property);
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
    appendQualifiers(out, property);
    appendValue(out, property.getValue());
    out.append("</").append(element).append(">\n");
}

void appendClassName(std::string& out, const CIMName& className)
{
    out += "<CLASSNAME";
    appendAttribute(out, "NAME", className.getString());
    out += "/>\n";
}

void appendInstanceName(std::string& out, const CIMObjectPath& path)
{
    out += "<INSTANCENAME";
    appendAttribute(out, "CLASSNAME", path.getClassName().getString());
    out += ">\n";
    const Array<CIMKeyBinding>& keys = path.getKeyBindings();
    for (Uint32 i = 0; i < keys.size(); ++i) {
        appendKeyBinding(out, keys[i]);
    }
    out += "</INSTANCENAME>\n";
}

void appendLocalInstancePath(std::string& out, const CIMNamespaceName& nameSpace, const CIMObjectPath& path)
{
    out += "<LOCALINSTANCEPATH>\n";
    appendLocalNamespacePath(out, nameSpace);
    appendInstanceName(out, path);
    out += "</LOCALINSTANCEPATH>\n";
}

void appendLocalClassPath(std::string& out, const CIMNamespaceName& nameSpace, const CIMName& className)
{
    out += "<LOCALCLASSPATH>\n";
    appendLocalNamespacePath(out, nameSpace);
    appendClassName(out, className);
    out += "</LOCALCLASSPATH>\n";
}

void appendLocalNamespacePath(std::string& out, const CIMNamespaceName& nameSpace)
{
    out += "<LOCALNAMESPACEPATH>\n";
    const std::string text = base::utf8(nameSpace.getString());
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find('/', start), text.size());
        out += "<NAMESPACE NAME=\"";
        appendEscaped(out, std::string_view(text).substr(start, end - start));
        out += "\"/>\n";
        start = end + 1;
    }
    out += "</LOCALNAMESPACEPATH>\n";
}

void appendReference(std::string& out, const CIMObjectPath& path)
{
    out += "<VALUE.REFERENCE>\n";
    if (path.getNameSpace().isNull()) {
        appendName(out, path);
    } else {
        appendPathIn(out, path);
    }
    out += "</VALUE.REFERENCE>\n";
}

void appendValue(std::string& out, const CIMValue& value)
{
    if (value.isNull()) {
        return;
    }
    visitType(value.getType(), [&](auto tag) {
        using T = typename decltype(tag)::Type;
        if (value.isArray()) {
            appendAll(out, ValueAccess::held<Array<T>>(value));
        } else {
            appendOne(out, ValueAccess::held<T>(value));
        }
    });
}

void appendParamValue(std::string& out, const CIMParamValue& parameter)
{
    const CIMValue value = parameter.getValue();
    out += "<PARAMVALUE";
    appendAttribute(out, "NAME", parameter.getParameterName());
    if (parameter.isTyped()) {
        appendType(out, "PARAMTYPE", value.getType());
    }
    appendEmbeddedMark(out, value.getType());
    out += ">\n";
    appendValue(out, value);
    out += "</PARAMVALUE>\n";
}

void appendReturnValue(std::string& out, const CIMValue& value)
{
    out += "<RETURNVALUE";
    appendType(out, "PARAMTYPE", value.getType());
    appendEmbeddedMark(out, value.getType());
    out += ">\n";
    appendValue(out, value);
    out += "</RETURNVALUE>\n";
}

} // namespace Pegasus::wire

// ---- the one member of the CIM objects that writes XML: it stands above them, with the encoder

namespace Pegasus {

String CIMConstObject::toString() const
{
    if (isUninitialized()) {
        throw UninitializedObjectException();
    }
    std::string text;
    if (isClass()) {
        wire::appendClass(text, fClass);
    } else {
        wire::appendInstance(text, fInstance);
    }
    return base::fromUtf8(text);
}

} // namespace Pegasus
