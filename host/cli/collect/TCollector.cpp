// SPDX-License-Identifier: MIT
#include "host/cli/collect/TCollector.h"

#include "host/cli/collect/ClassReader.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/model/Names.h"
#include "host/cli/model/NoContext.h"

#include <host/IProvider.h>

#include <chrono>
#include <mutex>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

constexpr signed char kPluginType = 7; // which providers are listed

// "BEGIN NAME END: CAUSE"
TLoss LossOfClass(ELossKind kind, const std::string& begin, const std::string& name, const std::string& end)
{
    TLoss loss = LossOf(kind, begin);
    loss.fObjects = loss.fClasses = {name};
    loss.fEnd = end;
    return loss;
}

} // namespace

TCollector::TCollector(ICIMNamespace& ns, TLossLog& losses, std::function<bool()> isStopped)
    : fNamespace(ns), fLosses(losses), fIsStopped(std::move(isStopped))
{
}

std::vector<TProviderRecord> TCollector::ReadProviders(EDetail detail)
{
    std::vector<TProviderRecord> records;
    for (const TProviderPtr& provider : ListProviders()) {
        if (!fIsStopped()) {
            records.push_back(ReadProvider(*provider, detail));
        }
    }
    return records;
}

void TCollector::Ask(TLoss loss, const std::function<void()>& question)
{
    const std::string error = ErrorOf(question);
    if (!error.empty() && !fIsStopped()) {
        loss.fEnd += ": " + error;
        fLosses.Add(loss);
    }
}

// The plug-in may call back on several threads at once, so the callback only collects.
std::vector<TCollector::TProviderPtr> TCollector::ListProviders()
{
    std::mutex mutex;
    std::vector<TProviderPtr> providers;
    TCIMContext context;
    context["pluginType"] = TCIMValue(kPluginType);
    Ask(LossOf(ELossKind::kPlugin, "the providers could not be listed"), [&] {
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
    Ask(LossOf(ELossKind::kPlugin, "the classes of provider " + name + " could not be listed"), [&] {
        provider.EnumerateClassesProvided(
            [&](TClassPtr each) {
                classes.push_back(std::move(each));
                return true;
            },
            kNoContext);
    });
    return classes;
}

TCollector::TClassPtr TCollector::FindClass(const std::string& name)
{
    std::vector<std::string> names;
    for (const TProviderPtr& provider : ListProviders()) {
        const std::string providerName = provider->GetName(kNoContext);
        for (const TClassPtr& each : ListClasses(*provider, providerName)) {
            names.push_back(each->GetName(kNoContext));
            if (IsSame(names.back(), name)) {
                fProviderName = providerName;
                return each;
            }
        }
    }
    const TClassPtr found = fNamespace.GetClass(name, kNoContext);
    if (!found) {
        throw TRequestError("there is no class " + name + Suggestion(name, names));
    }
    return found;
}

TProviderRecord TCollector::ReadProvider(IProvider& provider, EDetail detail)
{
    TProviderRecord record;
    Ask(LossOf(ELossKind::kPlugin, "a provider could not be described"), [&] {
        record.fName = provider.GetName(kNoContext);
        record.fModule = provider.GetModuleName(kNoContext);
        record.fDescription = provider.GetDescription(kNoContext);
    });
    fProviderName = record.fName;
    std::vector<std::string> partial;
    BeginWatch();
    if (fObserver) {
        fObserver->BeginProvider(record);
    }
    const std::vector<TClassPtr> classes = ListClasses(provider, record.fName);
    if (fSink && !fObserver) {
        fSink->BeginProvider(record, classes.size());
    }
    for (const TClassPtr& each : classes) {
        if (!fIsStopped()) {
            record.fClasses.push_back(ReadWatchedClass(*each, detail, nullptr));
            if (record.fClasses.back().fIsPartial) {
                partial.push_back(record.fClasses.back().fName);
            }
        }
    }
    EndWatch(partial);
    record.fIsPartial = !partial.empty();
    return record;
}

void TCollector::BeginWatch()
{
    if (fWatch) {
        fWatch->BeginProvider(fProviderName);
    }
}

void TCollector::EndWatch(const std::vector<std::string>& partial)
{
    if (!fWatch) {
        return;
    }
    fWatch->EndProvider();
    if (!partial.empty() && !fIsStopped()) {
        TLoss loss =
            LossOf(ELossKind::kDeadline, "provider " + fProviderName + " took longer than " +
                                             std::to_string(fWatch->GetDeadlineSeconds()) +
                                             " s and was given up; missing or incomplete: " + JoinNames(partial));
        loss.fClasses = partial;
        fLosses.Add(loss);
    }
}

TClassRecord TCollector::ReadClass(ICIMClass& each, EDetail detail, const TFilter& filter)
{
    BeginWatch();
    TClassRecord record = ReadWatchedClass(each, detail, filter);
    EndWatch(record.fIsPartial ? std::vector<std::string>{record.fName} : std::vector<std::string>());
    return record;
}

TClassRecord TCollector::ReadWatchedClass(ICIMClass& each, EDetail detail, const TFilter& filter)
{
    TClassRecord record;
    record.fIsPartial = IsGivenUp();
    Ask(LossOf(ELossKind::kPlugin, "a class could not be named"), [&] { record.fName = each.GetName(kNoContext); });
    if (fWatch) {
        fWatch->BeginClass(record.fName);
    }
    if (detail != EDetail::kNames) {
        Ask(LossOfClass(ELossKind::kClass, "class ", record.fName, " could not be described"),
            [&] { ReadDeclarations(each, record); });
    }
    const bool isStreamed = fSink && !fObserver && detail != EDetail::kNames;
    if (isStreamed) {
        fSink->BeginClass(fProviderName, record);
    }
    if (fObserver) {
        Ask(LossOfClass(ELossKind::kClass, "class ", record.fName, " could not be recorded"),
            [&] { fObserver->BeginClass(each, record); });
    }
    if (detail == EDetail::kInstances && !record.fIsPartial) {
        const auto begin = std::chrono::steady_clock::now();
        Ask(LossOfClass(ELossKind::kInstances, "instances of ", record.fName, " could not be fetched"),
            [&] { ReadInstances(each, record, filter); });
        const auto took = std::chrono::steady_clock::now() - begin;
        record.fMilliseconds = std::chrono::duration_cast<std::chrono::milliseconds>(took).count();
        record.fIsPartial = IsGivenUp();
    }
    if (isStreamed) {
        fSink->EndClass(record);
    }
    if (fObserver) {
        fObserver->EndClass(record);
    }
    return record;
}

void TCollector::ReadInstances(ICIMClass& each, TClassRecord& record, const TFilter& filter)
{
    each.EnumerateInstances(
        [&](boost::shared_ptr<ICIMInstance> instance) {
            Ask(LossOfClass(ELossKind::kInstances, "an instance of ", record.fName, " could not be read"), [&] {
                if (fObserver) {
                    fObserver->Add(*instance);
                    ++record.fInstanceCount;
                    return;
                }
                TInstanceRecord found = ReadInstance(*instance);
                ++record.fInstanceCount;
                if (filter && !filter(found)) {
                    return;
                }
                if (fSink) {
                    fSink->Add(record, found);
                }
                if (fKeeps) {
                    record.fInstances.push_back(std::move(found));
                }
            });
            return !fIsStopped() && !IsGivenUp();
        },
        false, kNoContext);
}

} // namespace vrxhost
