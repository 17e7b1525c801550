#include "src/provider/TPEGASUSProvider.h"

#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/schema/TPEGASUSClass.h"

#include <host/ICIMClass.h>
#include <host/ICIMQualifier.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>

#include <algorithm>
#include <utility>

namespace NKOLVRX20 {

namespace {

constexpr TConnectionTexts kProviderConnectionTexts = {
    "TPEGASUSProvider: Pegasus Client Creation Fail: ",
    "TPEGASUSProvider::connect enter",
    "TPEGASUSProvider::connect succeeded ",
    "TPEGASUSProvider::connect failed: ",
};

constexpr char kDontCollectQualifier[] = "DONTCOLLECT";

bool IsTaggedCdm(const boost::shared_ptr<ICIMClass>& collected)
{
    const auto mirrored = boost::dynamic_pointer_cast<TPEGASUSClass>(collected);
    return mirrored && mirrored->GetTag() == kCdmTag;
}

bool IsNotToBeCollected(const ICIMClass& collected)
{
    const boost::shared_ptr<ICIMQualifier> qualifier = collected.GetQualifier(kDontCollectQualifier, {});
    if (!qualifier) {
        return false;
    }
    const TCIMValue value = qualifier->GetValue({});
    return !value.IsNull() && static_cast<bool>(value);
}

} // namespace

TPEGASUSProvider::TPEGASUSProvider()
    : TClientOwner(kProviderConnectionTexts), fProviderInfo(boost::make_shared<TProviderInfo>())
{
}

TPEGASUSProvider::~TPEGASUSProvider() = default;

std::string TPEGASUSProvider::GetName(TCIMContext) const
{
    return fName;
}

std::string TPEGASUSProvider::GetModuleName(TCIMContext) const
{
    return fModuleName;
}

std::string TPEGASUSProvider::GetDescription(TCIMContext) const
{
    return fDescription;
}

boost::shared_ptr<ICIMNamespace> TPEGASUSProvider::GetNamespace(TCIMContext) const
{
    LogAndThrow(TVRXStatusCode::kNotSupported, "TPEGASUSProvider::GetNamespace failed: ", fName, ": not supported");
}

// A walk on copies: the visitor may drop the namespace, and this provider with it.
void TPEGASUSProvider::EnumerateClassesProvided(TClassVisitor visitor, TCIMContext)
{
    const auto collectedClasses = fCollectedClasses;
    const std::string providerName = fName;
    for (const auto& collected : collectedClasses) {
        try {
            OfferClass(collected, providerName, visitor);
        } catch (const TVRXException& exception) {
            LogFailure("TPEGASUSProvider::EnumerateClassesProvided catch exection : ", exception.what());
        }
    }
}

void TPEGASUSProvider::OfferClass(const boost::shared_ptr<ICIMClass>& collected, const std::string& providerName,
                                  const TClassVisitor& visitor)
{
    const std::string className = collected->GetName({});
    if (IsTaggedCdm(collected)) {
        LogProgress("TPEGASUSProvider::EnumerateClassesProvided ignored one CDM class: ", className);
        return;
    }
    if (IsNotToBeCollected(*collected)) {
        return;
    }
    LogProgress("TPEGASUSProvider::EnumerateClassesProvided Asking plugin ", providerName, " for ", className);
    visitor(collected);
}

IProvider& TPEGASUSProvider::operator=(const IProvider&)
{
    return *this;
}

void TPEGASUSProvider::initPegasusClient()
{
    fConnection.Init();
}

void TPEGASUSProvider::connectPegasusClient(const std::string& host, unsigned short port, const std::string& user,
                                            const std::string& password)
{
    fConnection.Connect(host, port, user, password);
}

const std::string& TPEGASUSProvider::GetServerNamespace() const
{
    return fNameSpaceName.empty() ? kDefaultCimNamespace : fNameSpaceName;
}

Pegasus::CIMNamespaceName TPEGASUSProvider::GetPegNamespace() const
{
    return Pegasus::CIMNamespaceName(GetServerNamespace().c_str());
}

bool TPEGASUSProvider::IsClassesProvided(const std::string& className) const
{
    const auto hasName = [&className](const auto& collected) { return collected->GetName({}) == className; };
    return std::any_of(fCollectedClasses.begin(), fCollectedClasses.end(), hasName);
}

void TPEGASUSProvider::Initialize(const _CMPIBroker*, const _CMPIContext*) {}

void TPEGASUSProvider::AddPluginToClass() {}

void TPEGASUSProvider::SetType(std::string type)
{
    fType = std::move(type);
}

void TPEGASUSProvider::SetPath(std::string path)
{
    fPath = std::move(path);
}

void TPEGASUSProvider::SetName(std::string name)
{
    fName = std::move(name);
}

void TPEGASUSProvider::SetDescription(std::string description)
{
    fDescription = std::move(description);
}

void TPEGASUSProvider::SetModuleName(std::string moduleName)
{
    fModuleName = std::move(moduleName);
}

void TPEGASUSProvider::SetNameSpaceName(std::string nameSpaceName)
{
    fNameSpaceName = std::move(nameSpaceName);
}

void TPEGASUSProvider::SetDefaultTimeoutVal(std::string& seconds)
{
    fDefaultTimeout = seconds;
}

void TPEGASUSProvider::SetClassVector(std::vector<std::string>& entries)
{
    fRequestedClasses = entries;
}

void TPEGASUSProvider::SetCollectedClasses(std::vector<boost::shared_ptr<ICIMClass>> classes)
{
    fCollectedClasses = std::move(classes);
}

void TPEGASUSProvider::SetDiagnosticOnly(bool diagnosticOnly)
{
    fDiagnosticOnly = diagnosticOnly;
}

const std::string& TPEGASUSProvider::GetNameSpaceName(const TCIMContext&) const
{
    return fNameSpaceName;
}

} // namespace NKOLVRX20
