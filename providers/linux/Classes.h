#pragma once

#include "providers/linux/Record.h"
#include "providers/linux/SystemTree.h"

#include <optional>
#include <string>
#include <vector>

namespace lnx {

// The classes of the inventory, one collector each: what a class's instances are on the machine right now.
// Thread: all functions.
std::vector<Record> computerSystems(const SystemTree& tree);  // exactly one
std::vector<Record> operatingSystems(const SystemTree& tree); // exactly one
std::vector<Record> processors(const SystemTree& tree);       // one for each "processor" of /proc/cpuinfo
std::vector<Record> memories(const SystemTree& tree);         // one, none without /proc/meminfo
std::vector<Record> networkPorts(const SystemTree& tree);     // one for each interface, lo included
std::vector<Record> blockDevices(const SystemTree& tree);     // one for each that has a size
std::vector<Record> systemDevices(const SystemTree& tree);    // links the system with each of its devices

struct ClassEntry
{
    const char* name;
    std::vector<Record> (*collect)(const SystemTree& tree);
};

// Returns: the class of that name (case-insensitive), or null.
const ClassEntry* findClass(const std::string& name);

// The system that every device and operating system belongs to.
std::string systemName(const SystemTree& tree);
extern const char* const kSystemClass;

// Starts a device of the system: its four keys, and the state "enabled".
Record device(const SystemTree& tree, const char* className, const std::string& id);

// Returns: the number of processes, or of those with that command name.
std::uint32_t countProcesses(const SystemTree& tree, const std::optional<std::string>& name);

} // namespace lnx
