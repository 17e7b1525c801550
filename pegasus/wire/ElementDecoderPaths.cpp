// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMObjectPathRep.h"
#include "pegasus/wire/ElementDecoder.h"

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;

XmlElement childOf(const XmlElement& element, std::string_view name)
{
    const XmlElement child = element.firstChild();
    if (!child.is(name)) {
        (child ? child : element).fail(Kind::kInvalid, "expected " + std::string(name) + " element");
    }
    return child;
}

// Returns: the next sibling, which must be there and be the last.
XmlElement lastAfter(const XmlElement& child)
{
    const XmlElement last = child.nextSibling();
    if (!last) {
        child.fail(Kind::kInvalid, "missing element after " + std::string(child.name()) + " element");
    }
    if (const XmlElement more = last.nextSibling()) {
        more.fail(Kind::kInvalid, "unexpected " + std::string(more.name()) + " element");
    }
    return last;
}

CIMKeyBinding::Type keyType(const XmlElement& element, XmlAttribute valueType)
{
    if (!valueType || *valueType == "string") {
        return CIMKeyBinding::STRING;
    }
    if (*valueType == "boolean") {
        return CIMKeyBinding::BOOLEAN;
    }
    if (*valueType == "numeric") {
        return CIMKeyBinding::NUMERIC;
    }
    element.fail(Kind::kSemantic, "Illegal value for KEYVALUE.VALUETYPE attribute");
}

} // namespace

CIMName ElementDecoder::decodeClassName(const XmlElement& element)
{
    element.expectName("CLASSNAME");
    XmlAttribute values[1];
    element.attributes({"NAME"}, values);
    element.expectNoChildren();
    fDecodedBytes += sizeof(CIMName);
    return nameAttribute(element, "NAME", values[0]);
}

// KEYVALUE or VALUE.REFERENCE
CIMKeyBinding ElementDecoder::decodeKey(const XmlElement& element, const CIMName& name)
{
    countObject(sizeof(CIMKeyBindingRep));
    if (!element.is("KEYVALUE")) {
        const String path = decodeReference(element).toString();
        countText(path.size());
        return CIMKeyBinding(name, path, CIMKeyBinding::REFERENCE);
    }
    XmlAttribute values[2];
    element.attributes({"VALUETYPE", "TYPE"}, values);
    const CIMKeyBinding::Type type = keyType(element, values[0]);
    return CIMKeyBinding(name, toString(element, element.text(fScratch)), type);
}

CIMKeyBinding ElementDecoder::decodeKeyBinding(const XmlElement& element)
{
    XmlAttribute values[1];
    element.attributes({"NAME"}, values);
    const CIMName name = nameAttribute(element, "NAME", values[0]);
    return decodeKey(element.onlyChild(), name);
}

CIMObjectPath ElementDecoder::decodeInstanceName(const XmlElement& element)
{
    return decodeNameIn(element, String(), CIMNamespaceName());
}

// INSTANCENAME or CLASSNAME, at that place.
CIMObjectPath ElementDecoder::decodeNameIn(const XmlElement& element, const String& host,
                                           const CIMNamespaceName& nameSpace)
{
    countObject(sizeof(CIMObjectPathRep));
    if (element.is("CLASSNAME")) {
        return CIMObjectPath(host, nameSpace, decodeClassName(element));
    }
    element.expectName("INSTANCENAME");
    XmlAttribute values[1];
    element.attributes({"CLASSNAME"}, values);
    const CIMName className = nameAttribute(element, "CLASSNAME", values[0]);
    Array<CIMKeyBinding> keys;
    XmlElement child = element.firstChild();
    for (; child.is("KEYBINDING"); child = child.nextSibling()) {
        if (keys.size() == fLimits.maxKeyBindings) {
            child.fail(Kind::kTooLarge, "more than " + std::to_string(fLimits.maxKeyBindings) + " key bindings");
        }
        keys.append(decodeKeyBinding(child));
    }
    // A single key may omit its name.
    if (child && keys.size() == 0 && !child.nextSibling()) {
        keys.append(decodeKey(child, CIMName()));
        child = XmlElement();
    }
    if (child) {
        child.failIn(element);
    }
    countList(keys);
    return CIMObjectPath(host, nameSpace, className, keys);
}

CIMNamespaceName ElementDecoder::decodeLocalNamespacePath(const XmlElement& element)
{
    element.expectName("LOCALNAMESPACEPATH");
    std::string text;
    XmlElement child = childOf(element, "NAMESPACE");
    for (; child; child = child.nextSibling()) {
        child.expectName("NAMESPACE");
        child.expectNoChildren();
        XmlAttribute values[1];
        child.attributes({"NAME"}, values);
        text += (text.empty() ? "" : "/");
        base::appendUtf8(text, nameAttribute(child, "NAME", values[0]).getString());
    }
    return CIMNamespaceName(toString(element, text));
}

CIMObjectPath ElementDecoder::decodeObjectPath(const XmlElement& element)
{
    if (element.is("INSTANCENAME") || element.is("CLASSNAME")) {
        return decodeNameIn(element, String(), CIMNamespaceName());
    }
    if (element.is("LOCALINSTANCEPATH") || element.is("LOCALCLASSPATH")) {
        const XmlElement nameSpace = childOf(element, "LOCALNAMESPACEPATH");
        return decodeNameIn(lastAfter(nameSpace), String(), decodeLocalNamespacePath(nameSpace));
    }
    if (!element.is("INSTANCEPATH") && !element.is("CLASSPATH")) {
        element.fail(Kind::kInvalid, "expected an object path, got " + std::string(element.name()) + " element");
    }
    const XmlElement location = childOf(element, "NAMESPACEPATH");
    const XmlElement hostElement = childOf(location, "HOST");
    const String host = toString(hostElement, hostElement.text(fScratch));
    const CIMNamespaceName nameSpace = decodeLocalNamespacePath(lastAfter(hostElement));
    try {
        return decodeNameIn(lastAfter(location), host, nameSpace);
    } catch (const MalformedObjectNameException&) {
        hostElement.fail(Kind::kSemantic, "Illegal value for HOST element");
    }
}

CIMObjectPath ElementDecoder::decodeReference(const XmlElement& element)
{
    element.expectName("VALUE.REFERENCE");
    return decodeObjectPath(element.onlyChild());
}

} // namespace Pegasus::wire
