// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/cmpi/broker/BrokerTables.h"
#include "pegasus/cmpi/objects/ArgsObject.h"
#include "pegasus/cmpi/objects/ContextObject.h"
#include "pegasus/cmpi/objects/EnumerationObject.h"
#include "pegasus/cmpi/objects/Habits.h"
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <memory>
#include <utility>

// The operations that providers call back, and the attaching of their own threads.
namespace Pegasus::cmpi {
namespace {

// The object of an upcall: namespace and local path. The namespace defaults to that of the request that the provider
// serves, which the context carries. The upcall counts as waiting as long as its target lives.
struct Target
{
    // Throws: with strict providers also for a thread that was not attached.
    Target(Broker& owner, const CMPIContext* context, const CMPIObjectPath* target) : nesting(owner.nesting())
    {
        if (Frame::current().origin().broker == nullptr) {
            tolerate(Habit::kNoAttach, owner, std::string());
        }
        if (target == nullptr) {
            throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
        }
        const PathState& state = objectOf<ObjectPathObject>(target).state;
        nameSpace = state.nameSpace;
        if (nameSpace.isNull() && context != nullptr) {
            const std::string text = objectOf<ContextObject>(context).text(CMPIInitNameSpace);
            if (!text.empty()) {
                nameSpace = CIMNamespaceName(base::fromUtf8Repaired(text));
            }
        }
        path = state.withoutNameSpace();
        waiting = nesting.begin(nameSpace, className(), Frame::current().origin().depth);
    }
    ~Target() { nesting.end(waiting); }
    Target(const Target&) = delete;
    Target& operator=(const Target&) = delete;

    const CIMName& className() const { return path.getClassName(); }

    CIMNamespaceName nameSpace;
    CIMObjectPath path;
    UpcallNesting& nesting;
    UpcallNesting::Place waiting;
};

CIMPropertyList listOf(const char** properties)
{
    if (properties == nullptr) {
        return {};
    }
    Array<CIMName> names;
    for (; *properties != nullptr; ++properties) {
        names.append(requireName(*properties));
    }
    return {names};
}

// The provider makes the copy on the serving thread and passes it to its own thread, which outlives the call's context.
CMPIContext* prepareAttachThread(const CMPIBroker*, const CMPIContext* context)
{
    return cloneObject<ContextObject, CMPIContext>(context, nullptr);
}

// From here to detachThread() the calling thread's objects belong to a frame that the context owns.
CMPIStatus attachThread(const CMPIBroker*, const CMPIContext* context)
{
    return perform([&] {
        ContextObject& prepared = objectOf<ContextObject>(context);
        if (prepared.threadFrame) {
            throw CmpiError{CMPI_RC_ERR_FAILED, "the context's thread is attached already"};
        }
        prepared.threadFrame = std::make_unique<Frame>(prepared.origin);
    });
}

CMPIStatus detachThread(const CMPIBroker*, const CMPIContext* context)
{
    return perform([&] {
        ContextObject& prepared = objectOf<ContextObject>(context);
        prepared.threadFrame.reset();
        if (prepared.lifetime == Lifetime::kClone) {
            delete &prepared;
        }
    });
}

// Accepted and dropped: this server has no subscriptions. The log names each class once.
CMPIStatus deliverIndication(const CMPIBroker* broker, const CMPIContext*, const char*, const CMPIInstance* indication)
{
    return perform([&] {
        const std::string name = base::utf8(objectOf<InstanceObject>(indication).value().getClassName());
        Broker::of(broker).warnOnce("deliverIndication: indications of class " + name +
                                    " are dropped, because nobody can subscribe to them here");
    });
}

CMPIEnumeration* enumerateInstanceNames(const CMPIBroker* broker, const CMPIContext* context,
                                        const CMPIObjectPath* path, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIEnumeration*>(nullptr), [&]() -> CMPIEnumeration* {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        const Array<CIMObjectPath> found =
            owner.services().enumerateInstanceNames(target.nameSpace, target.className());
        return Frame::current().make<EnumerationObject>(owner, found, target.nameSpace);
    });
}

CMPIEnumeration* enumerateInstances(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                    const char** properties, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIEnumeration*>(nullptr), [&]() -> CMPIEnumeration* {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        const Array<CIMInstance> found =
            owner.services().enumerateInstances(target.nameSpace, target.className(), listOf(properties));
        return Frame::current().make<EnumerationObject>(owner, found, target.nameSpace);
    });
}

CIMInstance instanceAt(Broker& owner, const Target& target, const CIMPropertyList& properties)
{
    CIMInstance found = owner.services().getInstance(target.nameSpace, target.path, properties);
    CIMObjectPath path = target.path;
    path.setClassName(found.getClassName());
    found.setPath(path);
    return found;
}

