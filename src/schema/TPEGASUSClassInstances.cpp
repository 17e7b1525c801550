// SPDX-License-Identifier: MIT
// What a class does with instances, fetched from the server at every call, and the methods called on one.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/instance/MethodValues.h"
#include "src/instance/TPEGASUSInstance.h"
#include "src/instance/ValueConversion.h"
#include "src/schema/InstanceRetrieval.h"
#include "src/schema/TPEGASUSClass.h"

#include <algorithm>
#include <utility>

namespace NKOLVRX20 {

namespace {

// Vendors' diagnostic services and software inventories take minutes.
constexpr char kDiagnosticServicePart[] = "AvailableDiagnosticService";
constexpr unsigned int kDiagnosticServiceTimeoutMs = 199000;
constexpr char kSoftwareIdentityPart[] = "SoftwareIdentity";
constexpr unsigned int kSoftwareIdentityTimeoutMs = 301000;

bool Contains(const std::string& text, const char* part)
{
    return text.find(part) != std::string::npos;
}

// The order decides for a name that contains both parts.
unsigned int EnumerationTimeoutMs(const TPEGASUSClass& instanceClass)
{
    const std::string name = instanceClass.GetName({});
    if (Contains(name, kDiagnosticServicePart)) {
        return kDiagnosticServiceTimeoutMs;
    }
    if (Contains(name, kSoftwareIdentityPart)) {
        return kSoftwareIdentityTimeoutMs;
    }
    return instanceClass.GetDefaultTimeoutMs();
}

} // namespace

boost::shared_ptr<ICIMInstance> TPEGASUSClass::AllocateInstance(TCIMContext context)
{
    return boost::make_shared<TPEGASUSInstance>(shared_from_this(), context);
}

void TPEGASUSClass::EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext)
{
    const auto self = shared_from_this(); // the visitor may drop the namespace, and this class with it
    TInstanceRetrieval retrieval(*this, "EnumerateInstances");
    LogProgress("TPEGASUSClass::EnumerateInstances ", fName);
    retrieval.LogCallingNamespace();
    auto answer = retrieval.AskProvider(deep, EnumerationTimeoutMs(*this));
    if (!answer) {
        return;
    }
    LogProgress("DEBUG: TPEGASUSClass:EnumerateInstances get instance of ", fName, " count: ", answer->size());
    bool goesOn = true;
    for (Pegasus::Uint32 i = 0; i < answer->size() && goesOn; ++i) {
        const auto built = retrieval.Build(*answer, i);
        (*answer)[i] = Pegasus::CIMInstance(); // a host that keeps the instances holds each of them once
        if (!built) {
            continue;
        }
        // Only an enumeration sets it: an instance that was fetched by its path keeps the empty text.
        built->SetPegasusNSPStr(fPegasusNspText);
        retrieval.LogBuilt(*built);
        goesOn = visitor(built);
    }
}

boost::shared_ptr<ICIMInstance> TPEGASUSClass::GetInstance(const TCIMReference& reference, TCIMContext)
{
    TInstanceRetrieval retrieval(*this, "GetInstance");
    LogProgress("TPEGASUSClass::GetInstance : ", fName, "\nWith path = ", reference.GetPath());
    const auto answer = retrieval.Ask(fDefaultTimeoutMs);
    if (!answer) {
        return nullptr;
    }
    LogProgress("DEBUG: TPEGASUSClass:GetInstance get instance of ", fName, " instance size ", answer->size());
    return retrieval.Find(*answer, reference);
}

boost::shared_ptr<ICIMInstance> TPEGASUSClass::GetInstanceWithNsp(const TCIMReference& reference, TCIMContext context)
{
    TInstanceRetrieval retrieval(*this, "GetInstanceWithNsp");
    LogProgress("Entering TPEGASUSClass::GetInstanceWithNsp class = ", fName,
                " nsp = ", context[kNspKey].ToString(kDecimal));
    retrieval.LogCallingNamespace();
    const auto answer = retrieval.AskProvider(false, fDefaultTimeoutMs);
    if (!answer) {
        return nullptr;
    }
    LogProgress("DEBUG: TPEGASUSClass:GetInstanceWithNsp get instance of ", fName);
    const auto found = retrieval.Find(*answer, reference);
    if (found) {
        retrieval.LogBuilt(*found);
    }
    return found;
}

void TPEGASUSClass::AddInstance(boost::shared_ptr<ICIMInstance> instance)
{
    if (!instance) {
        LogAndThrow(TVRXStatusCode::kTypeMismatch, "TPEGASUSClass::AddInstance failed: ", fName, ": null");
    }
    const auto owner = instance->GetClass({});
    if (owner && owner.get() != this) {
        fInstanceOwners.insert(owner);
    }
    fInstances.emplace(instance->GetReference({}).GetPath(), instance);
}

// By identity: the path may have changed since the instance was added.
void TPEGASUSClass::RemoveInstance(boost::shared_ptr<ICIMInstance> instance)
{
    for (auto entry = fInstances.begin(); entry != fInstances.end();) {
        entry = entry->second == instance ? fInstances.erase(entry) : std::next(entry);
    }
    const auto owner = instance ? instance->GetClass({}) : nullptr;
    const auto isOfOwner = [&owner](const auto& entry) { return entry.second->GetClass({}) == owner; };
    if (std::none_of(fInstances.begin(), fInstances.end(), isOfOwner)) {
        fInstanceOwners.erase(owner);
    }
}

// The containers are emptied first: two classes may hold each other's instances.
void TPEGASUSClass::ClearInstances()
{
    const auto owners = std::exchange(fInstanceOwners, {});
    const auto instances = std::exchange(fInstances, {});
    for (const auto& owner : owners) {
        owner->ClearInstances();
    }
    for (const auto& child : fChildClasses) {
        child->ClearInstances();
    }
}

TCIMValue TPEGASUSClass::InvokeMethod(const std::string&, TCIMContext&, TCIMContext)
{
    return TCIMValue();
}

TCIMValue TPEGASUSClass::InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                                      TCIMContext& outputs, TCIMContext)
{
    // Path, name and inputs are converted before anything is sent. The timeout stays as the last call on the shared
    // client left it.
    const Pegasus::CIMObjectPath path(Pegasus::String(target.GetPath().c_str()));
    const Pegasus::CIMName method(name.c_str());
    Pegasus::Array<Pegasus::CIMParamValue> pegInputs;
    for (const auto& [inputName, input] : inputs) {
        const TCIMValue& hostValue = input;
        pegInputs.append(MethodInput("TPEGASUSClass::InvokeMethod", name, inputName, [&hostValue] {
            Pegasus::CIMValue value;
            vrxValToPeg(hostValue, value);
            return value;
        }));
    }
    Pegasus::Array<Pegasus::CIMParamValue> pegOutputs;
    const Pegasus::CIMValue returned =
        fNamespace.ConnectedClient().invokeMethod(fPegasusNsp, path, method, pegInputs, pegOutputs);
    TCIMValue result = MethodValueToHost(name, returned, shared_from_this());
    AddOutputs(
        pegOutputs, shared_from_this(), [](const std::string&) {}, outputs);
    return result;
}

} // namespace NKOLVRX20
