// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"
#include "providers/linux/PciNames.h"
#include "tests/providers/FixtureTree.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <set>
#include <sstream>

#include <sys/stat.h>

namespace lnx {
namespace {

struct Shown
{
    std::string operator()(bool value) const { return value ? "true" : "false"; }
    std::string operator()(Char16 value) const { return std::string(1, static_cast<char>(value.code)); }
    std::string operator()(const std::string& value) const { return value; }
    std::string operator()(const DateTime& value) const
    {
        return std::to_string(value.microseconds) + (value.isInterval ? " long" : "");
    }
    std::string operator()(const Reference& value) const
    {
        std::string text = value.className;
        for (const auto& [name, key] : value.keys) {
            text += " " + name + "=" + key;
        }
        return text;
    }
    template <typename T> std::string operator()(const std::vector<T>& values) const
    {
        std::string text;
        for (const T& value : values) {
            text += (text.empty() ? "" : ",") + (*this)(value);
        }
        return text;
    }
    template <typename T> std::string operator()(T number) const
    {
        std::ostringstream text;
        text << +number;
        return text.str();
    }
};

std::string shown(const Record& record, const std::string& name)
{
    const Value* value = record.find(name);
    return value == nullptr ? "<null>" : std::visit(Shown(), *value);
}

std::vector<std::pair<std::string, std::string>> pairs(const std::string& text)
{
    std::vector<std::pair<std::string, std::string>> found;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line, '|');) {
        found.emplace_back(line.substr(0, line.find('=')), line.substr(line.find('=') + 1));
    }
    return found;
}

// Expected is "Property=value|Property=value...".
void expectProperties(const Record& record, const std::string& expected)
{
    for (const auto& [name, value] : pairs(expected)) {
        EXPECT_EQ(shown(record, name), value) << record.className() << '.' << name;
    }
}

// Files is "name=line|name=line...".
void addFiles(FixtureTree& fixture, const std::string& folder, const std::string& files)
{
    for (const auto& [file, text] : pairs(files)) {
        fixture.file(folder + "/" + file, text + "\n");
    }
}

TEST(NetworkPorts, ReadWhatTheKernelShows)
{
    FixtureTree fixture;
    addFiles(fixture, "/sys/class/net/eth0",
             "address=02:fc:00:aa:bb:01|mtu=1400|operstate=up|speed=10000|duplex=full|type=1|carrier=1|flags=0x1003|"
             "ifindex=4|statistics/rx_bytes=18446744073709551615|statistics/tx_errors=7");
    addFiles(fixture, "/sys/class/net/lo",
             "address=00:00:00:00:00:00|mtu=65536|operstate=unknown|type=772|flags=0x8|speed=-1");
    fixture.file("/sys/class/net/bonding_masters", "bond0\n")
        .permanentAddress("eth0", {2, 252, 0, 10, 11, 255})
        .ipAddresses("eth0", {"192.0.2.1/24", "fe80::1/64"});

    const std::vector<Record> ports = networkPorts(fixture.tree());
    ASSERT_EQ(ports.size(), 2U);
    expectProperties(
        ports[0],
        "DeviceID=eth0|MACAddress=02:fc:00:aa:bb:01|MACOctets=2,252,0,170,187,1|PermanentAddress=02FC000A0BFF|"
        "NetworkAddresses=02FC00AABB01|IPAddresses=192.0.2.1/24,fe80::1/"
        "64|ActiveMaximumTransmissionUnit=1400|LinkState=6|LinkTechnology=2|CarrierDetected="
        "true|EnabledState=2|NegotiatedSpeed=10000|Speed=10000000000|FullDuplex=true|InterfaceFlags=4099|BytesReceived="
        "18446744073709551615|TransmitErrors=7|BytesTransmitted=<null>");
    expectProperties(ports[1], "DeviceID=lo|OtherLinkTechnology=loopback|LinkState=0|CarrierDetected=<null>|"
                               "EnabledState=3|NegotiatedSpeed=<null>|Speed=<null>|PermanentAddress=<null>|"
                               "NetworkAddresses=<null>|IPAddresses=<null>");
}

