// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"
#include "providers/linux/Smbios.h"

#include <array>
#include <cstdio>
#include <set>

namespace lnx {
namespace {

constexpr std::uint8_t kMemoryDevice = 17;
constexpr std::uint64_t kMegabyte = 1UL << 20;

// Offsets in the structure of a memory device, and what its numbers mean.
namespace offset {
constexpr std::size_t kTotalWidth = 0x08;
constexpr std::size_t kDataWidth = 0x0a;
constexpr std::size_t kSize = 0x0c;
constexpr std::size_t kFormFactor = 0x0e;
constexpr std::size_t kLocator = 0x10;
constexpr std::size_t kBank = 0x11;
constexpr std::size_t kTechnology = 0x12;
constexpr std::size_t kSpeed = 0x15;
constexpr std::size_t kManufacturer = 0x17;
constexpr std::size_t kSerialNumber = 0x18;
constexpr std::size_t kAssetTag = 0x19;
constexpr std::size_t kPartNumber = 0x1a;
constexpr std::size_t kExtendedSize = 0x1c;
constexpr std::size_t kConfiguredSpeed = 0x20;
} // namespace offset
constexpr std::uint16_t kUnknown = 0xffff;
constexpr std::uint16_t kIsExtended = 0x7fff; // the size is in the longer field
constexpr std::uint16_t kIsInKilobytes = 0x8000;
constexpr std::uint32_t kExtendedMask = 0x7fffffff;
constexpr std::uint16_t kOther = 1;

// The numbers that CIM has in place of SMBIOS's, from 0 on; Other for what CIM does not know.
constexpr std::array<std::uint8_t, 0x1f> kMemoryTypes = {0,      1,      0,  2,  6,  7,  8,  9,  10, 11, 12,
                                                         13,     14,     15, 16, 17, 18, 19, 20, 21, 23, kOther,
                                                         kOther, kOther, 24, 25, 26, 27, 28, 29, 30};
constexpr std::array<std::uint8_t, 0x0f> kFormFactors = {0, 1, 0, 7, 2, kOther, 3, 4, 6, 8, 9, kOther, 11, 12, 13};

template <std::size_t count>
std::optional<std::uint16_t> translated(const std::array<std::uint8_t, count>& table,
                                        const std::optional<std::uint8_t>& number)
{
    if (!number) {
        return std::nullopt;
    }
    return std::optional<std::uint16_t>(*number < count ? table[*number] : kOther);
}

// Returns: the bytes of the module; 0 for an empty slot; absent where the firmware does not know.
std::optional<std::uint64_t> capacity(const SmbiosStructure& device)
{
    const auto size = device.number<std::uint16_t>(offset::kSize);
    if (!size || *size == kUnknown) {
        return std::nullopt;
    }
    if (*size == kIsExtended) {
        const auto extended = device.number<std::uint32_t>(offset::kExtendedSize);
        return extended ? std::optional<std::uint64_t>((*extended & kExtendedMask) * kMegabyte) : std::nullopt;
    }
    return std::uint64_t(*size & ~kIsInKilobytes) * ((*size & kIsInKilobytes) != 0 ? kMegabyte / 1024 : kMegabyte);
}

// Returns: the number of a field in which 0 and 65535 mean that it is unknown.
template <typename T> std::optional<T> known(const SmbiosStructure& device, std::size_t at)
{
    const auto number = device.number<std::uint16_t>(at);
    return number && *number != 0 && *number != kUnknown ? std::optional<T>(*number) : std::nullopt;
}

// Returns: the label of the slot; of slots with the same label, the later ones have the number of the structure too.
std::string tagOf(const SmbiosStructure& device, std::set<std::string>& used)
{
    std::string tag = device.text(offset::kLocator).value_or("Memory");
    if (!used.insert(tag).second) {
        char handle[16];
        std::snprintf(handle, sizeof handle, " 0x%04X", static_cast<unsigned>(device.handle()));
        used.insert(tag += handle);
    }
    return tag;
}

Record physicalMemory(const SmbiosStructure& device, const std::string& tag)
{
    Record record("LNX_PhysicalMemory");
    record.key("CreationClassName", std::string("LNX_PhysicalMemory"));
    record.key("Tag", tag);
    record.set("Name", tag);
    record.set("ElementName", tag);
    record.set("BankLabel", device.text(offset::kBank));
    record.set("Capacity", capacity(device));
    const auto technology = device.number<std::uint8_t>(offset::kTechnology);
    record.set("MemoryType", translated(kMemoryTypes, technology));
    record.set("Technology", narrowed<std::uint16_t>(technology));
    record.set("FormFactor", translated(kFormFactors, device.number<std::uint8_t>(offset::kFormFactor)));
    record.set("TotalWidth", known<std::uint16_t>(device, offset::kTotalWidth));
    record.set("DataWidth", known<std::uint16_t>(device, offset::kDataWidth));
    record.set("MaxTransferRate", known<std::uint32_t>(device, offset::kSpeed));
    record.set("ConfiguredTransferRate", known<std::uint32_t>(device, offset::kConfiguredSpeed));
    record.set("Manufacturer", device.text(offset::kManufacturer));
    record.set("SerialNumber", device.text(offset::kSerialNumber));
    record.set("PartNumber", device.text(offset::kPartNumber));
    record.set("UserTracking", device.text(offset::kAssetTag));
    return record;
}

} // namespace

std::vector<Record> physicalMemories(const SystemTree& tree)
{
    std::vector<Record> result;
    std::set<std::string> used;
    const std::string table = tree.bytes("/sys/firmware/dmi/tables/DMI").value_or("");
    for (const SmbiosStructure& each : smbiosStructures(table)) {
        if (each.type() == kMemoryDevice && capacity(each) != std::uint64_t{0}) {
            result.push_back(physicalMemory(each, tagOf(each, used)));
        }
    }
    return result;
}

} // namespace lnx
