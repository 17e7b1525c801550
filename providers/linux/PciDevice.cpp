// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"
#include "providers/linux/PciNames.h"

namespace lnx {
namespace {

constexpr char kPciFolder[] = "/sys/bus/pci/devices";

Record pciDevice(const SystemTree& tree, const std::string& slot, const PciNames& names)
{
    const std::string directory = std::string(kPciFolder) + "/" + slot + "/";
    const auto number = [&](const char* file) { return narrowed<std::uint16_t>(tree.natural(directory + file)); };
    Record record = device(tree, "LNX_PciDevice", slot);
    const auto vendor = number("vendor");
    const auto model = number("device");
    const auto subsystemVendor = number("subsystem_vendor");
    record.set("Name", slot);
    record.set("VendorNumber", vendor);
    record.set("DeviceNumber", model);
    record.set("SubsystemVendorNumber", subsystemVendor);
    record.set("SubsystemNumber", number("subsystem_device"));
    record.set("ClassCode", narrowed<std::uint32_t>(tree.natural(directory + "class")));
    record.set("Revision", narrowed<std::uint8_t>(tree.natural(directory + "revision")));
    record.set("VendorName", names.vendor(vendor));
    record.set("DeviceName", names.device(vendor, model));
    record.set("SubsystemVendorName", names.vendor(subsystemVendor));
    const auto node = narrowed<std::int32_t>(tree.integer(directory + "numa_node")); // -1 where there is one node alone
    if (node && *node >= 0) {
        record.set("NumaNode", static_cast<std::uint32_t>(*node));
    }
    if (const auto event = tree.text(directory + "uevent")) {
        record.set("Driver", field(fields(*event, '='), "DRIVER"));
    }
    return record;
}

} // namespace

std::vector<Record> pciDevices(const SystemTree& tree)
{
    const std::vector<std::string> slots = tree.entries(kPciFolder);
    std::vector<Record> result;
    if (slots.empty()) {
        return result; // the file of names is large
    }
    const PciNames names(tree);
    for (const std::string& slot : slots) {
        result.push_back(pciDevice(tree, slot, names));
    }
    return result;
}

} // namespace lnx