CMPIInstance* getInstance(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                          const char** properties, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIInstance*>(nullptr), [&]() -> CMPIInstance* {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        const CIMInstance found = instanceAt(owner, target, listOf(properties));
        return Frame::current().make<InstanceObject>(owner, found, target.nameSpace);
    });
}

CMPIObjectPath* createInstance(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                               const CMPIInstance* instance, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIObjectPath*>(nullptr), [&]() -> CMPIObjectPath* {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        CIMObjectPath created =
            owner.services().createInstance(target.nameSpace, objectOf<InstanceObject>(instance).value());
        created.setNameSpace(target.nameSpace);
        return Frame::current().make<ObjectPathObject>(owner, created);
    });
}

CMPIStatus modifyInstance(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char** properties)
{
    return perform([&] {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        CIMInstance modified = objectOf<InstanceObject>(instance).value();
        modified.setPath(target.path);
        owner.services().modifyInstance(target.nameSpace, modified, listOf(properties));
    });
}

CMPIStatus deleteInstance(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path)
{
    return perform([&] {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        owner.services().deleteInstance(target.nameSpace, target.path);
    });
}

CMPIData invokeMethod(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                      const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc)
{
    return answer(rc, kNull, [&] {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        const Array<CIMParamValue> input =
            in == nullptr ? Array<CIMParamValue>() : objectOf<ArgsObject>(in).parameters();
        Array<CIMParamValue> output;
        const CIMValue result =
            owner.services().invokeMethod(target.nameSpace, target.path, requireName(method), input, output);
        if (out != nullptr) {
            const ArgsObject received(owner, output, target.nameSpace);
            for (const NamedValue& value : received.values.all()) {
                objectOf<ArgsObject>(out).values.append(value.name, value.value);
            }
        }
        return encodeValue(owner, result);
    });
}

CMPIStatus setProperty(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                       const char* name, const CMPIValue* value, CMPIType type)
{
    return perform([&] {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        const std::string nameSpace = base::utf8(target.nameSpace.getString());
        PathState state = objectOf<ObjectPathObject>(path).state;
        state.schema = owner.classes().find(nameSpace, base::utf8(target.className()));
        InstanceObject changed(owner, state);
        changed.setProperty(name, value, type);
        const char* names[] = {name, nullptr};
        CIMInstance modified = changed.value();
        modified.setPath(target.path);
        owner.services().modifyInstance(target.nameSpace, modified, listOf(names));
    });
}

CMPIData getProperty(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path, const char* name,
                     CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] {
        Broker& owner = Broker::of(broker);
        const Target target(owner, context, path);
        const char* names[] = {requireText(name), nullptr};
        const CIMInstance found = instanceAt(owner, target, listOf(names));
        return InstanceObject(owner, found, target.nameSpace).property(name);
    });
}

template <typename Result> Result noOperation(CMPIStatus* rc, const char* name)
{
    return answer(rc, Result{}, [&]() -> Result { throw CmpiError{CMPI_RC_ERR_NOT_SUPPORTED, name}; });
}

CMPIEnumeration* execQuery(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                           CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "CIM_ERR_NOT_SUPPORTED");
}

CMPIEnumeration* associators(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                             const char*, const char*, const char**, CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "Associators");
}

CMPIEnumeration* associatorNames(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                                 const char*, const char*, CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "AssociatorNames");
}

CMPIEnumeration* references(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                            const char**, CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "References");
}

CMPIEnumeration* referenceNames(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                                CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "ReferenceNames");
}

CMPIEnumeration* enumerateInstancesFiltered(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char**,
                                            const char*, const char*, CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "EnumerateInstances with a filter");
}

CMPIEnumeration* associatorsFiltered(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*,
                                     const char*, const char*, const char*, const char**, const char*, const char*,
                                     CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "Associators with a filter");
}

CMPIEnumeration* referencesFiltered(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*,
                                    const char*, const char**, const char*, const char*, CMPIStatus* rc)
{
    return noOperation<CMPIEnumeration*>(rc, "References with a filter");
}

constexpr unsigned int kCapabilities = CMPI_MB_InstanceManipulation | CMPI_MB_OSEncapsulationSupport |
                                       CMPI_MB_Supports_MemEnhancements | CMPI_MB_Supports_Extended_Error;

} // namespace

const CMPIBrokerFT kUpcallTable{kCapabilities,       kTableVersion,
                                "Pegasus",           prepareAttachThread,
                                attachThread,        detachThread,
                                deliverIndication,   enumerateInstanceNames,
                                getInstance,         createInstance,
                                modifyInstance,      deleteInstance,
                                execQuery,           enumerateInstances,
                                associators,         associatorNames,
                                references,          referenceNames,
                                invokeMethod,        setProperty,
                                getProperty,         enumerateInstancesFiltered,
                                associatorsFiltered, referencesFiltered};

} // namespace Pegasus::cmpi
