// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace lnx {

// Asks the kernel for the address that an interface's hardware came with (ETHTOOL_GPERMADDR).
// Returns: its octets; an empty vector for an interface that lacks one: loopback, bridges, most virtual ones.
std::vector<std::uint8_t> permanentAddressOf(const std::string& interface);

// Returns: the addresses of the interface in the process's network namespace, each with the length of its prefix
// ("192.0.2.1/24", "fe80::1/64"); empty when the kernel tells none.
std::vector<std::string> ipAddressesOf(const std::string& interface);

// What the collectors see of a machine: the files of /proc, /sys and /etc below a root ("/" for this machine), and the
// facts of it that the kernel keeps in no file.
//
// A file that is missing, unreadable or odd is an absent value.
// Throws: std::bad_alloc.
// Blocks: as long as the kernel takes to answer a read.
// Thread: all members.
class SystemTree
{
  public:
    static constexpr std::size_t kMaxFileBytes = 4UL * 1024 * 1024; // /proc/cpuinfo of a machine with 1,000 processors
    static constexpr std::size_t kMaxEntries = 100'000;             // of one directory; the rest is left out

    using AddressLookup = std::function<std::vector<std::uint8_t>(const std::string& interface)>;

    using IpLookup = std::function<std::vector<std::string>(const std::string& interface)>;

    explicit SystemTree(std::string root = "/", AddressLookup permanentAddress = permanentAddressOf,
                        IpLookup ipAddresses = ipAddressesOf)
        : fRoot(std::move(root)), fPermanentAddress(std::move(permanentAddress)), fIpAddresses(std::move(ipAddresses))
    {
    }

    // Returns: the file's bytes, at most kMaxFileBytes of them; absent for an unreadable file.
    std::optional<std::string> bytes(const std::string& path) const;
    // Returns: the same as text, blanks at its ends cut off.
    std::optional<std::string> text(const std::string& path) const;
    // The same; absent also for a file of blanks.
    std::optional<std::string> word(const std::string& path) const;
    // Returns: the number that is the file's whole text, decimal or with 0x.
    std::optional<std::int64_t> integer(const std::string& path) const;
    std::optional<std::uint64_t> natural(const std::string& path) const;
    // Returns: the truth of a file that holds 0 or 1.
    std::optional<bool> flag(const std::string& path) const;

    // Returns: the names in a directory except "." and "..", sorted; numbers in names by value, so that cpu2 precedes
    // cpu10. An unreadable directory is empty.
    std::vector<std::string> entries(const std::string& path) const;

    bool exists(const std::string& path) const;
    // Returns: the last name in the path that a symbolic link has; absent for everything else.
    std::optional<std::string> linkedName(const std::string& path) const;

    // Returns: as permanentAddressOf.
    std::vector<std::uint8_t> permanentAddress(const std::string& interface) const
    {
        return fPermanentAddress(interface);
    }
    // Returns: as ipAddressesOf.
    std::vector<std::string> ipAddresses(const std::string& interface) const { return fIpAddresses(interface); }

  private:
    std::string fRoot;
    AddressLookup fPermanentAddress;
    IpLookup fIpAddresses;
};

} // namespace lnx
