#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

#include <array>
#include <cctype>

#include <net/if.h>
#include <net/if_arp.h>

namespace lnx {
namespace {

struct Counter
{
    const char* property;
    const char* file;
};

constexpr std::array kCounters{
    Counter{"BytesReceived", "rx_bytes"},
    Counter{"BytesTransmitted", "tx_bytes"},
    Counter{"PacketsReceived", "rx_packets"},
    Counter{"PacketsTransmitted", "tx_packets"},
    Counter{"ReceiveErrors", "rx_errors"},
    Counter{"TransmitErrors", "tx_errors"},
    Counter{"ReceivePacketsDropped", "rx_dropped"},
    Counter{"TransmitPacketsDropped", "tx_dropped"},
    Counter{"Collisions", "collisions"},
};

// The kernel's words for a link's state, at the numbers of RFC 2863 that the kernel gives them.
constexpr std::array kStates{"unknown", "notpresent", "down", "lowerlayerdown", "testing", "dormant", "up"};

std::optional<std::uint16_t> linkState(const std::optional<std::string>& word)
{
    for (std::size_t i = 0; i < kStates.size(); ++i) {
        if (word == kStates[i]) {
            return static_cast<std::uint16_t>(i);
        }
    }
    return std::nullopt;
}

// "02:fc:00:00:00:01" as its octets; none when it is anything else.
std::vector<std::uint8_t> octets(const std::string& address)
{
    std::vector<std::uint8_t> result;
    if (address.size() % 3 != 2) {
        return result;
    }
    for (std::size_t at = 0; at < address.size(); at += 3) {
        const auto octet = toNatural("0x" + address.substr(at, 2));
        if (!octet || (at != 0 && address[at - 1] != ':')) {
            return {};
        }
        result.push_back(static_cast<std::uint8_t>(*octet));
    }
    return result;
}

// CIM's form of an address: its digits in upper case, without separators.
std::string compact(const std::string& address)
{
    std::string result;
    for (const char c : address) {
        if (c != ':') {
            result += static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
        }
    }
    return result;
}

void describeAddress(const std::optional<std::string>& address, Record& record)
{
    if (!address) {
        return;
    }
    record.set("MACAddress", *address);
    if (auto bytes = octets(*address); !bytes.empty()) {
        record.set("MACOctets", std::move(bytes));
        record.set("PermanentAddress", compact(*address));
        record.set("NetworkAddresses", std::vector<std::string>{compact(*address)});
    }
}

void describeLink(const SystemTree& tree, const std::string& directory, Record& record)
{
    const auto type = narrowed<std::uint16_t>(tree.natural(directory + "type"));
    record.set("HardwareType", type);
    const bool isLoopback = type == ARPHRD_LOOPBACK;
    record.set("LinkTechnology", std::uint16_t(type == ARPHRD_ETHER ? 2 : isLoopback ? 1 : 0));
    if (isLoopback) {
        record.set("OtherLinkTechnology", std::string("loopback"));
    }
    record.set("LinkState", linkState(tree.word(directory + "operstate")));
    record.set("CarrierDetected", tree.flag(directory + "carrier"));

    const auto speed = narrowed<std::int32_t>(tree.integer(directory + "speed")); // -1: not known
    record.set("NegotiatedSpeed", speed);
    if (speed && *speed > 0) {
        record.set("Speed", static_cast<std::uint64_t>(*speed) * 1'000'000);
    }
    const auto duplex = tree.word(directory + "duplex");
    if (duplex == "full" || duplex == "half") {
        record.set("FullDuplex", duplex == "full");
    }
}

Record networkPort(const SystemTree& tree, const std::string& name)
{
    const std::string directory = "/sys/class/net/" + name + "/";
    Record record = device(tree, "LNX_NetworkPort", name);
    record.set("Name", name);
    record.set("ElementName", name);
    const auto flags = narrowed<std::uint32_t>(tree.natural(directory + "flags"));
    record.set("InterfaceFlags", flags);
    if (flags) {
        record.set("EnabledState", std::uint16_t((*flags & IFF_UP) != 0 ? 2 : 3)); // Enabled, Disabled
    }
    record.set("InterfaceIndex", narrowed<std::uint32_t>(tree.natural(directory + "ifindex")));
    record.set("ActiveMaximumTransmissionUnit", tree.natural(directory + "mtu"));
    describeAddress(tree.word(directory + "address"), record);
    describeLink(tree, directory, record);
    for (const Counter& counter : kCounters) {
        record.set(counter.property, tree.natural(directory + "statistics/" + counter.file));
    }
    return record;
}

} // namespace

std::vector<Record> networkPorts(const SystemTree& tree)
{
    std::vector<Record> result;
    for (const std::string& name : tree.entries("/sys/class/net")) {
        if (tree.exists("/sys/class/net/" + name + "/address")) // the directory also holds bonding_masters and the like
        {
            result.push_back(networkPort(tree, name));
        }
    }
    return result;
}

} // namespace lnx
