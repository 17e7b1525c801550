// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/BrokerServices.h"
#include "pegasus/cmpi/services/ProviderRequest.h"

#include <memory>
#include <string>

namespace Pegasus::cmpi {

class PropertyFilter;
class ResultObject;

// One vendor library and the providers in it, driven through CMPI.
//
// The constructor loads the library. A provider's instance or method interface is made at its first request and kept.
// The paths of delivered instances, and delivered paths, consist of class and keys.
//
// Throws: CIMException with the provider's status code, whether CIM knows it or not, and its text. Also
//     CIM_ERR_FAILED: "ProviderLoadFailure: ..." when the library lacks entry points for the provider, and
//     "ProviderInitFailure: ..." when its factory fails (the next request tries again).
// Thread: every member except the destructor may be called on several threads at once. The provider runs on the
//     caller's thread.
// Blocks: as long as the provider.
class ProviderModule
{
  public:
    enum class Cleanup
    {
        kReleased,   // every interface has ended; a later request makes new ones
        kBusy,       // a request is running: ask again later
        kStayLoaded, // a provider asked to stay for now: ask again later
        kNeverUnload // a provider asked to stay until the end: do not ask again
    };

    // Requires: `services` outlives the module.
    // Throws: CIM_ERR_FAILED "ProviderLoadFailure: (<path>) Cannot load library, error: <the loader's message>".
    ProviderModule(const std::string& moduleName, const std::string& libraryPath, BrokerServices& services);

    // Ends the interfaces by cleanup(terminating), whatever they answer, then unloads the library.
    // Requires: all requests have ended.
    ~ProviderModule();

    ProviderModule(const ProviderModule&) = delete;
    ProviderModule& operator=(const ProviderModule&) = delete;

    const std::string& name() const;

    // Passes every instance to the sink as soon as the provider returns it, with the listed properties only. The
    // provider may still fail after that. An exception of the sink ends the enumeration: the provider's further
    // instances are refused, and the exception leaves after the provider has returned.
    // The provider sees one class. For a superclass's properties of subclass instances, the caller passes them as list.
    void enumerateInstances(const ProviderRequest& request, const CIMName& className, const CIMPropertyList& properties,
                            const InstanceSink& sink);
    // The same, with every instance written as VALUE.NAMEDINSTANCE, and no objects made in between.
    void writeInstances(const ProviderRequest& request, const CIMName& className, const CIMPropertyList& properties,
                        const InstanceTextSink& sink);
    void enumerateInstanceNames(const ProviderRequest& request, const CIMName& className, const PathSink& sink);

    // Throws: CIM_ERR_NOT_FOUND also when the provider returns nothing.
    CIMInstance getInstance(const ProviderRequest& request, const CIMObjectPath& path,
                            const CIMPropertyList& properties);

    // Returns: the path that the provider returns.
    // Throws: CIM_ERR_FAILED also when it returns none.
    CIMObjectPath createInstance(const ProviderRequest& request, const CIMInstance& instance);
    // `modified` has its path. A null list stands for all properties that it has: the provider gets their names.
    void modifyInstance(const ProviderRequest& request, const CIMInstance& modified, const CIMPropertyList& properties);
    void deleteInstance(const ProviderRequest& request, const CIMObjectPath& path);

    // Replaces `out`.
    // Returns: a null value when the provider returns none.
    CIMValue invokeMethod(const ProviderRequest& request, const CIMObjectPath& path, const CIMName& method,
                          const Array<CIMParamValue>& in, Array<CIMParamValue>& out);

    // Asks the interfaces of an idle module to clean up and ends those that agree.
    Cleanup cleanupWhenIdle();

  private:
    void enumerate(const ProviderRequest& request, const CIMName& className, PropertyFilter& filter,
                   ResultObject& result);

    class Impl;
    std::unique_ptr<Impl> fImpl;
};

} // namespace Pegasus::cmpi
