// SPDX-License-Identifier: MIT
// Compiling MOF files, making the providers known to the server, fetching their classes, and listing them to the host.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/Files.h"
#include "src/common/Names.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/ProviderThreads.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"

#include <host/ICIMClass.h>
#include <host/TVRXException.h>

#include <algorithm>

namespace NKOLVRX20 {

namespace {

// Keys of the map that filterTag4classes fills from a requested entry.
constexpr char kTimeOutTag[] = "TimeOut";
constexpr char kTag[] = "Tag";
constexpr char kPluginTypeKey[] = "pluginType";
constexpr signed char kPluginTypeOfProviders = 7; // the host's number for plug-ins of this kind

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
    return !entry->second.IsNull() && static_cast<signed char>(entry->second) == kPluginTypeOfProviders;
}

void VisitInOrder(const std::vector<boost::shared_ptr<TPEGASUSProvider>>& providers, const TProviderVisitor& visitor)
{
    for (const auto& provider : providers) {
        if (!visitor(provider)) {
            return;
        }
    }
}

} // namespace

// "-aE" accepts classes with a true qualifier "Experimental". The compiler's output in the log is the only trace of an
// error: the other files are compiled, and the classes that the server has are served.
void TPEGASUSNamespace::callCimmof(const std::string& cimNamespace, const std::string& mofPath)
{
    LogProgress(fTree.Run("cimmof", {"-n", cimNamespace, "-aE", mofPath}));
}

std::vector<std::string> TPEGASUSNamespace::FindMofFiles(const std::string& directory, const std::string& pattern)
{
    std::vector<std::string> names;
    ReadDirectory(directory, names);
    std::vector<std::string> paths;
    for (const std::string& name : names) {
        if (name.find(pattern) != std::string::npos) {
            paths.push_back(directory + "/" + name);
        }
    }
    return paths;
}

std::vector<std::string> TPEGASUSNamespace::BuildMofPath(const std::string& path, const std::string& pattern)
{
    const std::string::size_type slash = path.rfind('/');
    if (slash == std::string::npos) {
        LogAndThrow(TVRXStatusCode::kBadPath, "TPEGASUSNamespace::BuildMofPath failed: no directory in \"", path, "\"");
    }
    return FindMofFiles(path.substr(0, slash), pattern);
}

void TPEGASUSNamespace::RegisterProviders()
{
    LogProgress("before reg...");
    if (IsMultiThreaded()) {
        RunOnThreads("TPEGASUSNamespace::regProvider", fProviders,
                     [this](const auto& provider) { regProvider(provider->GetPath(), provider); });
    } else {
        for (const auto& provider : fProviders) {
            regProvider(provider->GetPath(), provider);
        }
    }
    LogProgress("after reg...");
    // On the calling thread, whatever the setting: the class cache and the namespace's client serve one thread.
    for (const auto& provider : fProviders) {
        finishRegProvider(provider->GetPath(), provider);
    }
}

// May run on a thread of its own, at the same time as other providers: it reads its own provider and what is fixed
// after start-up. Definitions come before the registrations that name them.
void TPEGASUSNamespace::regProvider(std::string path, boost::shared_ptr<TPEGASUSProvider> provider)
{
    LogProgress("Entering TPEGASUSNamespace::regProvider: ", path);
    std::vector<std::string> specifications = BuildMofPath(path, kSpecificationExtension);
    std::vector<std::string> registrations = BuildMofPath(path, kRegistrationExtension);
    // Directories are unordered, and one file may need what another defines: the vendor decides by the names.
    std::sort(specifications.begin(), specifications.end());
    std::sort(registrations.begin(), registrations.end());
    for (const std::string& file : specifications) {
        callCimmof(provider->GetServerNamespace(), file);
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

// A class that several providers request is fetched once and stays bound to the last of them.
boost::shared_ptr<ICIMClass> TPEGASUSNamespace::CollectClass(const std::string& entry,
                                                             const boost::shared_ptr<TPEGASUSProvider>& provider)
{
    std::map<std::string, std::string> tags = {{kTimeOutTag, provider->GetDefaultTimeoutVal()}};
    const std::string name = filterTag4classes(entry, tags);
    if (isConnected() && name != kRootClassName && !IsCimName(name)) { // GetClass throws, and its line lacks the file
        LogFailure("TPEGASUSNamespace::CollectClass failed: the class name \"", name, "\" in ", provider->GetPath(),
                   " is invalid");
    }
    // Both the file and the entry may leave the timeout out, and 0 seconds would make every call fail.
    const std::string timeout = tags[kTimeOutTag].empty() ? strTimeout : tags[kTimeOutTag];
    if (!IsPlainTimeout(timeout)) {
        LogProgress("TPEGASUSNamespace::CollectClass: the timeout of class ", name, " in ", provider->GetPath(),
                    " is not a number of seconds up to 4294967: \"", timeout, "\" becomes ",
                    MillisecondsFromText(timeout), " ms");
    }
    const TCIMContext context = {{kNspKey, provider->GetServerNamespace()}, {kTimeoutKey, timeout}};
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
    // npos is larger than any position, so that the minimum is the mark that is there, or the whole entry.
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
    // A copy, because the visitor may drop the namespace.
    const auto providers = fProviders;
    if (IsMultiThreaded()) {
        RunOnThreads("TPEGASUSNamespace::EnumerateProviders", providers, visitor);
    } else {
        VisitInOrder(providers, visitor);
    }
    LogProgress("after inventory pegasus NSP");
}

} // namespace NKOLVRX20
