// Making the providers known to the server, fetching their classes, and listing them to the host.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/ProviderThreads.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/ServerTree.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"

#include <host/ICIMClass.h>
#include <host/TVRXException.h>

#include <boost/bind/bind.hpp>

namespace NKOLVRX20 {

namespace {

constexpr char kTimeOutTag[] = "TimeOut";
constexpr char kTag[] = "Tag";
constexpr char kPluginTypeKey[] = "pluginType";
constexpr signed char kPluginTypeOfProviders = 7;

// The body of a provider's thread: nothing may leave it.
void RunForProvider(const char* operation, const boost::shared_ptr<TPEGASUSProvider>& provider,
                    const boost::function<void()>& task)
{
    try {
        task();
    } catch (...) {
        LogCaughtException(operation, " failed for provider ", provider->GetPath(), ": ");
    }
}

// Returns: whether a host that asks with this context asks for this kind of provider.
bool AsksForProviders(const TCIMContext& context)
{
    const auto entry = context.find(kPluginTypeKey);
    if (entry == context.end()) {
        return true;
    }
    if (entry->second.IsArray() || entry->second.GetType() != TCIMValue::TCIMType::kSint8) {
        LogFailure(kWrongContextTypeText);
        throw TVRXException(TVRXStatusCode::kTypeMismatch);
    }
    return static_cast<signed char>(entry->second) == kPluginTypeOfProviders;
}

} // namespace

void TPEGASUSNamespace::RegisterProviders()
{
    LogProgress("before reg...");
    if (IsMultiThreaded()) {
        std::vector<boost::function<void()>> tasks;
        for (const auto& provider : fProviders) {
            const boost::function<void()> task =
                boost::bind(&TPEGASUSNamespace::regProvider, this, provider->GetPath(), provider);
            tasks.push_back(boost::bind(&RunForProvider, "TPEGASUSNamespace::regProvider", provider, task));
        }
        RunOnThreads(tasks);
    } else {
        for (const auto& provider : fProviders) {
            regProvider(provider->GetPath(), provider);
        }
    }
    LogProgress("after reg...");
    for (const auto& provider : fProviders) {
        finishRegProvider(provider->GetPath(), provider);
    }
}

void TPEGASUSNamespace::regProvider(std::string path, boost::shared_ptr<TPEGASUSProvider> provider)
{
    LogProgress("Entering TPEGASUSNamespace::regProvider: ", path);
    const std::vector<std::string> specifications = BuildMofPath(path, kSpecificationExtension);
    const std::vector<std::string> registrations = BuildMofPath(path, kRegistrationExtension);
    for (const std::string& file : specifications) {
        callCimmof(provider->GetNameSpaceName({}), file);
    }
    for (const std::string& file : registrations) {
        callCimmof(kInterOpNamespace, file);
    }
}

void TPEGASUSNamespace::finishRegProvider(std::string path, boost::shared_ptr<TPEGASUSProvider> provider)
{
    LogProgress("Entering TPEGASUSNamespace::ffinishRegProvider: ", path);
    std::vector<boost::shared_ptr<ICIMClass>> collected;
    for (const std::string& entry : provider->GetClassVector()) {
        if (const auto requestedClass = CollectClass(entry, provider)) {
            collected.push_back(requestedClass);
        }
    }
    provider->SetCollectedClasses(collected);
    provider->initPegasusClient();
    provider->connectPegasusClient(fHostAddress, fPort, "", "");
    LogProgress("TPEGASUSNamespace finished adding Provider ", path);
}

boost::shared_ptr<ICIMClass> TPEGASUSNamespace::CollectClass(const std::string& entry,
                                                             const boost::shared_ptr<TPEGASUSProvider>& provider)
{
    std::map<std::string, std::string> tags = {{kTimeOutTag, provider->GetDefaultTimeoutVal()}};
    const std::string name = filterTag4classes(entry, tags);
    const TCIMContext context = {{kNspKey, provider->GetNameSpaceName({})}, {kTimeoutKey, tags[kTimeOutTag]}};
    const auto requestedClass = boost::dynamic_pointer_cast<TPEGASUSClass>(GetClass(name, context));
    if (requestedClass) {
        if (tags[kTag] == kCdmTag) {
            requestedClass->SetTag(kCdmTag);
        }
        requestedClass->SetProvider(provider);
    }
    LogProgress("TPEGASUSNamespace::Getting class: ", name, " from Pegasus CIMOM");
    return requestedClass;
}

std::string TPEGASUSNamespace::filterTag4classes(const std::string& entry, std::map<std::string, std::string>& tags)
{
    constexpr auto kNone = std::string::npos;
    const auto leftBracket = entry.find('[');
    const auto rightBracket = entry.find(']');
    const auto tagStart = entry.find("%^");
    const auto tagEnd = entry.find("^%");
    std::string name = entry.substr(0, std::min(leftBracket, tagStart));
    if (rightBracket != kNone && leftBracket < rightBracket) {
        tags[kTimeOutTag] = entry.substr(leftBracket + 1, rightBracket - leftBracket - 1);
    }
    if (tagEnd != kNone && tagStart != kNone && tagStart + 2 < tagEnd) {
        const std::string tag = entry.substr(tagStart + 2, tagEnd - tagStart - 2);
        if (tag == kCdmTag) {
            LogProgress("TPEGASUSNamespace::filterTag4classes find one CDM class: ", name);
        }
        tags[kTag] = tag;
    }
    return name;
}

void TPEGASUSNamespace::undoProvidersSetup() {}

void TPEGASUSNamespace::EnumerateProviders(TProviderVisitor visitor, TCIMContext context)
{
    if (!AsksForProviders(context)) {
        return;
    }
    LogProgress("TPEGASUSNamespace::EnumerateProviders: fProviders.size() = ", fProviders.size());
    LogProgress("before inventory pegasus NSP");
    if (IsMultiThreaded()) {
        VisitProvidersOnThreads(visitor);
    } else {
        VisitProvidersInOrder(visitor);
    }
    LogProgress("after inventory pegasus NSP");
}

// A walk on a copy: the visitor may drop the namespace.
void TPEGASUSNamespace::VisitProvidersInOrder(const TProviderVisitor& visitor)
{
    const auto providers = fProviders;
    for (const auto& provider : providers) {
        if (!visitor(provider)) {
            return;
        }
    }
}

void TPEGASUSNamespace::VisitProvidersOnThreads(const TProviderVisitor& visitor)
{
    std::vector<boost::function<void()>> tasks;
    for (const auto& provider : fProviders) {
        const boost::function<void()> task = [visitor, provider] { visitor(provider); };
        tasks.push_back(boost::bind(&RunForProvider, "TPEGASUSNamespace::EnumerateProviders", provider, task));
    }
    RunOnThreads(tasks);
}

} // namespace NKOLVRX20
