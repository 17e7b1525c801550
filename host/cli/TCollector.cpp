#include "host/cli/TCollector.h"

#include "host/cli/model/ErrorReport.h"
#include "host/inmem/TInmemProperty.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMMethodDecl.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/IProvider.h>

#include <mutex>
#include <set>

#include <strings.h>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

// What every question carries, and the one that lists this kind of plug-in's providers.
const TCIMContext kNoContext;
constexpr signed char kPluginType = 7;

std::string TypeText(TCIMValue::TCIMType type)
{
    return std::string(type.GetName()) + (type.IsArray() ? "[]" : "");
}

// The contract's property is named by its declaration; where that is absent, the host's own kind knows its name.
std::string NameOf(const ICIMProperty& property)
{
    const auto declaration = property.GetDeclaration(kNoContext);
    if (declaration) {
        return declaration->GetName(kNoContext);
    }
    const auto* own = dynamic_cast<const TInmemProperty*>(&property);
    return own ? own->GetName() : std::string();
}

// A reference, a null one too, points weakly at objects of the plug-in, and even a weak pointer runs the code of the
// library that made it, which is unloaded before the document goes.
TCIMValue Detached(const TCIMValue& value)
{
    if (value.GetType() != TCIMValue::TCIMType::kReference) {
        return value;
    }
    if (value.IsNull()) {
        return TCIMValue(TCIMValue::TCIMType::kString, 0);
    }
    if (!value.IsArray()) {
        return TCIMValue(value.ToString(10));
    }
    std::vector<TCIMValue> paths;
    for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(value)) {
        paths.emplace_back(element.ToString(10));
    }
    return TCIMValue(TCIMValue::TCIMType::kString, 0, paths);
}

TMethodRecord ReadMethod(const ICIMMethodDecl& method)
{
    TMethodRecord record;
    record.fName = method.GetName(kNoContext);
    record.fReturnType = TypeText(method.GetReturnType(kNoContext));
    method.EnumerateParameterDecls(
        [&record](boost::shared_ptr<ICIMParameterDecl> parameter) {
            record.fParameters.push_back({parameter->GetName(kNoContext), TypeText(parameter->GetType(kNoContext))});
            return true;
        },
        kNoContext);
    return record;
}

std::set<std::string> KeyNames(const ICIMClass& each)
{
    std::set<std::string> keys;
    each.EnumerateKeyNames(
        [&keys](const std::string* name) {
            keys.insert(*name);
            return true;
        },
        kNoContext);
    return keys;
}

} // namespace

TCollector::TCollector(ICIMNamespace& ns, TLossLog& losses, std::function<bool()> isStopped)
    : fNamespace(ns), fLosses(losses), fIsStopped(std::move(isStopped))
{
}

std::vector<TProviderRecord> TCollector::Collect(ECommand command, const std::string& className)
{
    std::vector<TProviderRecord> records;
    if (command == ECommand::kInstances) {
        if (const TClassPtr found = FindClass(className)) {
            records.push_back({"", "", "", {ReadClass(*found, command)}});
        }
        return records;
    }
    for (const TProviderPtr& provider : ListProviders()) {
        if (!fIsStopped()) {
            records.push_back(ReadProvider(*provider, command));
        }
    }
    return records;
}

void TCollector::Ask(const std::string& what, const std::function<void()>& question)
{
    const std::string error = ErrorOf(question);
    if (!error.empty() && !fIsStopped()) {
        fLosses.Add(what + ": " + error);
    }
}

// The plug-in may call back on several threads at once, so the callback only collects.
std::vector<TCollector::TProviderPtr> TCollector::ListProviders()
{
    std::mutex mutex;
    std::vector<TProviderPtr> providers;
    TCIMContext context;
    context["pluginType"] = TCIMValue(kPluginType);
    Ask("the providers could not be listed", [&] {
        fNamespace.EnumerateProviders(
            [&](TProviderPtr provider) {
                const std::lock_guard<std::mutex> lock(mutex);
                providers.push_back(std::move(provider));
                return true;
            },
            context);
    });
    return providers;
}

