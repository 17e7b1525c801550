// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"

#include <array>

#include <strings.h>

namespace lnx {
namespace {

constexpr std::array kClasses{
    ClassEntry{"LNX_ComputerSystem", computerSystems},
    ClassEntry{"LNX_OperatingSystem", operatingSystems},
    ClassEntry{"LNX_Processor", processors},
    ClassEntry{"LNX_Memory", memories},
    ClassEntry{"LNX_NetworkPort", networkPorts},
    ClassEntry{"LNX_BlockDevice", blockDevices},
    ClassEntry{"LNX_PciDevice", pciDevices},
    ClassEntry{"LNX_PhysicalMemory", physicalMemories},
    ClassEntry{"LNX_TemperatureSensor", temperatureSensors},
    ClassEntry{"LNX_SystemDevice", systemDevices},
};

} // namespace

const ClassEntry* findClass(const std::string& name)
{
    for (const ClassEntry& entry : kClasses) {
        if (::strcasecmp(entry.name, name.c_str()) == 0) {
            return &entry;
        }
    }
    return nullptr;
}

Record device(const SystemTree& tree, const char* className, const std::string& id)
{
    Record record(className);
    record.key("SystemCreationClassName", std::string(kSystemClass));
    record.key("SystemName", systemName(tree));
    record.key("CreationClassName", std::string(className));
    record.key("DeviceID", id);
    record.set("OperationalStatus", std::vector<std::uint16_t>{2}); // OK
    return record;
}

} // namespace lnx
