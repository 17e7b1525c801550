// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

#include <algorithm>
#include <map>

#include <time.h>

namespace lnx {
namespace {

constexpr std::uint64_t kMicroseconds = 1'000'000;

bool isProcess(const std::string& entry)
{
    return toNatural(entry).has_value();
}

std::vector<std::string> processes(const SystemTree& tree)
{
    std::vector<std::string> found = tree.entries("/proc");
    found.erase(std::remove_if(found.begin(), found.end(), [](const auto& entry) { return !isProcess(entry); }),
                found.end());
    return found;
}

// The state letter of /proc/<pid>/stat, which follows the command's name in brackets.
std::optional<char> stateOf(const SystemTree& tree, const std::string& process)
{
    const auto stat = tree.text("/proc/" + process + "/stat");
    const std::size_t at = stat ? stat->rfind(") ") : std::string::npos;
    return at != std::string::npos && at + 2 < stat->size() ? std::optional<char>((*stat)[at + 2]) : std::nullopt;
}

void describeProcesses(const SystemTree& tree, Record& record)
{
    const std::vector<std::string> all = processes(tree);
    if (all.empty()) {
        return;
    }
    std::map<char, std::uint32_t> counts;
    for (const std::string& process : all) {
        if (const auto state = stateOf(tree, process)) {
            ++counts[*state];
        }
    }

    std::vector<Char16> states;
    std::vector<std::uint32_t> numbers;
    for (const auto& [state, count] : counts) {
        states.push_back({static_cast<std::uint16_t>(state)});
        numbers.push_back(count);
    }
    record.set("NumberOfProcesses", static_cast<std::uint32_t>(all.size()));
    record.set("ProcessStates", states);
    record.set("ProcessStateCounts", numbers);
    if (const auto init = stateOf(tree, all.front())) {
        record.set("InitProcessState", Char16{static_cast<std::uint16_t>(*init)});
    }
}

void describeTimes(const SystemTree& tree, Record& record)
{
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    tm local{};
    ::localtime_r(&now.tv_sec, &local);
    record.set("LocalDateTime", DateTime{static_cast<std::uint64_t>(now.tv_sec) * kMicroseconds +
                                             static_cast<std::uint64_t>(now.tv_nsec) / 1000,
                                         false});
    record.set("CurrentTimeZone", static_cast<std::int16_t>(local.tm_gmtoff / 60));

    const auto stat = tree.text("/proc/stat");
    if (const auto booted = stat ? field(fields(*stat, ' '), "btime") : std::nullopt) {
        if (const auto seconds = toNatural(*booted)) {
            record.set("LastBootUpTime", DateTime{*seconds * kMicroseconds, false});
        }
    }

    const auto upTime = tree.text("/proc/uptime");
    const auto parts = upTime ? words(*upTime) : std::vector<std::string>();
    if (const auto seconds = parts.empty() ? std::nullopt : toReal(parts.front()); seconds && *seconds >= 0) {
        record.set("UpTime", DateTime{static_cast<std::uint64_t>(*seconds * static_cast<double>(kMicroseconds)), true});
        record.set("UpTimeSeconds", *seconds);
    }
}

void describeLoad(const SystemTree& tree, Record& record)
{
    const auto load = tree.text("/proc/loadavg");
    const auto parts = load ? words(*load) : std::vector<std::string>();
    std::vector<float> averages;
    for (std::size_t i = 0; i < 3 && i < parts.size(); ++i) {
        if (const auto value = toReal(parts[i])) {
            averages.push_back(static_cast<float>(*value));
        }
    }
    if (averages.size() == 3) {
        record.set("LoadAverages", averages);
    }
}

// /proc/meminfo gives kilobytes, and so do these properties.
void describeMemory(const SystemTree& tree, Record& record)
{
    const auto info = tree.text("/proc/meminfo");
    const Fields all = info ? fields(*info, ':') : Fields();
    const auto kilobytes = [&all](const char* name) -> std::optional<std::uint64_t> {
        const auto text = field(all, name);
        return text ? toNatural(words(*text).front()) : std::nullopt;
    };
    const auto memory = kilobytes("MemTotal");
    const auto swap = kilobytes("SwapTotal");
    record.set("TotalVisibleMemorySize", memory);
    record.set("FreePhysicalMemory", kilobytes("MemFree"));
    record.set("TotalSwapSpaceSize", swap);
    record.set("FreeSpaceInPagingFiles", kilobytes("SwapFree"));
    if (memory && swap) {
        record.set("TotalVirtualMemorySize", *memory + *swap);
    }
}

} // namespace

std::uint32_t countProcesses(const SystemTree& tree, const std::optional<std::string>& name)
{
    const std::vector<std::string> all = processes(tree);
    if (!name) {
        return static_cast<std::uint32_t>(all.size());
    }
    return static_cast<std::uint32_t>(std::count_if(all.begin(), all.end(), [&](const std::string& process) {
        return tree.text("/proc/" + process + "/comm") == name;
    }));
}

std::vector<Record> operatingSystems(const SystemTree& tree)
{
    const auto release = tree.text("/etc/os-release");
    const Fields about = release ? shellFields(*release) : Fields();
    const std::string name = field(about, "ID").value_or("linux");

    Record record("LNX_OperatingSystem");
    record.key("CSCreationClassName", std::string(kSystemClass));
    record.key("CSName", systemName(tree));
    record.key("CreationClassName", record.className());
    record.key("Name", name);
    record.set("Caption", field(about, "PRETTY_NAME"));
    record.set("ElementName", field(about, "NAME"));
    record.set("OperationalStatus", std::vector<std::uint16_t>{2}); // OK
    record.set("EnabledState", std::uint16_t{2});                   // Enabled
    record.set("OSType", std::uint16_t{36});                        // LINUX
    record.set("Version", tree.word("/proc/sys/kernel/osrelease"));
    record.set("MaxNumberOfProcesses", narrowed<std::uint32_t>(tree.natural("/proc/sys/kernel/pid_max")));
    record.set("Distributed", false);
    record.set("PanicRestartDelay", narrowed<std::int32_t>(tree.integer("/proc/sys/kernel/panic")));
    describeTimes(tree, record);
    describeProcesses(tree, record);
    describeLoad(tree, record);
    describeMemory(tree, record);
    return {record};
}

} // namespace lnx