TEST(PciDevices, AreNamedByTheFileOfNames)
{
    const std::string folder = "/sys/bus/pci/devices/0000:00:1f.6";
    for (const bool isNamed : {true, false}) {
        FixtureTree fixture;
        addFiles(fixture, folder,
                 "vendor=0x8086|device=0x15b7|subsystem_vendor=0xffff|subsystem_device=0x0001|class=0x020000|"
                 "revision=0x31|numa_node=-1");
        fixture.file(folder + "/uevent", "DRIVER=e1000e\nPCI_CLASS=20000\n");
        fixture.directory("/sys/bus/pci/devices/0000:00:00.0"); // the kernel tells nothing
        if (isNamed) {
            fixture.file("/usr/share/misc/pci.ids", "# names\n1234  Other\n\t15b7  Wrong\n8086  Some Corporation\n"
                                                    "\t15b7  Ethernet (2)\n\t\tffff 0001  Card\nC 02  Network\n");
        }
        const std::vector<Record> all = pciDevices(fixture.tree());
        ASSERT_EQ(all.size(), 2U);
        expectProperties(all[0], "DeviceID=0000:00:00.0|VendorNumber=<null>|VendorName=<null>|Driver=<null>");
        expectProperties(all[1],
                         "VendorNumber=32902|DeviceNumber=5559|SubsystemVendorNumber=65535|SubsystemNumber=1|"
                         "ClassCode=131072|Revision=49|Driver=e1000e|NumaNode=<null>|SubsystemVendorName=<null>");
        expectProperties(all[1], isNamed ? "VendorName=Some Corporation|DeviceName=Ethernet (2)"
                                         : "VendorName=<null>|DeviceName=<null>");
    }
}

TEST(PciNames, OddLinesAreLeftOut)
{
    const std::string tooLong(PciNames::kMaxNameBytes + 1, 'x');
    for (const std::string& text : {std::string(), std::string("8086"), std::string("8086 "), "8086  " + tooLong,
                                    std::string("8086  A\n0001  B\n\t15b7  C"), std::string("8086  A\n\t15b7")})
    {
        EXPECT_EQ(PciNames(text).device(0x8086, 0x15b7), std::nullopt) << text.substr(0, 20);
    }
    EXPECT_EQ(PciNames("8086  " + tooLong).vendor(0x8086), std::nullopt);
    EXPECT_EQ(PciNames("8086").vendor(std::nullopt), std::nullopt);
}

TEST(NetworkPorts, OddAddressesStayText)
{
    for (const char* address : {"0", "02:fc:0", "02:fc:00:", "zz:00:00:00:00:00", "02-fc-00-00-00-01", ":::::"}) {
        FixtureTree fixture;
        addFiles(fixture, "/sys/class/net/x0", std::string("address=") + address);
        expectProperties(networkPorts(fixture.tree()).at(0),
                         std::string("MACAddress=") + address + "|MACOctets=<null>|NetworkAddresses=<null>");
    }
}

TEST(Processors, OneForEachListed)
{
    FixtureTree fixture;
    std::string info;
    for (int i = 0; i < 12; ++i) {
        info += "processor\t: " + std::to_string(i) + "\nvendor_id\t: GenuineIntel\ncpu family\t: 6\nmodel\t\t: 85\n" +
                "model name\t: Some Processor @ 2.50GHz\nstepping\t: 7\ncpu MHz\t\t: 2499.998\nphysical id\t: 1\n" +
                "core id\t\t: 3\nflags\t\t: fpu vme lm\nbogomips\t: 4999.99\npower management:\n\n";
    }
    fixture.file("/proc/cpuinfo", info)
        .file("/sys/devices/system/cpu/cpu11/cache/index0/size", "32K\n")
        .file("/sys/devices/system/cpu/cpu11/cache/index1/size", "1024K\n")
        .file("/sys/devices/system/cpu/cpu11/cpufreq/cpuinfo_max_freq", "3900000\n")
        .directory("/sys/devices/system/cpu/cpu11/node1");

    const std::vector<Record> all = processors(fixture.tree());
    ASSERT_EQ(all.size(), 12U);
    expectProperties(all[11],
                     "DeviceID=CPU11|Name=Some Processor @ "
                     "2.50GHz|CurrentClockSpeed=2500|MaxClockSpeed=3900|BogoMips=4999.99|VendorFamily=6|VendorModel=85|"
                     "PackageID=1|CoreID=3|AddressWidth=64|Features=fpu,vme,lm|CacheSizes=32,1024|NumaNode=1");
    expectProperties(all[0], "CacheSizes=<null>|MaxClockSpeed=<null>|NumaNode=-1");
}

