// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/module/ProviderModule.h"
#include "pegasus/cmpi/services/BrokerServices.h"
#include "pegasus/mof/MemoryHandler.h"

#include <functional>
#include <mutex>
#include <string>
#include <vector>

namespace Pegasus::cmpi {

// The server's side for broker tests: classes from MOF in one namespace (root/cimv2). Upcalls go to the module that the
// test names. Counts the classes that it was asked for.
// Thread: all members except compile and route may be called on any thread.
class MofServices : public BrokerServices
{
  public:
    static const char* const kNameSpace;

    void compileFile(const std::string& path);
    void compileText(const std::string& text);

    // Sets the provider to which upcalls go.
    void route(ProviderModule& module, const std::string& provider);
    static ProviderRequest request(const std::string& provider);

    CIMClass getClass(const CIMNamespaceName& nameSpace, const CIMName& className) override;
    CIMInstance getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                            const CIMPropertyList& properties) override;
    Array<CIMInstance> enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                          const CIMPropertyList& properties) override;
    Array<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className) override;
    CIMValue invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                          const Array<CIMParamValue>& in, Array<CIMParamValue>& out) override;
    bool strictProviders() const override { return strict; }
    void log(Severity severity, const std::string& text) noexcept override;

    std::vector<std::string> logged() const;
    unsigned classCount() const;

    bool strict = false;

  private:
    void requireNameSpace(const CIMNamespaceName& nameSpace) const;

    mof::MemoryHandler fDefinitions;
    ProviderModule* fModule = nullptr;
    std::string fProvider;
    mutable std::mutex fMutex;
    std::vector<std::string> fLogged;
    unsigned fClassCount = 0;
};

// Texts of delivered values.
std::string text(const String& string);
// Returns: the property's value as text ("<null>", "<none>" when the instance lacks it).
std::string propertyText(const CIMInstance& instance, const char* name);

} // namespace Pegasus::cmpi
