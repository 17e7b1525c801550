// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/wire/ElementAttributes.h"
#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/XmlText.h"

#include <algorithm>

namespace Pegasus::wire {
namespace {

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

void appendBindingStart(std::string& out, const CIMName& name)
{
    out += "<KEYBINDING";
    appendAttribute(out, "NAME", name.getString());
    out += ">\n";
}

void appendValueStart(std::string& out, CIMKeyBinding::Type type)
{
    out += "<KEYVALUE";
    appendAttribute(out, "VALUETYPE", keyTypeName(type));
    out += '>';
}

// The one key of a path may come without its name (DSP0201, INSTANCENAME).
void appendKeyBinding(std::string& out, const CIMKeyBinding& key, Blanks blanks)
{
    const bool isNamed = !key.getName().isNull();
    if (isNamed) {
        appendBindingStart(out, key.getName());
    }
    if (key.getType() == CIMKeyBinding::REFERENCE) {
        appendReference(out, CIMObjectPath(key.getValue()));
    } else {
        appendValueStart(out, key.getType());
        appendEscaped(out, key.getValue(), blanks);
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

void appendClassName(std::string& out, const CIMName& className)
{
    out += "<CLASSNAME";
    appendAttribute(out, "NAME", className.getString());
    out += "/>\n";
}

void appendInstanceNameStart(std::string& out, const CIMName& className)
{
    out += "<INSTANCENAME";
    appendAttribute(out, "CLASSNAME", className.getString());
    out += ">\n";
}

void appendKeyStart(std::string& out, const CIMName& name, CIMKeyBinding::Type type)
{
    appendBindingStart(out, name);
    appendValueStart(out, type);
}

void appendInstanceName(std::string& out, const CIMObjectPath& path, Blanks blanks)
{
    appendInstanceNameStart(out, path.getClassName());
    const Array<CIMKeyBinding>& keys = path.getKeyBindings();
    for (Uint32 i = 0; i < keys.size(); ++i) {
        appendKeyBinding(out, keys[i], blanks);
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

} // namespace Pegasus::wire