std::vector<TCollector::TClassPtr> TCollector::ListClasses(IProvider& provider, const std::string& name)
{
    std::vector<TClassPtr> classes;
    Ask("the classes of provider " + name + " could not be listed", [&] {
        provider.EnumerateClassesProvided(
            [&](TClassPtr each) {
                classes.push_back(std::move(each));
                return true;
            },
            kNoContext);
    });
    return classes;
}

// First among the classes that the providers serve, which know their provider; then any class of the namespace.
TCollector::TClassPtr TCollector::FindClass(const std::string& name)
{
    for (const TProviderPtr& provider : ListProviders()) {
        for (const TClassPtr& each : ListClasses(*provider, provider->GetName(kNoContext))) {
            fClassNames.push_back(each->GetName(kNoContext));
            if (strcasecmp(fClassNames.back().c_str(), name.c_str()) == 0) {
                return each;
            }
        }
    }
    TClassPtr found;
    Ask("class " + name + " could not be fetched", [&] { found = fNamespace.GetClass(name, kNoContext); });
    return found;
}

TProviderRecord TCollector::ReadProvider(IProvider& provider, ECommand command)
{
    TProviderRecord record;
    Ask("a provider could not be described", [&] {
        record.fName = provider.GetName(kNoContext);
        record.fModule = provider.GetModuleName(kNoContext);
        record.fDescription = provider.GetDescription(kNoContext);
    });
    for (const TClassPtr& each : ListClasses(provider, record.fName)) {
        if (!fIsStopped()) {
            record.fClasses.push_back(ReadClass(*each, command));
        }
    }
    return record;
}

TClassRecord TCollector::ReadClass(ICIMClass& each, ECommand command)
{
    TClassRecord record;
    Ask("a class could not be named", [&] { record.fName = each.GetName(kNoContext); });
    if (command == ECommand::kClasses) {
        Ask("class " + record.fName + " could not be described", [&] { ReadDeclarations(each, record); });
    }
    if (command == ECommand::kInventory || command == ECommand::kInstances) {
        Ask("instances of " + record.fName + " could not be fetched", [&] { ReadInstances(each, record); });
    }
    return record;
}

void TCollector::ReadDeclarations(ICIMClass& each, TClassRecord& record)
{
    const auto superClass = each.GetSuperClass(kNoContext);
    record.fSuperClass = superClass && !superClass->IsRootClass(kNoContext) ? superClass->GetName(kNoContext) : "";
    const auto keys = KeyNames(each);
    each.EnumeratePropertyDecls(
        [&](boost::shared_ptr<ICIMPropertyDecl> property) {
            const std::string name = property->GetName(kNoContext);
            record.fProperties.push_back({name, TypeText(property->GetType(kNoContext)), keys.count(name) != 0});
            return true;
        },
        kNoContext);
    each.EnumerateMethodDecls(
        [&](boost::shared_ptr<ICIMMethodDecl> method) {
            record.fMethods.push_back(ReadMethod(*method));
            return true;
        },
        kNoContext);
}

void TCollector::ReadInstances(ICIMClass& each, TClassRecord& record)
{
    each.EnumerateInstances(
        [&](boost::shared_ptr<ICIMInstance> instance) {
            Ask("an instance of " + record.fName + " could not be read",
                [&] { record.fInstances.push_back(ReadInstance(*instance)); });
            return !fIsStopped();
        },
        false, kNoContext);
}

TInstanceRecord TCollector::ReadInstance(ICIMInstance& instance)
{
    TInstanceRecord record;
    record.fPath = instance.BuildPath(kNoContext).GetPath();
    instance.EnumerateProperties(
        [&](boost::shared_ptr<ICIMProperty> property) {
            record.fProperties.push_back(
                {NameOf(*property), Detached(property->GetValue(kNoContext)), property->ToString()});
            return true;
        },
        kNoContext);
    return record;
}

} // namespace vrxhost
