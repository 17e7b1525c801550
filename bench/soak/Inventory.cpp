// SPDX-License-Identifier: MIT
#include "bench/soak/Inventory.h"

#include "host/cli/model/ErrorReport.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMProperty.h>
#include <host/IProvider.h>
#include <host/TCIMReference.h>

#include <mutex>
#include <set>
#include <vector>

#include <unistd.h>

namespace soak {

using namespace NKOLVRX20;
using vrxhost::ErrorOf;

namespace {

// How many instances the probe delivers by default, and the rule of its numbers.
constexpr std::size_t kProbeCount = 1000;
constexpr unsigned long kProbeFactor = 1000003;
constexpr std::size_t kIdPrefixBytes = 5; // "bulk-"
constexpr signed char kPluginType = 7;

std::string TextOf(const ICIMInstance& instance, const std::string& property)
{
    return instance.GetProperty(property, {})->GetValue({});
}

// Returns: the instances that the callback was given.
std::vector<boost::shared_ptr<ICIMInstance>> InstancesOf(ICIMClass& each)
{
    std::vector<boost::shared_ptr<ICIMInstance>> instances;
    ErrorOf([&] {
        each.EnumerateInstances(
            [&](boost::shared_ptr<ICIMInstance> instance) {
                instances.push_back(std::move(instance));
                return true;
            },
            false, {});
    });
    return instances;
}

bool HasProbeValues(const ICIMInstance& instance, std::set<unsigned long>& numbers)
{
    bool right = false;
    ErrorOf([&] {
        const unsigned long number = std::stoul(TextOf(instance, "Id").substr(kIdPrefixBytes));
        const unsigned long value = instance.GetProperty("N1", {})->GetValue({});
        right = number < kProbeCount && value == number * kProbeFactor && numbers.insert(number).second;
    });
    return right;
}

} // namespace

// The plug-in may call back on several threads, so the callback only collects.
TInventory::TInventory(ICIMNamespace& ns) : fNamespace(ns)
{
    std::mutex mutex;
    std::vector<boost::shared_ptr<IProvider>> providers;
    TCIMContext context;
    context["pluginType"] = TCIMValue(kPluginType);
    ErrorOf([&] {
        fNamespace.EnumerateProviders(
            [&](boost::shared_ptr<IProvider> provider) {
                const std::lock_guard<std::mutex> lock(mutex);
                providers.push_back(std::move(provider));
                return true;
            },
            context);
        for (const auto& provider : providers) {
            provider->EnumerateClassesProvided(
                [&](boost::shared_ptr<ICIMClass> each) {
                    fClasses[each->GetName({})] = each;
                    return true;
                },
                {});
        }
    });
}

boost::shared_ptr<ICIMClass> TInventory::FindClass(const std::string& name)
{
    const auto entry = fClasses.find(name);
    return entry == fClasses.end() ? nullptr : entry->second;
}

EAnswer TInventory::EnumerateProbe()
{
    const auto probe = FindClass("Probe_Bulk");
    if (!probe) {
        return EAnswer::kLess;
    }
    const auto instances = InstancesOf(*probe);
    std::set<unsigned long> numbers;
    for (const auto& instance : instances) {
        if (!HasProbeValues(*instance, numbers)) {
            return EAnswer::kWrong;
        }
    }
    if (!instances.empty()) {
        fProbe = instances.front();
    }
    return numbers.size() == kProbeCount ? EAnswer::kRight : EAnswer::kLess;
}

// By the class's route, which takes values of every type.
EAnswer TInventory::InvokeEcho(const std::string& text)
{
    const auto probe = FindClass("Probe_Bulk");
    if (!probe) {
        return EAnswer::kLess;
    }
    TCIMReference target;
    target.SetPath("Probe_Bulk");
    const TCIMContext inputs = {{"Text", TCIMValue(text)}};
    TCIMContext outputs;
    TCIMValue result;
    ErrorOf([&] { result = probe->InvokeMethod(target, "Echo", inputs, outputs, {}); });
    if (result.IsNull()) {
        return EAnswer::kLess;
    }
    const auto back = outputs.find("Back");
    const bool right = result.ToString(10) == "0" && back != outputs.end() && back->second.ToString(10) == text;
    return right ? EAnswer::kRight : EAnswer::kWrong;
}

EAnswer TInventory::EnumerateProcessors()
{
    const auto processors = FindClass("LNX_Processor");
    const auto expected = static_cast<std::size_t>(::sysconf(_SC_NPROCESSORS_ONLN));
    const std::size_t count = processors ? InstancesOf(*processors).size() : 0;
    if (count > expected) {
        return EAnswer::kWrong;
    }
    return count == expected ? EAnswer::kRight : EAnswer::kLess;
}

EAnswer TInventory::EnumerateEndless()
{
    const auto endless = FindClass("Probe_Endless");
    if (endless) {
        InstancesOf(*endless);
    }
    return endless ? EAnswer::kRight : EAnswer::kLess;
}

EAnswer TInventory::ForkAndCrash()
{
    if (fProbe) {
        TCIMContext none;
        ErrorOf([&] { fProbe->InvokeMethod("ForkAndCrash", none, {}); });
    }
    return fProbe ? EAnswer::kRight : EAnswer::kLess;
}

// By the instance's route.
pid_t TInventory::ProbeProcess()
{
    TCIMContext none;
    TCIMValue result;
    if (fProbe) {
        ErrorOf([&] { result = fProbe->InvokeMethod("ProcessId", none, {}); });
    }
    return result.IsNull() ? 0 : static_cast<pid_t>(static_cast<unsigned int>(result));
}

} // namespace soak
