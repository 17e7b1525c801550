// SPDX-License-Identifier: MIT
#include "pegasus/mof/MemoryHandler.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

namespace Pegasus::mof {

namespace {

std::string keyOf(const CIMName& name)
{
    return base::foldCase(base::utf8(name));
}

void inheritProperties(CIMClass& whole, const CIMConstClass& superClass)
{
    for (Uint32 i = 0; i < superClass.getPropertyCount(); ++i) {
        const CIMConstProperty property = superClass.getProperty(i);
        if (whole.findProperty(property.getName()) == PEG_NOT_FOUND) {
            whole.addProperty(property.clone());
        }
    }
}

} // namespace

void MemoryHandler::useNamespace(const CIMNamespaceName&)
{
    fQualifiers.clear();
    fWholeClasses.clear();
}

bool MemoryHandler::findQualifier(const CIMName& name, CIMQualifierDecl& declaration)
{
    const auto found = fQualifiers.find(keyOf(name));
    if (found != fQualifiers.end()) {
        declaration = found->second;
    }
    return found != fQualifiers.end();
}

bool MemoryHandler::findClass(const CIMName& name, CIMClass& found)
{
    const auto held = fWholeClasses.find(keyOf(name));
    if (held != fWholeClasses.end()) {
        found = held->second;
    }
    return held != fWholeClasses.end();
}

bool MemoryHandler::hasClass(const CIMName& name)
{
    return fWholeClasses.count(keyOf(name)) != 0;
}

void MemoryHandler::declareQualifier(const CIMQualifierDecl& declaration)
{
    fQualifiers[keyOf(declaration.getName())] = declaration;
}

bool MemoryHandler::createClass(const CIMClass& newClass)
{
    const std::string key = keyOf(newClass.getClassName());
    if (hasClass(newClass.getClassName())) {
        return false;
    }
    CIMClass whole = newClass.clone();
    const CIMName& superName = newClass.getSuperClassName();
    if (!superName.isNull()) {
        CIMClass superClass;
        if (!findClass(superName, superClass)) {
            throw CIMException(CIM_ERR_INVALID_SUPERCLASS,
                               String("superclass does not exist: ") + superName.getString());
        }
        inheritProperties(whole, superClass);
    }
    fWholeClasses[key] = whole;
    fClasses.push_back(newClass);
    return true;
}

bool MemoryHandler::createInstance(const CIMInstance& newInstance)
{
    fInstances.push_back(newInstance);
    return true;
}

void MemoryHandler::warn(const std::string& place, const std::string& text)
{
    fWarnings.push_back(place + ": warning: " + text);
}

} // namespace Pegasus::mof
