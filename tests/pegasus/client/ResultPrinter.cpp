// SPDX-License-Identifier: MIT
#include "tests/pegasus/client/ResultPrinter.h"

#include <cstdlib>
#include <memory>
#include <typeinfo>

#include <cxxabi.h>

using namespace Pegasus;

namespace test {
namespace {

std::string utf8(const String& text)
{
    return std::string(text.getCString());
}

std::string utf8(const CIMName& name)
{
    return utf8(name.getString());
}

std::string typeText(CIMType type, bool isArray)
{
    return cimTypeToString(type) + std::string(isArray ? "[]" : "");
}

std::string valueText(const CIMValue& value)
{
    return value.isNull() ? "NULL" : utf8(value.toString());
}

template <typename Holder> std::string qualifierList(const Holder& holder)
{
    std::string out;
    for (Uint32 i = 0; i < holder.getQualifierCount(); ++i) {
        const CIMConstQualifier qualifier = holder.getQualifier(i);
        out += utf8(qualifier.getName()) + "(" + utf8(qualifier.getFlavor().toString()) + "," +
               std::to_string(qualifier.getPropagated()) + ") ";
    }
    return out;
}

std::string printParameter(const CIMConstParameter& parameter)
{
    std::string out = utf8(parameter.getName()) + ":" + cimTypeToString(parameter.getType()) +
                      std::to_string(parameter.isArray()) + "{";
    for (Uint32 i = 0; i < parameter.getQualifierCount(); ++i) {
        out += utf8(parameter.getQualifier(i).getName()) + "=" + valueText(parameter.getQualifier(i).getValue()) + " ";
    }
    return out + "} ";
}

} // namespace

std::string printClass(const CIMClass& cimClass)
{
    std::string out = utf8(cimClass.getClassName()) + " super " + utf8(cimClass.getSuperClassName()) + " props " +
                      std::to_string(cimClass.getPropertyCount()) + " methods " +
                      std::to_string(cimClass.getMethodCount()) + " quals " +
                      std::to_string(cimClass.getQualifierCount()) + " path " + utf8(cimClass.getPath().toString()) +
                      " assoc " + std::to_string(cimClass.isAssociation());
    for (Uint32 i = 0; i < cimClass.getPropertyCount(); ++i) {
        const CIMConstProperty property = static_cast<const CIMConstClass&>(cimClass).getProperty(i);
        out += "\n  P " + utf8(property.getName()) + " " + typeText(property.getType(), property.isArray()) + " " +
               std::to_string(property.getArraySize()) + " def=" + valueText(property.getValue()) +
               " origin=" + utf8(property.getClassOrigin()) + " prop=" + std::to_string(property.getPropagated()) +
               " ref=" + utf8(property.getReferenceClassName()) + " q=" + qualifierList(property);
    }
    for (Uint32 i = 0; i < cimClass.getMethodCount(); ++i) {
        const CIMConstMethod method = static_cast<const CIMConstClass&>(cimClass).getMethod(i);
        out += "\n  M " + utf8(method.getName()) + " " + cimTypeToString(method.getType()) + " params ";
        for (Uint32 p = 0; p < method.getParameterCount(); ++p) {
            out += printParameter(method.getParameter(p));
        }
    }
    return out;
}

std::string printInstances(const Array<CIMInstance>& instances)
{
    std::string out = std::to_string(instances.size()) + " instances";
    for (Uint32 i = 0; i < instances.size(); ++i) {
        const CIMConstInstance& instance = instances[i];
        out += "\n I " + utf8(instance.getPath().toString());
        for (Uint32 p = 0; p < instance.getPropertyCount(); ++p) {
            const CIMConstProperty property = instance.getProperty(p);
            const std::string value = property.getValue().isNull() ? " NULL" : " = " + valueText(property.getValue());
            out += "\n   " + utf8(property.getName()) + " " + typeText(property.getType(), property.isArray()) + value +
                   " origin=" + utf8(property.getClassOrigin()) +
                   " propagated=" + std::to_string(property.getPropagated()) +
                   " q=" + std::to_string(property.getQualifierCount()) +
                   " ref=" + utf8(property.getReferenceClassName());
        }
    }
    return out;
}

std::string printInstanceSummary(const CIMInstance& instance)
{
    return utf8(instance.getClassName()) + " props " + std::to_string(instance.getPropertyCount());
}

std::string printPaths(const Array<CIMObjectPath>& paths)
{
    std::string out = std::to_string(paths.size());
    for (Uint32 i = 0; i < paths.size(); ++i) {
        out += "\n " + utf8(paths[i].toString());
    }
    return out;
}

std::string printNames(const Array<CIMName>& names)
{
    std::string out = std::to_string(names.size()) + "\n";
    for (Uint32 i = 0; i < names.size(); ++i) {
        out += " " + utf8(names[i]);
    }
    return out;
}

std::string printQualifier(const CIMQualifierDecl& declaration)
{
    return utf8(declaration.getName()) + " " + typeText(declaration.getType(), declaration.isArray()) +
           " value=" + valueText(declaration.getValue()) + " scope=" + utf8(declaration.getScope().toString()) +
           " flavor=" + utf8(declaration.getFlavor().toString()) +
           " asize=" + std::to_string(declaration.getArraySize());
}

std::string printQualifiers(const Array<CIMQualifierDecl>& declarations)
{
    std::string out = std::to_string(declarations.size());
    for (Uint32 i = 0; i < declarations.size(); ++i) {
        const CIMQualifierDecl& declaration = declarations[i];
        out += "\n  " + utf8(declaration.getName()) + " " + cimTypeToString(declaration.getType()) +
               " scope=" + utf8(declaration.getScope().toString()) +
               " flavor=" + utf8(declaration.getFlavor().toString());
    }
    return out;
}

std::string printMethodResult(const CIMValue& result, const Array<CIMParamValue>& outputs)
{
    std::string out = "ret " + typeText(result.getType(), result.isArray()) + " " + valueText(result);
    for (Uint32 i = 0; i < outputs.size(); ++i) {
        const CIMValue value = outputs[i].getValue();
        out += "\n  out " + utf8(outputs[i].getParameterName()) + " " + typeText(value.getType(), value.isArray()) +
               " " + valueText(value) + " typed=" + std::to_string(outputs[i].isTyped());
    }
    return out;
}

std::string printException(const Exception& exception)
{
    const std::unique_ptr<char, decltype(&std::free)> name(
        abi::__cxa_demangle(typeid(exception).name(), nullptr, nullptr, nullptr), &std::free);
    std::string out = std::string("EXC ") + name.get();
    if (const auto* status = dynamic_cast<const CIMException*>(&exception)) {
        out += " code=" + std::to_string(status->getCode());
    }
    if (const auto* http = dynamic_cast<const CIMClientHTTPErrorException*>(&exception)) {
        out += " http=" + std::to_string(http->getCode()) + " cimError=" + utf8(http->getCIMError()) +
               " detail=" + utf8(http->getCIMErrorDetail());
    }
    return out + " msg=" + utf8(exception.getMessage());
}

} // namespace test
