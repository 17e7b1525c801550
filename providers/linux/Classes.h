// SPDX-License-Identifier: MIT
#pragma once

#include "providers/linux/Record.h"
#include "providers/linux/SystemTree.h"

#include <optional>
#include <string>
#include <vector>

namespace lnx {

// The classes of the inventory, one collector each: a class's instances as the machine is at the moment of the call. A
// property whose source is missing or odd is left out (null); the keys are always there. The classes and their
// properties are those of linux.properties.mof.
// Throws: std::bad_alloc.
// Blocks: as long as the kernel takes to answer the reads.
// Thread: safe.

// LNX_ComputerSystem: exactly one, named after the host. From /proc/sys/kernel/hostname and /sys/class/dmi/id, whose
// serial number only root may read.
std::vector<Record> computerSystems(const SystemTree& tree);
// LNX_OperatingSystem: exactly one. From /etc/os-release and /proc; its processes are those that /proc shows the
// caller. The clock and the time zone are this process's own, whatever the tree.
std::vector<Record> operatingSystems(const SystemTree& tree);
// LNX_Processor: one for each "processor" of /proc/cpuinfo, that is, for each that is online.
std::vector<Record> processors(const SystemTree& tree);
// LNX_Memory: one for all of it, from /proc/meminfo; the result is empty when that is unreadable.
std::vector<Record> memories(const SystemTree& tree);
// LNX_NetworkPort: one for each interface of /sys/class/net in the process's network namespace, lo included.
// Speeds are null while they are unknown to the driver (link down, virtual ports). PermanentAddress is the hardware's
// address and null for loopback and virtual ports; MACAddress and NetworkAddresses are those in use.
std::vector<Record> networkPorts(const SystemTree& tree);
// LNX_BlockDevice: one for each device of /sys/block that has a size. Partitions are part of their device.
std::vector<Record> blockDevices(const SystemTree& tree);
// LNX_PciDevice: one for each function of /sys/bus/pci/devices. Names are null without the file pci.ids.
std::vector<Record> pciDevices(const SystemTree& tree);
// LNX_PhysicalMemory: one for each module in the firmware's table (/sys/firmware/dmi/tables/DMI), which only root may
// read; empty slots are left out.
std::vector<Record> physicalMemories(const SystemTree& tree);
// LNX_TemperatureSensor: one for each channel tempN of /sys/class/hwmon. Reading it may ask a chip, for milliseconds.
std::vector<Record> temperatureSensors(const SystemTree& tree);
// LNX_SystemDevice: one for each instance of the six collectors above whose classes are devices, linking it with the
// system.
std::vector<Record> systemDevices(const SystemTree& tree);

struct ClassEntry
{
    const char* name;
    std::vector<Record> (*collect)(const SystemTree& tree);
};

// Returns: the class of that name, case ignored; null for any class of other providers.
const ClassEntry* findClass(const std::string& name);

// The key values of the system that every device and operating system belongs to. The name is "localhost" on a machine
// that lacks one.
std::string systemName(const SystemTree& tree);
extern const char* const kSystemClass;

// Returns: a new device of the system with its four keys and the operational status OK.
Record device(const SystemTree& tree, const char* className, const std::string& id);

// Returns: the number of processes, or of those whose command name (/proc/PID/comm, 15 bytes) is exactly that.
std::uint32_t countProcesses(const SystemTree& tree, const std::optional<std::string>& name);

} // namespace lnx
