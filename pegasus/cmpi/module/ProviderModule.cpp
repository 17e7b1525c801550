// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/module/ProviderModule.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/broker/BrokerTables.h"
#include "pegasus/cmpi/module/ProviderInterfaces.h"
#include "pegasus/cmpi/module/ProviderLibrary.h"
#include "pegasus/cmpi/module/VendorCall.h"
#include "pegasus/cmpi/objects/ArgsObject.h"
#include "pegasus/cmpi/objects/ContextObject.h"
#include "pegasus/cmpi/objects/Habits.h"
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/objects/ObjectPathObject.h"
#include "pegasus/cmpi/objects/ResultObject.h"

#include <Pegasus/Common/Exception.h>

#include <optional>

#include <unistd.h>

namespace Pegasus::cmpi {
namespace {

// Requires: the frame of the call that returned the status is still open, since it owns the message.
void throwUnlessOk(const CMPIStatus& status)
{
    if (status.rc == CMPI_RC_OK) {
        return;
    }
    const bool hasText = status.msg != nullptr && status.msg->hdl != nullptr;
    // A code that CIM lacks is passed on, as in OpenPegasus: clients see the number.
    throw CIMException(static_cast<CIMStatusCode>(status.rc),
                       hasText ? base::fromUtf8Repaired(static_cast<const char*>(status.msg->hdl)) : String::EMPTY);
}

CIMException notServed(const ProviderRequest& request, CIMStatusCode code, const char* slot)
{
    return {code, base::fromUtf8Repaired("provider " + request.provider + " does not implement " + slot)};
}

// Providers find it in the paths that they get.
const String& machineName()
{
    static const String kName = [] {
        char name[256] = "";
        ::gethostname(name, sizeof name - 1);
        return base::fromUtf8Repaired(name);
    }();
    return kName;
}

// Reports the habit. Throws: CIMException with strict providers.
void requireTolerance(Habit habit, Broker& broker, const ProviderRequest& request)
try {
    tolerate(habit, broker, request.provider);
} catch (const CmpiError& error) {
    throw CIMException(CIM_ERR_FAILED, base::fromUtf8Repaired(error.text));
}

template <typename Object> Object& asArgument(Object& object)
{
    object.lifetime = Lifetime::kArgument;
    return object;
}

} // namespace

class ProviderModule::Impl
{
  public:
    Impl(std::string moduleName, const std::string& path, BrokerServices& services)
        : name(std::move(moduleName)), broker(services, brokerTables()), library(path), interfaces(library, broker)
    {
    }

    std::string name;
    Broker broker; // declared before the library, which keeps its address until it is unloaded
    ProviderLibrary library;
    ProviderInterfaces interfaces;
};

namespace {

// One call into a provider: its frame, its arguments and its result. The order of the members matters: the interface
// may end only after everything else.
class Call
{
  public:
    Call(Broker& owner, ProviderInterfaces& interfaces, const ProviderRequest& request, const CIMObjectPath& target,
         ResultObject& resultObject)

        : fUse(interfaces),
          fContext(owner, request, owner.nesting().depthOf(owner.classes(), request.nameSpace, target.getClassName())),
          fFrame(fContext.origin), fPath(owner, placed(target, request.nameSpace)), fResult(resultObject)
    {
        owner.classes().beginRequest();
        asArgument(fContext);
        asArgument(fPath);
        if (fContext.origin->depth >= UpcallNesting::kHangs) {
            requireTolerance(Habit::kNestedUpcalls, owner, request);
        }
    }

    const CMPIContext* context() const { return &fContext; }
    const CMPIObjectPath* path() const { return &fPath; }
    const CMPIResult* result() const { return &fResult; }

    // Runs the provider's function.
    // Throws: the sink's exception, which takes precedence over the provider's status; else that status if it differs
    //     from OK.
    template <typename Function, typename... Arguments> void run(Function* function, Arguments... arguments) const
    {
        const CMPIStatus status =
            callVendor([&] { return function(arguments...); },
                       [](const char* reason) { throw CIMException(CIM_ERR_FAILED, base::fromUtf8Repaired(reason)); });
        fResult.rethrow();
        throwUnlessOk(status);
    }

