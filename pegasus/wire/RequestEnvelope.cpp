// SPDX-License-Identifier: MIT
#include "pegasus/wire/RequestEnvelope.h"

#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/XmlText.h"

#include <Pegasus/Common/Exception.h>

namespace Pegasus::wire {

IntrinsicCall::IntrinsicCall(std::string_view method, const CIMNamespaceName& nameSpace)
    : fMethod(method), fNameSpace(nameSpace)
{
    if (nameSpace.isNull()) {
        throw InvalidNamespaceNameException(String());
    }
    fElement.append("<IMETHODCALL NAME=\"").append(method).append("\">\n");
    appendLocalNamespacePath(fElement, nameSpace);
}

void IntrinsicCall::open(std::string_view parameter)
{
    fElement.append("<IPARAMVALUE NAME=\"").append(parameter).append("\">\n");
}

void IntrinsicCall::close()
{
    fElement += "</IPARAMVALUE>\n";
}

IntrinsicCall& IntrinsicCall::className(std::string_view parameter, const CIMName& name)
{
    if (name.isNull()) {
        return *this;
    }
    open(parameter);
    appendClassName(fElement, name);
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::instanceName(const CIMObjectPath& path)
{
    open("InstanceName");
    appendInstanceName(fElement, path);
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::flag(std::string_view parameter, Boolean value, Boolean ifMissing)
{
    if (value == ifMissing) {
        return *this;
    }
    open(parameter);
    fElement.append("<VALUE>").append(value ? "TRUE" : "FALSE").append("</VALUE>\n");
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::text(std::string_view parameter, const String& value)
{
    open(parameter);
    fElement += "<VALUE>";
    appendEscaped(fElement, value);
    fElement += "</VALUE>\n";
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::propertyList(const CIMPropertyList& list)
{
    if (list.isNull()) {
        return *this;
    }
    open("PropertyList");
    fElement += "<VALUE.ARRAY>\n";
    for (Uint32 i = 0; i < list.size(); ++i) {
        fElement += "<VALUE>";
        appendEscaped(fElement, list[i].getString());
        fElement += "</VALUE>\n";
    }
    fElement += "</VALUE.ARRAY>\n";
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::newClass(const CIMClass& cimClass)
{
    open("NewClass");
    appendClass(fElement, cimClass);
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::newInstance(const CIMInstance& instance)
{
    open("NewInstance");
    appendInstance(fElement, instance);
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::modifiedInstance(const CIMInstance& instance)
{
    open("ModifiedInstance");
    appendNamedInstance(fElement, instance);
    close();
    return *this;
}

IntrinsicCall& IntrinsicCall::qualifierDeclaration(const CIMQualifierDecl& declaration)
{
    open("QualifierDeclaration");
    appendQualifierDeclaration(fElement, declaration);
    close();
    return *this;
}

std::string IntrinsicCall::finish()
{
    fElement += "</IMETHODCALL>\n";
    return std::move(fElement);
}

std::string encodeMethodCall(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                             const Array<CIMParamValue>& parameters)
{
    std::string element = "<METHODCALL NAME=\"";
    appendEscaped(element, method.getString());
    element += "\">\n";
    if (path.getKeyBindings().size() > 0) {
        appendLocalInstancePath(element, nameSpace, path);
    } else {
        appendLocalClassPath(element, nameSpace, path.getClassName());
    }
    for (Uint32 i = 0; i < parameters.size(); ++i) {
        appendParamValue(element, parameters[i]);
    }
    element += "</METHODCALL>\n";
    return element;
}

std::string encodeRequestMessage(std::string_view messageId, std::string_view call)
{
    std::string out;
    out.reserve(call.size() + 256);
    out += "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n"
           "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n<MESSAGE ID=\"";
    out += messageId;
    out += "\" PROTOCOLVERSION=\"1.0\">\n<SIMPLEREQ>\n";
    out += call;
    out += "</SIMPLEREQ>\n</MESSAGE>\n</CIM>\n";
    return out;
}

} // namespace Pegasus::wire
