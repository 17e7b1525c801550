// SPDX-License-Identifier: MIT
#include "src/schema/InstanceRetrieval.h"

#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/instance/TPEGASUSInstance.h"
// Upwards, on purpose: a class holds its provider by the provider's own type, and asks on the provider's client. This
// is the one source of the folder that includes it.
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"

#include <host/ICIMProperty.h>
#include <host/TVRXException.h>

#include <cstdio>

namespace NKOLVRX20 {

namespace {

constexpr char kRecordClass[] = "CIM_RecordAppliesToElement";
// Only this operation has a log line of its own for a timeout.
constexpr char kEnumeration[] = "EnumerateInstances";

// What the host's pages lose when a class times out. Log readers know the texts, double blanks included.
struct TLossWarning
{
    const char* fClassName;
    const char* fText;
};
constexpr TLossWarning kLossWarnings[] = {
    {"VMware_HypervisorSoftwareIdentity", "(may cause 'Operating System' table lost)"},
    {"OMC_IpmiLogRecord", "(may cause 'IPMI Event' page  lost)"},
    {"VMware_ComponentSoftwareIdentity", "(may cause 'Installed Applications' page  lost)"},
    {"KOL_StandardMessageLogEntry", "(may cause 'Chassis Event log' page  lost)"},
};

const char* LossWarning(const std::string& className)
{
    for (const TLossWarning& warning : kLossWarnings) {
        if (className == warning.fClassName) {
            return warning.fText;
        }
    }
    return "";
}

// Returns: the empty text when the instance lacks the property.
std::string TextOf(const ICIMInstance& instance, const char* property)
{
    try {
        return instance.GetProperty(property, {})->GetValue({}).ToString(kDecimal);
    } catch (const TVRXException&) {
        return "";
    }
}

std::string AddressText(const void* address)
{
    char text[20];
    std::snprintf(text, sizeof text, "%p", address);
    return text;
}

} // namespace

TInstanceRetrieval::TInstanceRetrieval(TPEGASUSClass& instanceClass, const char* operation)
    : fClass(instanceClass), fClassName(instanceClass.GetName({})), fOperation(operation),
      fBuilder(instanceClass, operation)
{
}

// The client of the class's provider, else the namespace's. The namespace is asked first in either case: while it is
// unconnected the request fails, even when a provider still holds a client.
Pegasus::CIMClient& TInstanceRetrieval::Client(unsigned int timeoutMs) const
{
    Pegasus::CIMClient& ofNamespace = fClass.GetOwningNamespace().ConnectedClient();
    const auto provider = fClass.GetProvider();
    Pegasus::CIMClient& client = provider ? provider->ConnectedClient() : ofNamespace;
    client.setTimeout(timeoutMs);
    return client;
}

// The narrower exceptions first; each family has its own line.
template <typename TQuestion>
std::optional<TInstanceRetrieval::TAnswer> TInstanceRetrieval::Guarded(TQuestion question) const
{
    try {
        return question();
    } catch (const Pegasus::ConnectionTimeoutException& exception) {
        LogTimeout(exception);
    } catch (const Pegasus::CIMException& exception) {
        LogFailedCall("DEBUG1:", exception);
    } catch (const Pegasus::Exception& exception) {
        LogFailedCall("", exception);
    }
    return std::nullopt;
}

std::optional<TInstanceRetrieval::TAnswer> TInstanceRetrieval::Ask(unsigned int timeoutMs) const
{
    return Guarded([&] {
        Pegasus::CIMClient& client = Client(timeoutMs);
        LogProgress("DEBUG: TPEGASUSClass:", fOperation, " pegclient object before ", fOperation, " call (",
                    AddressText(&client), ")\n");
        return Enumerate(client, fClass.GetPegasusNSP(), false);
    });
}

std::optional<TInstanceRetrieval::TAnswer> TInstanceRetrieval::AskProvider(bool deep, unsigned int timeoutMs) const
{
    return Guarded([&]() -> std::optional<TAnswer> {
        Pegasus::CIMClient& client = Client(timeoutMs);
        const auto provider = fClass.GetProvider();
        const auto ns = provider ? provider->GetPegNamespace() : fClass.GetPegasusNSP();
        if (!ServerHasClass(client, ns)) {
            return std::nullopt;
        }
        return Enumerate(client, ns, deep);
    });
}

// Local-only; qualifiers and class origins are left out: the mirrored class has the declarations already.
TInstanceRetrieval::TAnswer TInstanceRetrieval::Enumerate(Pegasus::CIMClient& client,
                                                          const Pegasus::CIMNamespaceName& ns, bool deep) const
{
    return client.enumerateInstances(ns, Pegasus::CIMName(fClassName.c_str()), deep, true, false, false);
}

// Asked before the instances: a class that is missing from the provider's namespace gets a log line of its own.
bool TInstanceRetrieval::ServerHasClass(Pegasus::CIMClient& client, const Pegasus::CIMNamespaceName& ns) const
{
    try {
        static_cast<void>(client.getClass(ns, Pegasus::CIMName(fClassName.c_str()), true, false, false));
        return true;
    } catch (const Pegasus::Exception& exception) {
        LogFailure("TPEGASUSClass:", fOperation, ". NSP :", ProviderNamespaceName(), " Do not have class ", fClassName,
                   "with pegasus exeption: ", ToStdString(exception.getMessage()));
        return false;
    }
}

// Runs a step for one instance, so that its failure costs that instance alone.
template <typename TStep> void TInstanceRetrieval::Guarded(Pegasus::Uint32 index, TStep step) const
{
    try {
        step();
    } catch (const Pegasus::Exception& exception) {
        LogProgress("DEBUG3:TPEGASUSClass::EI Error from Pegasus for: ", fClassName, ", pegInst ", index,
                    " returned exception: ", ToStdString(exception.getMessage()));
    } catch (const TVRXException&) {
        LogProgress("DEBUG2:TPEGASUSClass::EI VRX Error for: ", fClassName, ", pegInst ", index);
    }
}

boost::shared_ptr<TPEGASUSInstance> TInstanceRetrieval::Build(const TAnswer& answer, Pegasus::Uint32 index)
{
    boost::shared_ptr<TPEGASUSInstance> built;
    Guarded(index, [&] { built = fBuilder.Build(answer[index]); });
    return built;
}

// Byte for byte: the host returns a path that an enumeration gave it. Keys in another order make another path.
boost::shared_ptr<TPEGASUSInstance> TInstanceRetrieval::Find(const TAnswer& answer, const TCIMReference& reference)
{
    boost::shared_ptr<TPEGASUSInstance> found;
    for (Pegasus::Uint32 i = 0; i < answer.size() && !found; ++i) {
        Guarded(i, [&] {
            const std::string path = ToStdString(answer[i].getPath().toString());
            LogProgress("objPath from Pegasus : ", path);
            if (path != reference.GetPath()) {
                return;
            }
            LogProgress("TPEGASUSClass:", fOperation, " ObjectPath matched : ", path);
            found = fBuilder.Build(answer[i]);
        });
    }
    return found;
}

std::string TInstanceRetrieval::ProviderNamespaceName() const
{
    const auto provider = fClass.GetProvider();
    return provider ? provider->GetServerNamespace() : fClass.GetPegasusNSPStr();
}

void TInstanceRetrieval::LogCallingNamespace() const
{
    LogProgress("TPEGASUSClass:", fOperation, ". Calling NSP =  ", ProviderNamespaceName());
}

void TInstanceRetrieval::LogBuilt(const TPEGASUSInstance& instance)
{
    if (fClassName == kRecordClass) {
        LogProgress("TPEGASUSClass::", fOperation, " Antecedent = ", TextOf(instance, "Antecedent"), " Dependent",
                    TextOf(instance, "Dependent"));
    }
    if (fBuiltLine.empty()) {
        fBuiltLine = JoinText("TPEGASUSClass::", fOperation, " nsp=", instance.GetPegasusNSPStr());
    }
    WriteCoreLog(ILogger::kInfo, fBuiltLine);
}

void TInstanceRetrieval::LogTimeout(const Pegasus::ConnectionTimeoutException& exception) const
{
    if (fOperation == kEnumeration) {
        LogFailure("Get Instances for: ", fClassName,
                   " returned ConnectionTimeoutException: ", ToStdString(exception.getMessage()),
                   LossWarning(fClassName));
    } else {
        LogFailedCall("", exception);
    }
}

void TInstanceRetrieval::LogFailedCall(const char* mark, const Pegasus::Exception& exception) const
{
    LogProgress(mark, "TPEGASUSClass::", fOperation, " from Pegasus for: ", fClassName,
                " returned exception: ", ToStdString(exception.getMessage()));
}

} // namespace NKOLVRX20