  private:
    static CIMObjectPath placed(CIMObjectPath path, const CIMNamespaceName& nameSpace)
    {
        path.setNameSpace(nameSpace);
        path.setHost(machineName());
        return path;
    }

    ProviderInterfaces::Use fUse;
    ContextObject fContext;
    Frame fFrame;
    ObjectPathObject fPath;
    ResultObject& fResult;
};

// The list that a provider gets when the client gave none.
CIMPropertyList propertiesOf(const CIMInstance& instance)
{
    Array<CIMName> names;
    for (Uint32 i = 0; i < instance.getPropertyCount(); ++i) {
        names.append(instance.getProperty(i).getName());
    }
    return {names};
}

CIMObjectPath classPath(const CIMName& className)
{
    return {String::EMPTY, CIMNamespaceName(), className};
}

} // namespace

ProviderModule::ProviderModule(const std::string& moduleName, const std::string& libraryPath, BrokerServices& services)
    : fImpl(std::make_unique<Impl>(moduleName, libraryPath, services))
{
}

ProviderModule::~ProviderModule() = default;

const std::string& ProviderModule::name() const
{
    return fImpl->name;
}

void ProviderModule::enumerateInstances(const ProviderRequest& request, const CIMName& className,
                                        const CIMPropertyList& properties, const InstanceSink& sink)
{
    PropertyFilter filter(properties);
    ResultObject result(filter, sink, nullptr, nullptr);
    enumerate(request, className, filter, result);
}

void ProviderModule::writeInstances(const ProviderRequest& request, const CIMName& className,
                                    const CIMPropertyList& properties, const InstanceTextSink& sink)
{
    PropertyFilter filter(properties);
    ResultObject result(filter, sink);
    enumerate(request, className, filter, result);
}

void ProviderModule::enumerate(const ProviderRequest& request, const CIMName& className, PropertyFilter& filter,
                               ResultObject& result)
{
    const Call call(fImpl->broker, fImpl->interfaces, request, classPath(className), result);
    CMPIInstanceMI& mi = fImpl->interfaces.instance(request.provider);
    if (mi.ft->enumerateInstances == nullptr) {
        throw notServed(request, CIM_ERR_NOT_SUPPORTED, "enumerateInstances");
    }
    call.run(mi.ft->enumerateInstances, &mi, call.context(), call.result(), call.path(), filter.names());
}

void ProviderModule::enumerateInstanceNames(const ProviderRequest& request, const CIMName& className,
                                            const PathSink& sink)
{
    const PropertyFilter filter;
    ResultObject result(filter, nullptr, sink, nullptr);
    const Call call(fImpl->broker, fImpl->interfaces, request, classPath(className), result);
    CMPIInstanceMI& mi = fImpl->interfaces.instance(request.provider);
    if (mi.ft->enumerateInstanceNames == nullptr) {
        throw notServed(request, CIM_ERR_NOT_SUPPORTED, "enumerateInstanceNames");
    }
    call.run(mi.ft->enumerateInstanceNames, &mi, call.context(), call.result(), call.path());
}

CIMInstance ProviderModule::getInstance(const ProviderRequest& request, const CIMObjectPath& path,
                                        const CIMPropertyList& properties)
{
    std::optional<CIMInstance> found;
    const auto takeOne = [&found](const CIMInstance& instance) {
        if (found) {
            throw CmpiError{CMPI_RC_ERR_FAILED, "getInstance returns one instance"};
        }
        found = instance;
    };
    PropertyFilter filter(properties);
    ResultObject result(filter, takeOne, nullptr, nullptr);
    const Call call(fImpl->broker, fImpl->interfaces, request, path, result);
    CMPIInstanceMI& mi = fImpl->interfaces.instance(request.provider);
    if (mi.ft->getInstance == nullptr) {
        throw notServed(request, CIM_ERR_NOT_SUPPORTED, "getInstance");
    }
    call.run(mi.ft->getInstance, &mi, call.context(), call.result(), call.path(), filter.names());
    if (!found) {
        throw CIMException(CIM_ERR_NOT_FOUND, path.toString());
    }
    return *found;
}

CIMObjectPath ProviderModule::createInstance(const ProviderRequest& request, const CIMInstance& instance)
{
    std::optional<CIMObjectPath> created;
    const PropertyFilter filter;
    ResultObject result(
        filter, nullptr, [&created](const CIMObjectPath& path) { created = path; }, nullptr);
    const Call call(fImpl->broker, fImpl->interfaces, request, classPath(instance.getClassName()), result);
    InstanceObject argument(fImpl->broker, instance, request.nameSpace);
    asArgument(argument);
    CMPIInstanceMI& mi = fImpl->interfaces.instance(request.provider);
    if (mi.ft->createInstance == nullptr) {
        throw notServed(request, CIM_ERR_NOT_SUPPORTED, "createInstance");
    }
    call.run(mi.ft->createInstance, &mi, call.context(), call.result(), call.path(),
             static_cast<const CMPIInstance*>(&argument));
    if (!created) {
        throw CIMException(CIM_ERR_FAILED, String("The provider returned no path."));
    }
    return *created;
}

void ProviderModule::modifyInstance(const ProviderRequest& request, const CIMInstance& modified,
                                    const CIMPropertyList& properties)
{
    PropertyFilter filter(properties.isNull() ? propertiesOf(modified) : properties);
    ResultObject result(filter, nullptr, nullptr, nullptr);
    const Call call(fImpl->broker, fImpl->interfaces, request, modified.getPath(), result);
    InstanceObject argument(fImpl->broker, modified, request.nameSpace);
    asArgument(argument);
    CMPIInstanceMI& mi = fImpl->interfaces.instance(request.provider);
    if (mi.ft->modifyInstance == nullptr) {
        throw notServed(request, CIM_ERR_NOT_SUPPORTED, "modifyInstance");
    }
    call.run(mi.ft->modifyInstance, &mi, call.context(), call.result(), call.path(),
             static_cast<const CMPIInstance*>(&argument), filter.names());
}

void ProviderModule::deleteInstance(const ProviderRequest& request, const CIMObjectPath& path)
{
    const PropertyFilter filter;
    ResultObject result(filter, nullptr, nullptr, nullptr);
    const Call call(fImpl->broker, fImpl->interfaces, request, path, result);
    CMPIInstanceMI& mi = fImpl->interfaces.instance(request.provider);
    if (mi.ft->deleteInstance == nullptr) {
        throw notServed(request, CIM_ERR_NOT_SUPPORTED, "deleteInstance");
    }
    call.run(mi.ft->deleteInstance, &mi, call.context(), call.result(), call.path());
}

CIMValue ProviderModule::invokeMethod(const ProviderRequest& request, const CIMObjectPath& path, const CIMName& method,
                                      const Array<CIMParamValue>& in, Array<CIMParamValue>& out)
{
    CIMValue returned;
    const auto take = [&](const CIMValue& value) { returned = value; };
    const PropertyFilter filter;
    ResultObject result(filter, nullptr, nullptr, take);
    const Call call(fImpl->broker, fImpl->interfaces, request, path, result);
    ArgsObject input(fImpl->broker, in, request.nameSpace);
    ArgsObject output(fImpl->broker);
    asArgument(input);
    asArgument(output);
    CMPIMethodMI& mi = fImpl->interfaces.method(request.provider);
    if (mi.ft->invokeMethod == nullptr) {
        throw notServed(request, CIM_ERR_METHOD_NOT_AVAILABLE, "invokeMethod");
    }
    const std::string name = base::utf8(method);
    call.run(mi.ft->invokeMethod, &mi, call.context(), call.result(), call.path(), name.c_str(),
             static_cast<const CMPIArgs*>(&input), static_cast<CMPIArgs*>(&output));
    if (!result.isDone()) {
        requireTolerance(Habit::kNoReturnDone, fImpl->broker, request);
    }
    out = output.parameters();
    return returned;
}

ProviderModule::Cleanup ProviderModule::cleanupWhenIdle()
{
    return fImpl->interfaces.cleanupWhenIdle();
}

} // namespace Pegasus::cmpi
