// SPDX-License-Identifier: MIT
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

// Log readers know these texts to the letter, the blank after "succeeded" included.
constexpr TConnectionTexts kProviderConnectionTexts = {
    "TPEGASUSProvider: Pegasus Client Creation Fail: ",
    "TPEGASUSProvider::connect enter",
    "TPEGASUSProvider::connect succeeded ",
    "TPEGASUSProvider::connect failed: ",
};

// A vendor's mark on a class that hosts should skip.
constexpr char kDontCollectQualifier[] = "DONTCOLLECT";

bool IsTaggedCdm(const boost::shared_ptr<ICIMClass>& collected)
{
    const auto mirrored = boost::dynamic_pointer_cast<TPEGASUSClass>(collected);
    return mirrored && mirrored->GetTag() == kCdmTag;
}

// A qualifier of a type that fails to convert to a boolean throws TVRXException 14. The walk logs that, so that the
// vendor learns of the mistake, and leaves the class out.
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

// Static, with the provider's name as an argument: an earlier visit may have destroyed the provider.
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

// A requested-class file may leave the namespace out, but every request and every compilation needs one.
const std::string& TPEGASUSProvider::GetServerNamespace() const
{
    return fNameSpaceName.empty() ? kDefaultCimNamespace : fNameSpaceName;
}

Pegasus::CIMNamespaceName TPEGASUSProvider::GetPegNamespace() const
{
    return Pegasus::CIMNamespaceName(GetServerNamespace().c_str());
}

// Byte for byte, although CIM names ignore case: the host asks with the spelling that it got from the class.
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

// The text is kept as the file has it; the class that is made with it converts it to milliseconds.
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
