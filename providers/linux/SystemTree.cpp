// SPDX-License-Identifier: MIT
#include "providers/linux/SystemTree.h"

#include "providers/linux/Parse.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <memory>

#include <dirent.h>
#include <fcntl.h>
#include <linux/ethtool.h>
#include <linux/sockios.h>
#include <net/if.h>
#include <string.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <unistd.h>

namespace lnx {
namespace {

// Owner of a descriptor; -1 when opening it failed.
class Descriptor
{
  public:
    explicit Descriptor(int fd) : fFd(fd) {}
    ~Descriptor()
    {
        if (fFd >= 0) {
            ::close(fFd);
        }
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    bool isOpen() const { return fFd >= 0; }
    int get() const { return fFd; }
    // Returns: bytes read, 0 at the end, negative on an error.
    ssize_t read(char* buffer, std::size_t size) const
    {
        ssize_t got = 0;
        do {
            got = ::read(fFd, buffer, size);
        } while (got < 0 && errno == EINTR);
        return got;
    }

  private:
    int fFd;
};

struct DirectoryCloser
{
    void operator()(DIR* directory) const { ::closedir(directory); }
};

constexpr std::size_t kAddressBytes = 32; // MAX_ADDR_LEN: the kernel's longest, more than InfiniBand's 20

} // namespace

std::vector<std::uint8_t> permanentAddressOf(const std::string& interface)
{
    const Descriptor socket(::socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0));
    ifreq request{};
    if (!socket.isOpen() || interface.size() >= sizeof request.ifr_name) {
        return {};
    }
    std::memcpy(request.ifr_name, interface.c_str(), interface.size() + 1);
    // The address follows the fixed part.
    ethtool_perm_addr fixedPart{ETHTOOL_GPERMADDR, kAddressBytes};
    std::array<std::uint8_t, sizeof fixedPart + kAddressBytes> answer{};
    std::memcpy(answer.data(), &fixedPart, sizeof fixedPart);
    request.ifr_data = reinterpret_cast<char*>(answer.data());
    if (::ioctl(socket.get(), SIOCETHTOOL, &request) != 0) {
        return {};
    }
    std::memcpy(&fixedPart, answer.data(), sizeof fixedPart);
    const auto* begin = answer.data() + sizeof fixedPart;
    const auto* end = begin + std::min<std::size_t>(fixedPart.size, kAddressBytes);
    const bool isSet = std::any_of(begin, end, [](std::uint8_t octet) { return octet != 0; });
    return isSet ? std::vector<std::uint8_t>(begin, end) : std::vector<std::uint8_t>();
}

std::optional<std::string> SystemTree::text(const std::string& path) const
{
    const Descriptor file(::open((fRoot + path).c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    if (!file.isOpen()) {
        return std::nullopt;
    }
    std::string content;
    std::array<char, 16384> buffer{};
    while (content.size() < kMaxFileBytes) {
        const ssize_t got = file.read(buffer.data(), std::min(buffer.size(), kMaxFileBytes - content.size()));
        if (got < 0) {
            return std::nullopt;
        }
        if (got == 0) {
            break;
        }
        content.append(buffer.data(), static_cast<std::size_t>(got));
    }
    return std::string(trimmed(content));
}

std::optional<std::string> SystemTree::word(const std::string& path) const
{
    std::optional<std::string> found = text(path);
    return found && !found->empty() ? found : std::nullopt;
}

std::optional<std::int64_t> SystemTree::integer(const std::string& path) const
{
    const auto found = text(path);
    return found ? toInteger(*found) : std::nullopt;
}

std::optional<std::uint64_t> SystemTree::natural(const std::string& path) const
{
    const auto found = text(path);
    return found ? toNatural(*found) : std::nullopt;
}

std::optional<bool> SystemTree::flag(const std::string& path) const
{
    const auto found = natural(path);
    return found && *found <= 1 ? std::optional<bool>(*found == 1) : std::nullopt;
}

std::vector<std::string> SystemTree::entries(const std::string& path) const
{
    std::vector<std::string> names;
    const std::unique_ptr<DIR, DirectoryCloser> directory(::opendir((fRoot + path).c_str()));
    if (!directory) {
        return names;
    }
    while (names.size() < kMaxEntries) {
        const dirent* entry = ::readdir(directory.get());
        if (entry == nullptr) {
            break;
        }
        const std::string name = entry->d_name;
        if (name != "." && name != "..") {
            names.push_back(name);
        }
    }
    std::sort(names.begin(), names.end(),
              [](const std::string& a, const std::string& b) { return ::strverscmp(a.c_str(), b.c_str()) < 0; });
    return names;
}

bool SystemTree::exists(const std::string& path) const
{
    return ::access((fRoot + path).c_str(), F_OK) == 0;
}

} // namespace lnx
