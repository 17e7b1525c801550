#pragma once

#include "pegasus/cmpi/BrokerServices.h"

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace Pegasus::cmpi {

// What accompanies every request to a provider.
struct ProviderRequest
{
    std::string provider; // PG_Provider.Name, byte for byte: the prefix of the library's entry points
    CIMNamespaceName nameSpace;
    String principal;       // the caller's user name
    String acceptLanguages; // may be empty
    bool includeQualifiers = false;
    bool includeClassOrigin = false;
};

// One vendor library and the providers in it, driven through CMPI.
//
// The library is loaded by the constructor. A provider's instance or method interface is made at its first request and
// kept. Delivered instances and paths are the caller's; their paths carry class and keys, no host and no namespace.
//
// Throws: CIMException with the provider's status code and text (codes beyond CIM's become CIM_ERR_FAILED); with
//     CIM_ERR_FAILED, "ProviderLoadFailure: ..." when the library has no entry points for the provider, and
//     "ProviderInitFailure: ..." when its factory fails (the next request tries again).
// Thread: every member but the destructor may be called on several threads at once; the provider runs on the caller's.
// Blocks: as long as the provider does.
class ProviderModule
{
  public:
    using InstanceSink = std::function<void(const CIMInstance&)>;
    using PathSink = std::function<void(const CIMObjectPath&)>;

    enum class Cleanup
    {
        kReleased,   // every interface has been let go; a later request makes new ones
        kBusy,       // a request is running: ask again later
        kStayLoaded, // a provider asked to stay for now: ask again later
        kNeverUnload // a provider asked to stay until the end: do not ask again
    };

    // Throws: CIM_ERR_FAILED "ProviderLoadFailure: (<path>) Cannot load library, error: <the loader's words>".
    // Requires: `services` outlives the module.
    ProviderModule(const std::string& moduleName, const std::string& libraryPath, BrokerServices& services);

    // Ends the interfaces with cleanup(terminating) whatever they answer, then unloads the library.
    // Requires: no request is running.
    ~ProviderModule();

    ProviderModule(const ProviderModule&) = delete;
    ProviderModule& operator=(const ProviderModule&) = delete;

    const std::string& name() const;

    // Every instance goes to the sink as soon as the provider returns it, cut down to `properties`. An error after that
    // is thrown all the same. An exception of the sink ends the enumeration: the provider is refused further instances,
    // and when it has returned, the exception leaves. Enumerations see one class: a caller that cuts subclasses down to
    // a superclass's properties passes those as the list.
    void enumerateInstances(const ProviderRequest& request, const CIMName& className, const CIMPropertyList& properties,
                            const InstanceSink& sink);
    void enumerateInstanceNames(const ProviderRequest& request, const CIMName& className, const PathSink& sink);

    // Throws: CIM_ERR_NOT_FOUND also when the provider returns nothing.
    CIMInstance getInstance(const ProviderRequest& request, const CIMObjectPath& path,
                            const CIMPropertyList& properties);

    // `out` is replaced. A null return value is an error of the provider: CIM_ERR_FAILED.
    CIMValue invokeMethod(const ProviderRequest& request, const CIMObjectPath& path, const CIMName& method,
                          const Array<CIMParamValue>& in, Array<CIMParamValue>& out);

    // Asks the idle module's interfaces, in order of kind, whether they may go, and lets them go if all agree.
    Cleanup cleanupWhenIdle();

  private:
    class Impl;
    std::unique_ptr<Impl> fImpl;
};

// Finds the file that a PG_ProviderModule's Location names: lib<location>.so in the first directory that has it.
// Throws: CIM_ERR_FAILED `File "lib<location>.so" was not found for provider module "<module>".`
std::string findProviderLibrary(const std::vector<std::string>& directories, const std::string& location,
                                const std::string& moduleName);

} // namespace Pegasus::cmpi
