// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

namespace lnx {

const char* const kSystemClass = "LNX_ComputerSystem";

std::string systemName(const SystemTree& tree)
{
    return tree.word("/proc/sys/kernel/hostname").value_or("localhost");
}

std::vector<Record> computerSystems(const SystemTree& tree)
{
    const std::string name = systemName(tree);
    const std::string dmi = "/sys/class/dmi/id/";
    Record record(kSystemClass);
    record.key("CreationClassName", std::string(kSystemClass));
    record.key("Name", name);
    record.set("NameFormat", std::string("Other"));
    record.set("Caption", std::string("Computer system"));
    record.set("ElementName", name);
    record.set("OperationalStatus", std::vector<std::uint16_t>{2}); // OK
    record.set("EnabledState", std::uint16_t{2});                   // Enabled
    record.set("Manufacturer", tree.word(dmi + "sys_vendor"));
    record.set("Model", tree.word(dmi + "product_name"));
    record.set("SerialNumber", tree.word(dmi + "product_serial"));
    record.set("FirmwareVersion", tree.word(dmi + "bios_version"));
    record.set("FirmwareVendor", tree.word(dmi + "bios_vendor"));
    record.set("FirmwareDate", tree.word(dmi + "bios_date"));
    record.set("UUID", tree.word(dmi + "product_uuid"));
    record.set("SKU", tree.word(dmi + "product_sku"));
    record.set("AssetTag", tree.word(dmi + "chassis_asset_tag"));
    record.set("BoardManufacturer", tree.word(dmi + "board_vendor"));
    record.set("BoardModel", tree.word(dmi + "board_name"));
    record.set("BoardSerialNumber", tree.word(dmi + "board_serial"));
    record.set("ChassisType", narrowed<std::uint16_t>(tree.natural(dmi + "chassis_type")));
    return {record};
}

std::vector<Record> systemDevices(const SystemTree& tree)
{
    const Reference system = computerSystems(tree).front().reference();
    std::vector<Record> links;
    for (const auto collect : {processors, memories, networkPorts, blockDevices, pciDevices, temperatureSensors}) {
        for (const Record& part : collect(tree)) {
            Record link("LNX_SystemDevice");
            link.key("GroupComponent", system);
            link.key("PartComponent", part.reference());
            links.push_back(std::move(link));
        }
    }
    return links;
}

} // namespace lnx
