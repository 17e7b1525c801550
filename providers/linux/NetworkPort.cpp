// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

#include <algorithm>
#include <array>

#include <net/if.h>
#include <net/if_arp.h>

namespace lnx {
namespace {

struct PortCounter
{
    const char* property;
    const char* file;
};

constexpr std::array kPortCounters{
    PortCounter{"BytesReceived", "rx_bytes"},
    PortCounter{"BytesTransmitted", "tx_bytes"},
    PortCounter{"PacketsReceived", "rx_packets"},
    PortCounter{"PacketsTransmitted", "tx_packets"},
    PortCounter{"ReceiveErrors", "rx_errors"},
    PortCounter{"TransmitErrors", "tx_errors"},
    PortCounter{"ReceivePacketsDropped", "rx_dropped"},
    PortCounter{"TransmitPacketsDropped", "tx_dropped"},
    PortCounter{"Collisions", "collisions"},
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

// Returns: the octets of "02:fc:00:00:00:01"; an empty vector for any other text.
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

// CIM's form of an address: the digits alone, in upper case.
std::string compact(const std::vector<std::uint8_t>& octets)
{
    constexpr char kDigits[] = "0123456789ABCDEF";
    std::string result;
    for (const std::uint8_t octet : octets) {
        result += kDigits[octet >> 4];
        result += kDigits[octet & 15];
    }
    return result;
}

// The permanent address is the hardware's; the kernel's current one may be another, and a virtual port has only that.
void describeAddress(const SystemTree& tree, const std::string& name, Record& record)
{
    if (const auto address = tree.word("/sys/class/net/" + name + "/address")) {
        record.set("MACAddress", *address);
        if (auto current = octets(*address); !current.empty()) {
            if (std::any_of(current.begin(), current.end(), [](std::uint8_t octet) { return octet != 0; })) {
                record.set("NetworkAddresses", std::vector<std::string>{compact(current)}); // loopback's is all zeros
            }
            record.set("MACOctets", std::move(current));
        }
    }
    if (const auto permanent = tree.permanentAddress(name); !permanent.empty()) {
        record.set("PermanentAddress", compact(permanent));
    }
    if (auto addresses = tree.ipAddresses(name); !addresses.empty()) {
        record.set("IPAddresses", std::move(addresses));
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

    const auto speed = narrowed<std::int32_t>(tree.integer(directory + "speed")); // -1 where the driver knows none
    if (speed && *speed > 0) {
        record.set("NegotiatedSpeed", speed);
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
    describeAddress(tree, name, record);
    describeLink(tree, directory, record);
    for (const PortCounter& counter : kPortCounters) {
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
