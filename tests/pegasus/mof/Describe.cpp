// SPDX-License-Identifier: MIT
#include "tests/pegasus/mof/Describe.h"

using namespace Pegasus;

namespace mof_test {

namespace {

std::string typeText(CIMType type, bool isArray, Uint32 arraySize, const CIMName& referenceClass)
{
    std::string text = type == CIMTYPE_REFERENCE ? utf8(referenceClass.getString()) + " ref" : cimTypeToString(type);
    if (isArray) {
        text += "[" + (arraySize ? std::to_string(arraySize) : std::string()) + "]";
    }
    return text;
}

std::string valueText(const CIMValue& value)
{
    return value.isNull() ? "null" : "<" + utf8(value.toString()) + ">";
}

std::string flavorText(const CIMFlavor& flavor)
{
    const std::string words = utf8(flavor.toString());
    return words.empty() ? "" : ":" + words;
}

std::string propagatedText(bool isPropagated)
{
    return isPropagated ? "~" : "";
}

std::string originText(const CIMName& origin)
{
    return origin.isNull() ? "" : "@" + utf8(origin.getString());
}

template <typename Owner> std::string qualifiersText(const Owner& owner)
{
    std::string text;
    for (Uint32 i = 0; i < owner.getQualifierCount(); ++i) {
        const CIMConstQualifier qualifier = owner.getQualifier(i);
        text += (i == 0 ? "[" : ", ") + propagatedText(qualifier.getPropagated() != 0) +
                utf8(qualifier.getName().getString()) + "=" + valueText(qualifier.getValue()) +
                flavorText(qualifier.getFlavor());
    }
    return text.empty() ? "" : text + "] ";
}

std::string describe(const CIMConstProperty& property)
{
    return propagatedText(property.getPropagated()) + qualifiersText(property) +
           typeText(property.getType(), property.isArray(), property.getArraySize(), property.getReferenceClassName()) +
           " " + utf8(property.getName().getString()) + originText(property.getClassOrigin()) + "=" +
           valueText(property.getValue()) + "; ";
}

std::string describe(const CIMConstParameter& parameter)
{
    return qualifiersText(parameter) +
           typeText(parameter.getType(), parameter.isArray(), parameter.getArraySize(),
                    parameter.getReferenceClassName()) +
           " " + utf8(parameter.getName().getString());
}

std::string describe(const CIMConstMethod& method)
{
    std::string text = propagatedText(method.getPropagated()) + qualifiersText(method) +
                       cimTypeToString(method.getType()) + " " + utf8(method.getName().getString()) +
                       originText(method.getClassOrigin()) + "(";
    for (Uint32 i = 0; i < method.getParameterCount(); ++i) {
        text += (i == 0 ? "" : ", ") + describe(method.getParameter(i));
    }
    return text + "); ";
}

} // namespace

std::string utf8(const String& text)
{
    return std::string(text.getCString());
}

std::string describe(const CIMConstQualifierDecl& declaration)
{
    return "qualifier " + utf8(declaration.getName().getString()) + " " +
           typeText(declaration.getType(), declaration.isArray(), declaration.getArraySize(), CIMName()) + "=" +
           valueText(declaration.getValue()) + " scope(" + utf8(declaration.getScope().toString()) + ") flavor(" +
           utf8(declaration.getFlavor().toString()) + ")";
}

std::string describe(const CIMConstClass& cimClass)
{
    std::string text = qualifiersText(cimClass) + "class " + utf8(cimClass.getClassName().getString());
    if (!cimClass.getSuperClassName().isNull()) {
        text += " : " + utf8(cimClass.getSuperClassName().getString());
    }
    text += " { ";
    for (Uint32 i = 0; i < cimClass.getPropertyCount(); ++i) {
        text += describe(cimClass.getProperty(i));
    }
    for (Uint32 i = 0; i < cimClass.getMethodCount(); ++i) {
        text += describe(cimClass.getMethod(i));
    }
    return text + "}";
}

std::string describe(const CIMConstInstance& instance)
{
    std::string text = "instance " + utf8(instance.getClassName().getString()) + " { ";
    for (Uint32 i = 0; i < instance.getPropertyCount(); ++i) {
        text += describe(instance.getProperty(i));
    }
    return text + "}";
}

} // namespace mof_test
