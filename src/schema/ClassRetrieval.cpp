// The instances of a class, fetched live. The three operations are one, told apart by the function's name in the log
// and by where and how long they ask.
#include "src/common/ConnectedClient.h"
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/instance/InstanceBuilder.h"
#include "src/instance/TPEGASUSInstance.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"

#include <host/ICIMProperty.h>

#include <optional>

namespace NKOLVRX20 {

namespace {

constexpr unsigned char kDecimal = 10;

// Vendors' diagnostic services and software inventories take minutes.
constexpr char kDiagnosticServicePart[] = "AvailableDiagnosticService";
constexpr unsigned int kDiagnosticServiceTimeoutMs = 199000;
constexpr char kSoftwareIdentityPart[] = "SoftwareIdentity";
constexpr unsigned int kSoftwareIdentityTimeoutMs = 301000;

constexpr char kRecordClass[] = "CIM_RecordAppliesToElement";

// What the host's pages lose when a class times out.
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

bool Contains(const std::string& text, const char* part)
{
    return text.find(part) != std::string::npos;
}

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

// Returns: the empty text when the instance lacks the property.
std::string TextOf(const ICIMInstance& instance, const char* property)
{
    try {
        return instance.GetProperty(property, {})->GetValue({}).ToString(kDecimal);
    } catch (const TVRXException&) {
        return "";
    }
}

} // namespace

// One retrieval under way.
struct TPEGASUSClass::TRetrieval
{
    typedef Pegasus::Array<Pegasus::CIMInstance> TInstances;

    TPEGASUSClass& fClass;
    const std::string fOperation; // the function's name, as the log has it
    const bool fReportsTimeout = false;

    // Returns: the client to ask, with its time-out set. Throws: Pegasus::NotConnectedException.
    Pegasus::CIMClient& Client(unsigned int timeoutMs) const
    {
        const auto ns = fClass.LockNamespace();
        Pegasus::CIMClient& ofNamespace = ConnectedClient(*ns);
        Pegasus::CIMClient& client = fClass.fProvider ? ConnectedClient(*fClass.fProvider) : ofNamespace;
        client.setTimeout(timeoutMs);
        return client;
    }

    // Returns: what the question to the server gave; nothing after a failure, which is logged.
    template <typename TQuestion> std::optional<TInstances> Ask(TQuestion question) const
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

    // Asks in the provider's namespace, once the server has said that it has the class.
    std::optional<TInstances> AskProvider(bool deep, unsigned int timeoutMs) const
    {
        return Ask([&]() -> std::optional<TInstances> {
            Pegasus::CIMClient& client = Client(timeoutMs);
            const auto ns = fClass.fProvider ? fClass.fProvider->GetPegNamespace() : fClass.fPegasusNsp;
            if (!ServerHasClass(client, ns)) {
                return std::nullopt;
            }
            return Enumerate(client, ns, deep);
        });
    }

    TInstances Enumerate(Pegasus::CIMClient& client, const Pegasus::CIMNamespaceName& ns, bool deep) const
    {
        return client.enumerateInstances(ns, Pegasus::CIMName(fClass.fName.c_str()), deep, true, false, false);
    }

    // Runs the step for instance i, so that its failure costs no other.
    template <typename TStep> void Guarded(Pegasus::Uint32 i, TStep step) const
    {
        try {
            step();
        } catch (const Pegasus::Exception& exception) {
            LogProgress("DEBUG3:TPEGASUSClass::EI Error from Pegasus for: ", fClass.fName, ", pegInst ", i,
                        " returned exception: ", ToStdString(exception.getMessage()));
        } catch (const TVRXException&) {
            LogProgress("DEBUG2:TPEGASUSClass::EI VRX Error for: ", fClass.fName, ", pegInst ", i);
        }
    }

    // Returns: the first instance whose path is the reference's; null when there is none.
    boost::shared_ptr<TPEGASUSInstance> Find(const TInstances& instances, const TCIMReference& reference) const
    {
        boost::shared_ptr<TPEGASUSInstance> found;
        for (Pegasus::Uint32 i = 0; i < instances.size() && !found; ++i) {
            Guarded(i, [&] {
                const std::string path = ToStdString(instances[i].getPath().toString());
                LogProgress("objPath from Pegasus : ", path);
                if (path != reference.GetPath()) {
                    return;
                }
                LogProgress("TPEGASUSClass:", fOperation, " ObjectPath matched : ", path);
                found = BuildInstance(fClass, instances[i], fOperation);
            });
        }
        return found;
    }

    void LogCallingNamespace() const
    {
        LogProgress("TPEGASUSClass:", fOperation, ". Calling NSP =  ", fClass.RetrievalNamespaceName());
    }

