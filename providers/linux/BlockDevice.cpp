// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

#include <array>

namespace lnx {
namespace {

constexpr std::uint64_t kSectorBytes = 512; // of /sys/block/*/size, whatever the device's own blocks are

struct DiskCounter
{
    const char* property;
    std::size_t column; // of /sys/block/*/stat
};

constexpr std::array kDiskCounters{DiskCounter{"ReadsCompleted", 0}, DiskCounter{"SectorsRead", 2},
                                   DiskCounter{"WritesCompleted", 4}, DiskCounter{"SectorsWritten", 6}};

// The one in brackets of "none [mq-deadline] kyber".
std::optional<std::string> activeScheduler(const std::optional<std::string>& text)
{
    const std::size_t begin = text ? text->find('[') : std::string::npos;
    const std::size_t end = begin != std::string::npos ? text->find(']', begin) : std::string::npos;
    return end != std::string::npos ? std::optional<std::string>(text->substr(begin + 1, end - begin - 1))
                                    : std::nullopt;
}

void describeExtent(const SystemTree& tree, const std::string& directory, std::uint64_t sectors, Record& record)
{
    const std::uint64_t bytes = sectors * kSectorBytes;
    const auto block = tree.natural(directory + "queue/logical_block_size");
    record.set("BlockSize", block);
    if (block && *block > 0) {
        record.set("NumberOfBlocks", bytes / *block);
    }
    record.set("TotalBytes", bytes);
    record.set("PhysicalBlockSize", narrowed<std::uint32_t>(tree.natural(directory + "queue/physical_block_size")));
    const auto readOnly = tree.flag(directory + "ro");
    if (readOnly) {
        record.set("Access", std::uint16_t(*readOnly ? 1 : 3)); // Readable, Read/Write Supported
    }
}

void describeActivity(const SystemTree& tree, const std::string& directory, Record& record)
{
    const auto stat = tree.text(directory + "stat");
    const auto columns = stat ? words(*stat) : std::vector<std::string>();
    for (const DiskCounter& counter : kDiskCounters) {
        if (counter.column < columns.size()) {
            record.set(counter.property, toNatural(columns[counter.column]));
        }
    }
}

Record blockDevice(const SystemTree& tree, const std::string& name, std::uint64_t sectors)
{
    const std::string directory = "/sys/block/" + name + "/";
    Record record = device(tree, "LNX_BlockDevice", name);
    record.set("Name", "/dev/" + name);
    record.set("ElementName", name);
    record.set("EnabledState", std::uint16_t{2}); // Enabled
    record.set("DeviceNumber", tree.word(directory + "dev"));
    record.set("Model", tree.word(directory + "device/model"));
    record.set("Vendor", tree.word(directory + "device/vendor"));
    record.set("SerialNumber",
               tree.word(directory + "device/serial")); // NVMe; of others only a command to the device tells
    const auto revision = tree.word(directory + "device/firmware_rev");
    record.set("FirmwareRevision", revision ? revision : tree.word(directory + "device/rev"));
    const auto worldWide = tree.word(directory + "wwid");
    record.set("WorldWideID", worldWide ? worldWide : tree.word(directory + "device/wwid"));
    record.set("Removable", tree.flag(directory + "removable"));
    record.set("Rotational", tree.flag(directory + "queue/rotational"));
    record.set("Scheduler", activeScheduler(tree.word(directory + "queue/scheduler")));
    describeExtent(tree, directory, sectors, record);
    describeActivity(tree, directory, record);
    return record;
}

} // namespace

std::vector<Record> blockDevices(const SystemTree& tree)
{
    std::vector<Record> result;
    for (const std::string& name : tree.entries("/sys/block")) {
        const auto sectors = tree.natural("/sys/block/" + name + "/size");
        if (sectors && *sectors > 0) // an unused loop device has zero
        {
            result.push_back(blockDevice(tree, name, *sectors));
        }
    }
    return result;
}

} // namespace lnx