TEST(Processors, OtherArchitecturesAndOddFiles)
{
    struct Case
    {
        const char* name;
        std::string info;
        std::size_t count;
    };
    const std::vector<Case> cases{
        {"arm, with a trailing block about the board",
         "processor\t: 0\nBogoMIPS\t: 108.00\n\nprocessor\t: 1\n\nHardware\t: Board\nSerial\t: 0\n", 2},
        {"no blank line at the end", "processor: 0", 1},
        {"empty", "", 0},
        {"one endless line", std::string(100'000, 'x'), 0},
        {"colons only", ":::\n:\n\n:processor\n", 0},
        {"binary", std::string("processor\0: 0\n\n\xff\xfe", 18), 0},
    };
    for (const Case& row : cases) {
        FixtureTree fixture;
        fixture.file("/proc/cpuinfo", row.info);
        EXPECT_EQ(processors(fixture.tree()).size(), row.count) << row.name;
    }
}

TEST(Memories, CommitHeadroomMayBeNegative)
{
    FixtureTree fixture;
    fixture.file("/proc/meminfo", "MemTotal:        1000 kB\nMemFree:          100 kB\nMemAvailable:     250 kB\n"
                                  "Cached:            50 kB\nCommitLimit:      500 kB\nCommitted_AS:     700 kB\n");
    expectProperties(memories(fixture.tree()).at(0),
                     "BlockSize=1024|NumberOfBlocks=1000|ConsumableBlocks=250|TotalBytes=1024000|FreeBytes=102400|"
                     "UsedPercentage=75|CommitHeadroom=-204800");
}

TEST(BlockDevices, ThoseWithASize)
{
    FixtureTree fixture;
    addFiles(fixture, "/sys/block/nvme0n1",
             "size=2000|dev=259:0|ro=1|removable=0|queue/logical_block_size=4096|queue/physical_block_size=4096|queue/"
             "rotational=0|queue/scheduler=[none] mq-deadline kyber|stat=  10 0 200 5 30 0 400 5 0 1 "
             "2|device/model=Some Disk                |device/serial=S1 |device/firmware_rev=2.0|wwid=eui.01");
    addFiles(fixture, "/sys/block/loop0", "size=0");
    fixture.directory("/sys/block/broken");

    const std::vector<Record> all = blockDevices(fixture.tree());
    ASSERT_EQ(all.size(), 1U);
    expectProperties(
        all[0],
        "DeviceID=nvme0n1|Name=/dev/"
        "nvme0n1|TotalBytes=1024000|BlockSize=4096|NumberOfBlocks=250|PhysicalBlockSize=4096|Access=1|Removable=false|"
        "Rotational=false|Scheduler=none|Model=Some "
        "Disk|SerialNumber=S1|FirmwareRevision=2.0|WorldWideID=eui.01|Vendor=<null>|ReadsCompleted=10|SectorsWritten="
        "400");
}

FixtureTree& addProcess(FixtureTree& fixture, const std::string& id, const std::string& command, char state)
{
    return fixture.file("/proc/" + id + "/comm", command + "\n")
        .file("/proc/" + id + "/stat", id + " (" + command + ") " + state + " 0 0\n");
}

TEST(OperatingSystems, ReadReleaseTimesAndProcesses)
{
    FixtureTree fixture;
    addProcess(fixture, "1", "init", 'S');
    addProcess(fixture, "20", "worker) R (x", 'R'); // a name that tries to look like the rest of the line
    addProcess(fixture, "3", "worker", 'S');
    fixture.file("/etc/os-release", "NAME=\"Some Linux\"\nID=some\nPRETTY_NAME='Some Linux 1'\n")
        .file("/proc/sys/kernel/hostname", "box\n")
        .file("/proc/sys/kernel/osrelease", "6.1.0\n")
        .file("/proc/sys/kernel/panic", "-1\n")
        .file("/proc/stat", "cpu 1 2 3\nbtime 1700000000\n")
        .file("/proc/uptime", "123.50 99.00\n")
        .file("/proc/loadavg", "0.50 1.25 2.00 1/80 1000\n")
        .file("/proc/meminfo", "MemTotal: 1000 kB\nSwapTotal: 500 kB\n");

    const Record system = operatingSystems(fixture.tree()).at(0);
    expectProperties(
        system,
        "CSName=box|Name=some|Caption=Some Linux 1|Version=6.1.0|LastBootUpTime=1700000000000000|UpTime=123500000 "
        "long|UpTimeSeconds=123.5|LoadAverages=0.5,1.25,2|NumberOfProcesses=3|ProcessStates=R,S|ProcessStateCounts=1,2|"
        "InitProcessState=S|TotalVirtualMemorySize=1500|PanicRestartDelay=-1");
    EXPECT_EQ(countProcesses(fixture.tree(), std::nullopt), 3U);
    EXPECT_EQ(countProcesses(fixture.tree(), std::string("worker")), 1U);
    EXPECT_EQ(countProcesses(fixture.tree(), std::string("nobody")), 0U);
}

// Every file missing, every file empty, every file a directory: the only effect is that properties are missing.
TEST(AllClasses, SurviveAMachineWithoutFiles)
{
    const std::vector<std::string> files{"/proc/cpuinfo",
                                         "/proc/meminfo",
                                         "/proc/stat",
                                         "/proc/uptime",
                                         "/proc/loadavg",
                                         "/etc/os-release",
                                         "/proc/sys/kernel/hostname",
                                         "/sys/class/net/eth0/address",
                                         "/sys/block/sda/size",
                                         "/proc/1/stat"};
    for (const char* kind : {"missing", "empty", "directory"}) {
        FixtureTree fixture;
        for (const std::string& file : files) {
            if (kind == std::string("empty")) {
                fixture.file(file, "");
            } else if (kind == std::string("directory")) {
                fixture.directory(file);
            }
        }
        EXPECT_EQ(computerSystems(fixture.tree()).size(), 1U) << kind;
        EXPECT_EQ(operatingSystems(fixture.tree()).size(), 1U) << kind;
        EXPECT_TRUE(processors(fixture.tree()).empty()) << kind;
        EXPECT_TRUE(memories(fixture.tree()).empty()) << kind;
        EXPECT_TRUE(blockDevices(fixture.tree()).empty()) << kind;
        EXPECT_EQ(networkPorts(fixture.tree()).size(), kind == std::string("missing") ? 0U : 1U) << kind;
        EXPECT_EQ(shown(operatingSystems(fixture.tree())[0], "LastBootUpTime"), "<null>") << kind;
    }
}

// A structure of the firmware's table: header, area of the given length, texts with their ends.
std::string smbios(std::uint8_t type, std::uint8_t handle, std::string area, const std::vector<std::string>& texts)
{
    area =
        std::string{static_cast<char>(type), static_cast<char>(area.size() + 4), static_cast<char>(handle), 0} + area;
    for (const std::string& each : texts) {
        area += each + '\0';
    }
    return area + std::string(texts.empty() ? 2 : 1, '\0');
}

// The area of a memory device up to the speed that it is set to.
std::string module(const std::string& size, const std::string& extendedSize)
{
    return std::string("\x10\0\xfe\xff\x48\0\x40\0", 8) + size +
           std::string("\x09\0\1\2\x22\0\0\xc0\x12\3\4\0\5\2", 14) + extendedSize + std::string("\xc0\x12", 2);
}

const std::string kNoExtension(4, '\0');
const std::vector<std::string> kTexts = {"DIMM A1", "BANK 0 ", "Maker", "S\x01N", "PN-1"};

TEST(PhysicalMemories, AreTheModulesOfTheFirmwaresTable)
{
    FixtureTree fixture;
    fixture.file("/sys/firmware/dmi/tables/DMI",
                 smbios(0, 1, "", {"firmware"}) +
                     smbios(17, 2, module(std::string("\0\x40", 2), kNoExtension), kTexts) +
                     smbios(17, 3, module(std::string("\0\0", 2), kNoExtension), kTexts) +
                     smbios(17, 4, module("\xff\x7f", std::string("\0\0\1\0", 4)), {"DIMM A1"}) +
                     smbios(17, 5, module(std::string("\0\x82", 2), kNoExtension), {}) + smbios(17, 6, "", {}) +
                     smbios(127, 7, "", {}) + smbios(17, 8, module("\1\1", kNoExtension), kTexts));
    const std::vector<Record> modules = physicalMemories(fixture.tree());
    ASSERT_EQ(modules.size(), 4U);
    expectProperties(modules[0],
                     "Tag=DIMM A1|BankLabel=BANK 0|Capacity=17179869184|MemoryType=1|Technology=34|"
                     "FormFactor=8|TotalWidth=72|DataWidth=64|MaxTransferRate=4800|ConfiguredTransferRate=4800|"
                     "Manufacturer=Maker|SerialNumber=<null>|PartNumber=PN-1|UserTracking=<null>");
    expectProperties(modules[1], "Tag=DIMM A1 0x0004|Capacity=68719476736|Manufacturer=<null>");
    expectProperties(modules[2], "Tag=Memory|Capacity=524288");
    expectProperties(modules[3], "Tag=Memory 0x0006|Capacity=<null>|MemoryType=<null>|MaxTransferRate=<null>");
}

// Every beginning of a table, and tables whose lengths and texts are wrong, end without a read outside of them.
TEST(PhysicalMemories, OfADamagedTableAreThoseBeforeTheDamage)
{
    const std::string whole = smbios(17, 2, module("\1\1", kNoExtension), kTexts);
    for (std::size_t length = 0; length < whole.size(); ++length) {
        FixtureTree fixture;
        fixture.file("/sys/firmware/dmi/tables/DMI", whole + whole.substr(0, length));
        EXPECT_EQ(physicalMemories(fixture.tree()).size(), 1U) << length;
    }
    for (const std::string& odd : {std::string("\x11\3\1\0\0\0", 6), std::string("\x11\xff\1\0\0\0", 6),
                                   std::string(1000, '\0'), std::string(1000, '\x11')})
    {
        FixtureTree fixture;
        fixture.file("/sys/firmware/dmi/tables/DMI", odd);
        EXPECT_TRUE(physicalMemories(fixture.tree()).empty());
    }
}

TEST(TemperatureSensors, AreTheChannelsOfTheKernelsChips)
{
    FixtureTree fixture;
    addFiles(
        fixture, "/sys/class/hwmon/hwmon0",
        "name=coretemp|temp1_input=41500|temp1_label=Package id 0|temp1_max=80000|temp1_crit=100000|temp2_input=-1600|"
        "temp3_input=99999|temp3_max=80000|temp3_crit=100001|temp4_input=5000|temp4_crit_alarm=1|fan1_input=1200|"
        "temp5_input=x|temp5_fault=1|temp6_input=65261850|temp6_max=65261850");
    std::filesystem::create_symlink("../../../coretemp.0", fixture.root() / "sys/class/hwmon/hwmon0/device");
    fixture.file("/sys/class/hwmon/hwmon1/temp1_input", "20000\n");
    const std::vector<Record> sensors = temperatureSensors(fixture.tree());
    ASSERT_EQ(sensors.size(), 7U);
    const std::vector<std::string> expected = {
        "DeviceID=coretemp.0/temp1|Name=coretemp Package id 0|CurrentReading=42|UpperThresholdNonCritical=80|"
        "UpperThresholdCritical=100|UpperThresholdFatal=<null>|CurrentState=Normal|BaseUnits=2|UnitModifier=0",
        "DeviceID=coretemp.0/temp2|Name=coretemp temp2|CurrentReading=-2|CurrentState=Normal",
        "CurrentReading=100|CurrentState=Critical",
        "CurrentReading=5|CurrentState=Critical",
        "CurrentReading=<null>|CurrentState=Fault",
        "CurrentReading=<null>|UpperThresholdNonCritical=<null>|CurrentState=Unknown",
        "DeviceID=hwmon1/temp1|Name=hwmon1 temp1|CurrentReading=20"};
    for (std::size_t i = 0; i < expected.size(); ++i) {
        expectProperties(sensors[i], expected[i]);
    }
    EXPECT_EQ(systemDevices(fixture.tree()).size(), 7U);
}

TEST(SystemDevices, LinkTheSystemWithEveryDevice)
{
    FixtureTree fixture;
    addFiles(fixture, "/sys/class/net/eth0", "address=02:fc:00:00:00:01");
    fixture.file("/proc/sys/kernel/hostname", "box\n").file("/proc/cpuinfo", "processor: 0\n");
    const std::vector<Record> links = systemDevices(fixture.tree());
    ASSERT_EQ(links.size(), 2U);
    expectProperties(
        links[1],
        "GroupComponent=LNX_ComputerSystem CreationClassName=LNX_ComputerSystem Name=box|PartComponent=LNX_NetworkPort "
        "SystemCreationClassName=LNX_ComputerSystem SystemName=box CreationClassName=LNX_NetworkPort DeviceID=eth0");
}

TEST(SystemTree, ReadsNoMoreThanItsLimit)
{
    FixtureTree fixture;
    fixture.file("/big", std::string(SystemTree::kMaxFileBytes + 10, 'x'));
    EXPECT_EQ(fixture.tree().text("/big")->size(), SystemTree::kMaxFileBytes);
}

TEST(SystemTree, DoesNotWaitForAPipe)
{
    FixtureTree fixture;
    ASSERT_EQ(::mkfifo((fixture.root() / "pipe").c_str(), 0600), 0);
    EXPECT_EQ(fixture.tree().text("/pipe"), "");
}

TEST(Numbers, AreWholeOrAbsent)
{
    struct Case
    {
        const char* text;
        std::optional<std::uint64_t> natural;
        std::optional<std::int64_t> integer;
    };
    constexpr std::uint64_t kMax = std::numeric_limits<std::uint64_t>::max();
    const std::vector<Case> cases{
        {"0", 0, 0},
        {" 42\n", 42, 42},
        {"-1", {}, -1},
        {"0x1003", 0x1003, {}},
        {"", {}, {}},
        {"12 kB", {}, {}},
        {"1e3", {}, {}},
        {"0x", {}, {}},
        {"18446744073709551615", kMax, {}},
        {"18446744073709551616", {}, {}},
        {"+1", {}, {}},
        {"--1", {}, {}},
    };
    for (const Case& row : cases) {
        EXPECT_EQ(toNatural(row.text), row.natural) << row.text;
        EXPECT_EQ(toInteger(row.text), row.integer) << row.text;
    }
    EXPECT_EQ(narrowed<std::int8_t>(std::optional<std::uint64_t>(200)), std::nullopt);
    EXPECT_EQ(narrowed<std::uint16_t>(std::optional<std::int64_t>(-1)), std::nullopt);
    EXPECT_EQ(narrowed<std::int8_t>(std::optional<std::uint64_t>(127)), std::int8_t{127});
}

} // namespace
} // namespace lnx