    void LogBuilt(const TPEGASUSInstance& instance) const
    {
        if (fClass.fName == kRecordClass) {
            LogProgress("TPEGASUSClass::", fOperation, " Antecedent = ", TextOf(instance, "Antecedent"), " Dependent",
                        TextOf(instance, "Dependent"));
        }
        LogProgress("TPEGASUSClass::", fOperation, " nsp=", instance.GetPegasusNSPStr());
    }

  private:
    bool ServerHasClass(Pegasus::CIMClient& client, const Pegasus::CIMNamespaceName& ns) const
    {
        try {
            static_cast<void>(client.getClass(ns, Pegasus::CIMName(fClass.fName.c_str()), true, false, false));
            return true;
        } catch (const Pegasus::Exception& exception) {
            LogFailure("TPEGASUSClass:", fOperation, ". NSP :", fClass.RetrievalNamespaceName(), " Do not have class ",
                       fClass.fName, "with pegasus exeption: ", ToStdString(exception.getMessage()));
            return false;
        }
    }

    void LogTimeout(const Pegasus::ConnectionTimeoutException& exception) const
    {
        if (fReportsTimeout) {
            LogFailure("Get Instances for: ", fClass.fName,
                       " returned ConnectionTimeoutException: ", ToStdString(exception.getMessage()),
                       LossWarning(fClass.fName));
        } else {
            LogFailedCall("", exception);
        }
    }

    void LogFailedCall(const char* mark, const Pegasus::Exception& exception) const
    {
        LogProgress(mark, "TPEGASUSClass::", fOperation, " from Pegasus for: ", fClass.fName,
                    " returned exception: ", ToStdString(exception.getMessage()));
    }
};

std::string TPEGASUSClass::RetrievalNamespaceName() const
{
    return fProvider ? fProvider->GetNameSpaceName({}) : fPegasusNspText;
}

void TPEGASUSClass::EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext)
{
    const auto self = shared_from_this(); // the visitor may drop the namespace, and this class with it
    const TRetrieval retrieval{*this, "EnumerateInstances", true};
    LogProgress("TPEGASUSClass::EnumerateInstances ", fName);
    retrieval.LogCallingNamespace();
    const auto instances = retrieval.AskProvider(deep, EnumerationTimeoutMs(*this));
    if (!instances) {
        return;
    }
    LogProgress("DEBUG: TPEGASUSClass:EnumerateInstances get instance of ", fName, " count: ", instances->size());
    bool goesOn = true;
    for (Pegasus::Uint32 i = 0; i < instances->size() && goesOn; ++i) {
        boost::shared_ptr<TPEGASUSInstance> built;
        retrieval.Guarded(i, [&] {
            built = BuildInstance(*this, (*instances)[i], retrieval.fOperation);
            built->SetPegasusNSPStr(fPegasusNspText);
        });
        if (!built) {
            continue;
        }
        retrieval.LogBuilt(*built);
        goesOn = visitor(built);
    }
}

boost::shared_ptr<ICIMInstance> TPEGASUSClass::GetInstance(const TCIMReference& reference, TCIMContext)
{
    const TRetrieval retrieval{*this, "GetInstance"};
    LogProgress("TPEGASUSClass::GetInstance : ", fName, "\nWith path = ", reference.GetPath());
    const auto instances = retrieval.Ask([&] {
        Pegasus::CIMClient& client = retrieval.Client(fDefaultTimeoutMs);
        LogProgress("DEBUG: TPEGASUSClass:GetInstance pegclient object before GetInstance call (",
                    static_cast<const void*>(&client), ")\n");
        return retrieval.Enumerate(client, fPegasusNsp, false);
    });
    if (!instances) {
        return nullptr;
    }
    LogProgress("DEBUG: TPEGASUSClass:GetInstance get instance of ", fName, " instance size ", instances->size());
    return retrieval.Find(*instances, reference);
}

boost::shared_ptr<ICIMInstance> TPEGASUSClass::GetInstanceWithNsp(const TCIMReference& reference, TCIMContext context)
{
    const TRetrieval retrieval{*this, "GetInstanceWithNsp"};
    LogProgress("Entering TPEGASUSClass::GetInstanceWithNsp class = ", fName,
                " nsp = ", context[kNspKey].ToString(kDecimal));
    retrieval.LogCallingNamespace();
    const auto instances = retrieval.AskProvider(false, fDefaultTimeoutMs);
    if (!instances) {
        return nullptr;
    }
    LogProgress("DEBUG: TPEGASUSClass:GetInstanceWithNsp get instance of ", fName);
    const auto found = retrieval.Find(*instances, reference);
    if (found) {
        retrieval.LogBuilt(*found);
    }
    return found;
}

} // namespace NKOLVRX20
