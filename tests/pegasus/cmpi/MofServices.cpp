// SPDX-License-Identifier: MIT
#include "tests/pegasus/cmpi/MofServices.h"

#include "pegasus/mof/Compiler.h"

#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/Exception.h>

namespace Pegasus::cmpi {

const char* const MofServices::kNameSpace = "root/cimv2";

namespace {

mof::CompileOptions options()
{
    mof::CompileOptions result;
    result.nameSpace = CIMNamespaceName(MofServices::kNameSpace);
    return result;
}

} // namespace

void MofServices::compileFile(const std::string& path)
{
    mof::compileFile(path, options(), fDefinitions);
}

void MofServices::compileText(const std::string& source)
{
    mof::compileText(source, "test.mof", options(), fDefinitions);
}

void MofServices::route(ProviderModule& module, const std::string& provider)
{
    fModule = &module;
    fProvider = provider;
}

ProviderRequest MofServices::request(const std::string& provider)
{
    ProviderRequest result;
    result.provider = provider;
    result.nameSpace = CIMNamespaceName(kNameSpace);
    result.principal = String("tester");
    return result;
}

void MofServices::requireNameSpace(const CIMNamespaceName& nameSpace) const
{
    if (!nameSpace.equal(CIMNamespaceName(kNameSpace))) {
        throw CIMException(CIM_ERR_INVALID_NAMESPACE, nameSpace.getString());
    }
}

CIMClass MofServices::getClass(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    requireNameSpace(nameSpace);
    const std::lock_guard lock(fMutex);
    ++fClassCount;
    CIMClass found;
    if (!fDefinitions.findClass(className, found)) {
        throw CIMException(CIM_ERR_NOT_FOUND, className.getString());
    }
    return found;
}

CIMInstance MofServices::getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                     const CIMPropertyList& properties)
{
    requireNameSpace(nameSpace);
    return fModule->getInstance(request(fProvider), path, properties);
}

Array<CIMInstance> MofServices::enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                   const CIMPropertyList& properties)
{
    requireNameSpace(nameSpace);
    CIMClass known;
    if (!fDefinitions.findClass(className, known)) {
        throw CIMException(CIM_ERR_INVALID_CLASS, className.getString());
    }
    Array<CIMInstance> found;
    fModule->enumerateInstances(request(fProvider), className, properties,
                                [&](const CIMInstance& instance) { found.append(instance); });
    return found;
}

Array<CIMObjectPath> MofServices::enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    requireNameSpace(nameSpace);
    Array<CIMObjectPath> found;
    fModule->enumerateInstanceNames(request(fProvider), className,
                                    [&](const CIMObjectPath& path) { found.append(path); });
    return found;
}

CIMValue MofServices::invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                                   const Array<CIMParamValue>& in, Array<CIMParamValue>& out)
{
    requireNameSpace(nameSpace);
    return fModule->invokeMethod(request(fProvider), path, method, in, out);
}

void MofServices::log(Severity, const std::string& line) noexcept
{
    const std::lock_guard lock(fMutex);
    fLogged.push_back(line);
}

std::vector<std::string> MofServices::logged() const
{
    const std::lock_guard lock(fMutex);
    return fLogged;
}

unsigned MofServices::classCount() const
{
    const std::lock_guard lock(fMutex);
    return fClassCount;
}

std::string text(const String& string)
{
    return static_cast<const char*>(string.getCString());
}

std::string propertyText(const CIMInstance& instance, const char* name)
{
    const Uint32 at = instance.findProperty(CIMName(name));
    if (at == PEG_NOT_FOUND) {
        return "<none>";
    }
    const CIMValue value = instance.getProperty(at).getValue();
    return value.isNull() ? "<null>" : text(value.toString());
}

} // namespace Pegasus::cmpi
