// SPDX-License-Identifier: MIT
// This machine in a few lines, and the state of the vendors.
#include "display/PlainText.h"
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"

#include <map>

namespace vrxhost {
namespace {

constexpr std::size_t kLinesOfAKind = 6; // of one kind

std::string Joined(const std::vector<std::string>& parts)
{
    std::string joined;
    for (const std::string& part : parts) {
        joined += part.empty() ? "" : (joined.empty() ? "" : "  ") + part;
    }
    return joined;
}

std::string SizeOf(const TInstanceRecord& instance)
{
    const TPropertyRecord* const total = instance.Find("TotalBytes");
    if (total && !total->fValue.IsNull()) {
        return NKOLVRX20::Magnitude(total->fValue, "Bytes").value_or(total->fText);
    }
    const TPropertyRecord* const size = instance.Find("BlockSize");
    const TPropertyRecord* const count = instance.Find("NumberOfBlocks");
    if (!size || !count || size->fValue.IsNull() || count->fValue.IsNull()) {
        return "";
    }
    return NKOLVRX20::Magnitude(NKOLVRX20::TCIMValue(static_cast<unsigned long>(size->fValue) *
                                                     static_cast<unsigned long>(count->fValue)),
                                "Bytes")
        .value_or("");
}

std::string SpeedOf(const TInstanceRecord& instance)
{
    const TPropertyRecord* const speed = instance.Find("Speed");
    return speed && !speed->fValue.IsNull() && speed->fValue.ToString(10) != "0"
               ? NKOLVRX20::Magnitude(speed->fValue, "Bits per Second").value_or(speed->fText)
               : "";
}

std::string DescribeDisk(const TInstanceRecord& disk)
{
    return Joined({disk.TextOf({"Name", "DeviceID"}), SizeOf(disk), disk.TextOf({"Vendor"}), disk.TextOf({"Model"})});
}

std::string DescribePort(const TInstanceRecord& port)
{
    const std::string link = port.TextOf({"LinkState", "EnabledState"});
    return Joined({port.TextOf({"Name", "DeviceID"}),
                   port.TextOf({"MACAddress", "PermanentAddress", "NetworkAddresses"}), SpeedOf(port),
                   link.empty() ? "" : "link " + link});
}

std::string DescribeModule(const TInstanceRecord& module)
{
    const TPropertyRecord* const capacity = module.Find("Capacity");
    const std::string size = capacity && !capacity->fValue.IsNull()
                                 ? NKOLVRX20::Magnitude(capacity->fValue, "Bytes").value_or(capacity->fText)
                                 : "module";
    return Joined({size, module.TextOf({"Technology", "MemoryType"}), module.TextOf({"Manufacturer"}),
                   module.TextOf({"PartNumber"})});
}

// Gathers the lines of each kind; the first class above a class that has a kind decides.
class TSummary
{
  public:
    void Add(const TClassRecord& each)
    {
        for (const TInstanceRecord& instance : each.fInstances) {
            if (each.IsA("CIM_Processor")) {
                ++fProcessors[instance.TextOf({"Name", "ElementName", "OtherFamilyDescription", "DeviceID"})];
            } else if (each.IsA("CIM_Memory")) {
                Put("Memory", SizeOf(instance));
            } else if (each.IsA("CIM_PhysicalMemory")) {
                ++fModules[DescribeModule(instance)];
            } else if (each.IsA("CIM_NetworkPort")) {
                Put("Adapter", DescribePort(instance));
            } else if (each.IsA("CIM_StorageExtent") || each.IsA("CIM_MediaAccessDevice")) {
                Put("Disk", DescribeDisk(instance));
            } else if (each.IsA("CIM_OperatingSystem")) {
                Put("System",
                    Joined({instance.TextOf({"Caption", "ElementName", "Name"}), instance.TextOf({"Version"})}));
            }
        }
    }

    std::vector<TFact> GetFacts()
    {
        for (const auto& [model, count] : fProcessors) {
            Put("Processor", std::to_string(count) + " x " + model);
        }
        for (const auto& [module, count] : fModules) {
            Put("Memory", std::to_string(count) + " x " + module);
        }
        std::vector<TFact> facts;
        for (const char* kind : {"System", "Processor", "Memory", "Disk", "Adapter"}) {
            const std::vector<std::string>& lines = fLines[kind];
            for (std::size_t i = 0; i < lines.size() && i < kLinesOfAKind; ++i) {
                facts.push_back({i == 0 ? kind : "", lines[i]});
            }
            if (lines.size() > kLinesOfAKind) {
                facts.push_back({"", "and " + std::to_string(lines.size() - kLinesOfAKind) + " more"});
            }
        }
        return facts;
    }

  private:
    void Put(const std::string& kind, const std::string& line)
    {
        if (!line.empty()) {
            fLines[kind].push_back(line);
        }
    }

    std::map<std::string, std::size_t> fProcessors; // by model
    std::map<std::string, std::size_t> fModules;    // of memory, by size and kind
    std::map<std::string, std::vector<std::string>> fLines;
};

std::string CountText(std::size_t count, const std::string& noun, const std::string& plural)
{
    return std::to_string(count) + " " + (count == 1 ? noun : plural);
}

class TSummaryCommand : public ICommand
{
  public:
    const char* GetName() const override { return "summary"; }
    const char* GetPurpose() const override { return "Show this machine in about twenty lines"; }
    bool NeedsInstances() const override { return true; }
    void Fill(TCollector& from, TDocument& into) const override
    {
        const THostFacts& host = into.fHead.fHost;
        into.fDetail = EDetail::kInstances;
        into.fFacts = {{"Machine", Joined({host.fName, host.fProduct})}};
        TSummary summary;
        into.fProviders = from.ReadProviders(into.fDetail);
        for (const TProviderRecord& provider : into.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                summary.Add(each);
            }
        }
        for (TFact& fact : summary.GetFacts()) {
            into.fFacts.push_back(std::move(fact));
        }
        for (const TProviderRecord& provider : into.fProviders) {
            into.fFacts.push_back(DescribeVendor(provider));
        }
    }
};

} // namespace

TFact DescribeVendor(const TProviderRecord& provider)
{
    std::size_t instances = 0;
    for (const TClassRecord& each : provider.fClasses) {
        instances += each.fInstanceCount;
    }
    return {"Vendor " + provider.fName, CountText(provider.fClasses.size(), "class", "classes") + ", " +
                                            CountText(instances, "instance", "instances")};
}

void AddSummaryCommands(TCommands& commands)
{
    commands.push_back(std::make_shared<TSummaryCommand>());
    AddDoctorCommand(commands);
}

} // namespace vrxhost
