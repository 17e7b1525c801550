// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

#include <algorithm>
#include <cmath>

namespace lnx {
namespace {

// The blocks of /proc/cpuinfo that describe a processor, one of its lines "processor : N" each.
std::vector<Fields> blocks(const std::string& info)
{
    std::vector<Fields> result;
    std::string block;
    const auto flush = [&] {
        Fields parsed = fields(block, ':');
        if (field(parsed, "processor")) {
            result.push_back(std::move(parsed));
        }
        block.clear();
    };
    for (const std::string_view line : lines(info)) {
        if (trimmed(line).empty()) {
            flush();
        } else {
            block.append(line).append(1, '\n');
        }
    }
    flush();
    return result;
}

std::optional<std::uint64_t> number(const Fields& block, const char* name)
{
    const auto text = field(block, name);
    return text ? toNatural(*text) : std::nullopt;
}

// The node of memory whose entry lies in the processor's directory; -1 on a machine that has one memory for all.
std::int8_t nodeOf(const SystemTree& tree, const std::string& directory)
{
    for (const std::string& entry : tree.entries(directory)) {
        if (entry.compare(0, 4, "node") == 0) {
            if (const auto node = narrowed<std::int8_t>(toNatural(entry.substr(4)))) {
                return *node;
            }
        }
    }
    return -1;
}

// Sizes such as "32K", from the first level up.
std::vector<std::uint32_t> cacheKilobytes(const SystemTree& tree, const std::string& directory)
{
    std::vector<std::uint32_t> sizes;
    for (const std::string& entry : tree.entries(directory + "/cache")) {
        const auto text = tree.word(directory + "/cache/" + entry + "/size");
        if (!text || text->back() != 'K') {
            continue;
        }
        if (const auto size = narrowed<std::uint32_t>(toNatural(text->substr(0, text->size() - 1)))) {
            sizes.push_back(*size);
        }
    }
    return sizes;
}

void describeClock(const SystemTree& tree, const Fields& block, const std::string& directory, Record& record)
{
    const auto text = field(block, "cpu MHz");
    if (const auto megahertz = text ? toReal(*text) : std::nullopt; megahertz && *megahertz >= 0 && *megahertz < 1e6) {
        record.set("CurrentClockSpeed", static_cast<std::uint32_t>(std::lround(*megahertz)));
        record.set("ClockMegahertz", static_cast<float>(*megahertz));
    }
    if (const auto kilohertz = tree.natural(directory + "/cpufreq/cpuinfo_max_freq")) {
        record.set("MaxClockSpeed", narrowed<std::uint32_t>(std::optional<std::uint64_t>(*kilohertz / 1000)));
    }
    const auto bogus = field(block, "bogomips");
    record.set("BogoMips", bogus ? toReal(*bogus) : std::nullopt);
}

void describeFeatures(const Fields& block, Record& record)
{
    const auto text = field(block, "flags");
    if (!text) {
        return;
    }
    const std::vector<std::string> flags = words(*text);
    const bool isLong = std::find(flags.begin(), flags.end(), "lm") != flags.end();
    record.set("DataWidth", std::uint16_t(isLong ? 64 : 32));
    record.set("AddressWidth", std::uint16_t(isLong ? 64 : 32));
    record.set("Features", flags);
}

Record processor(const SystemTree& tree, const Fields& block)
{
    const std::string id = block.at("processor");
    const std::string directory = "/sys/devices/system/cpu/cpu" + id;
    Record record = device(tree, "LNX_Processor", "CPU" + id);
    const std::string name = field(block, "model name").value_or("Processor " + id);
    record.set("Name", name);
    record.set("ElementName", name);
    record.set("Role", std::string("Central Processor"));
    record.set("EnabledState", std::uint16_t{2}); // Enabled: the kernel lists only processors that are online
    record.set("CPUStatus", std::uint16_t{1});    // CPU Enabled
    record.set("Family", std::uint16_t{1});       // Other, named below
    record.set("OtherFamilyDescription", field(block, "vendor_id"));
    record.set("Stepping", field(block, "stepping"));
    record.set("VendorFamily", narrowed<std::uint16_t>(number(block, "cpu family")));
    record.set("VendorModel", narrowed<std::uint16_t>(number(block, "model")));
    record.set("PackageID", narrowed<std::uint32_t>(number(block, "physical id")));
    record.set("CoreID", narrowed<std::uint32_t>(number(block, "core id")));
    record.set("NumaNode", nodeOf(tree, directory));
    if (auto sizes = cacheKilobytes(tree, directory); !sizes.empty()) {
        record.set("CacheSizes", std::move(sizes));
    }
    describeClock(tree, block, directory, record);
    describeFeatures(block, record);
    return record;
}

} // namespace

std::vector<Record> processors(const SystemTree& tree)
{
    std::vector<Record> result;
    if (const auto info = tree.text("/proc/cpuinfo")) {
        for (const Fields& block : blocks(*info)) {
            result.push_back(processor(tree, block));
        }
    }
    return result;
}

} // namespace lnx
