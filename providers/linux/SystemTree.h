#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace lnx {

// The files of /proc, /sys and /etc below a root, "/" for the machine itself.
//
// Nothing here throws but for lack of memory: a file that is missing, unreadable or odd is an absent value.
// Blocks: as long as the kernel takes to answer a read.
// Thread: all members.
class SystemTree
{
  public:
    static constexpr std::size_t kMaxFileBytes = 4UL * 1024 * 1024; // /proc/cpuinfo of a machine with 1,000 processors
    static constexpr std::size_t kMaxEntries = 100'000;             // of one directory; more are not looked at

    explicit SystemTree(std::string root = "/") : fRoot(std::move(root)) {}

    // Returns: the file's text without blanks at its ends, cut off at kMaxFileBytes; nothing when it cannot be read.
    std::optional<std::string> text(const std::string& path) const;
    // The same, when there is anything but blanks in it.
    std::optional<std::string> word(const std::string& path) const;
    // Returns: the number that is the file's whole text, decimal or with 0x.
    std::optional<std::int64_t> integer(const std::string& path) const;
    std::optional<std::uint64_t> natural(const std::string& path) const;
    // Returns: what a file of 0 or 1 says.
    std::optional<bool> flag(const std::string& path) const;

    // Returns: the names in a directory but "." and "..", sorted; numbers in names by value, so that cpu2 precedes
    // cpu10.
    std::vector<std::string> entries(const std::string& path) const;

    bool exists(const std::string& path) const;

  private:
    std::string fRoot;
};

} // namespace lnx
