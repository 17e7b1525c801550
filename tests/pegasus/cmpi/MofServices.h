#pragma once

#include "pegasus/cmpi/module/ProviderModule.h"
#include "pegasus/cmpi/services/BrokerServices.h"
#include "pegasus/mof/MemoryHandler.h"

#include <functional>
#include <mutex>
#include <string>
#include <vector>

namespace Pegasus::cmpi {

// The server's side for broker tests: classes from MOF, one name space (root/cimv2), upcalls answered by the module
// that the test routes them to. Counts what it was asked. Thread: all members but the set-up.
class MofServices : public BrokerServices
{
  public:
    static const char* const kNameSpace;

    void compileFile(const std::string& path);
    void compileText(const std::string& text);

    // Upcalls go to this provider, as a server would pass them on.
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
    void log(Severity severity, const std::string& text) noexcept override;

    std::vector<std::string> logged() const;
    unsigned classCount() const;

  private:
    void requireNameSpace(const CIMNamespaceName& nameSpace) const;

    mof::MemoryHandler fDefinitions;
    ProviderModule* fModule = nullptr;
    std::string fProvider;
    mutable std::mutex fMutex;
    std::vector<std::string> fLogged;
    unsigned fClassCount = 0;
};

// Helpers for looking at what was delivered.
std::string text(const String& string);
// Returns: the property's value as text ("<null>", "<none>" when the instance lacks it).
std::string propertyText(const CIMInstance& instance, const char* name);

} // namespace Pegasus::cmpi
