// SPDX-License-Identifier: MIT
#include "providers/linux/SystemTree.h"

#include "providers/linux/Parse.h"

#include <algorithm>
#include <array>
#include <bitset>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <memory>
#include <system_error>

#include <arpa/inet.h>
#include <dirent.h>
#include <fcntl.h>
#include <ifaddrs.h>
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

// Returns: "address/length"; empty for families other than IP.
std::string addressText(const sockaddr& address, const sockaddr* mask)
{
    const bool isV4 = address.sa_family == AF_INET;
    if (!isV4 && address.sa_family != AF_INET6) {
        return {};
    }
    const auto bytesOf = [&](const sockaddr& of) -> const unsigned char* {
        return isV4 ? reinterpret_cast<const unsigned char*>(&reinterpret_cast<const sockaddr_in&>(of).sin_addr)
                    : reinterpret_cast<const sockaddr_in6&>(of).sin6_addr.s6_addr;
    };
    char text[INET6_ADDRSTRLEN] = "";
    ::inet_ntop(address.sa_family, bytesOf(address), text, sizeof text);
    unsigned length = 0;
    const std::size_t size = isV4 ? sizeof(in_addr) : sizeof(in6_addr);
    for (std::size_t i = 0; mask != nullptr && i < size; ++i) {
        length += static_cast<unsigned>(std::bitset<8>(bytesOf(*mask)[i]).count());
    }
    return text + ("/" + std::to_string(length));
}

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

std::vector<std::string> ipAddressesOf(const std::string& interface)
{
    ifaddrs* list = nullptr;
    if (::getifaddrs(&list) != 0) {
        return {};
    }
    const std::unique_ptr<ifaddrs, void (*)(ifaddrs*)> owner(list, ::freeifaddrs);
    std::vector<std::string> found;
    for (const ifaddrs* each = list; each != nullptr; each = each->ifa_next) {
        if (each->ifa_addr == nullptr || interface != each->ifa_name) {
            continue;
        }
        if (std::string text = addressText(*each->ifa_addr, each->ifa_netmask); !text.empty()) {
            found.push_back(std::move(text));
        }
    }
    return found;
}

std::optional<std::string> SystemTree::bytes(const std::string& path) const
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
    return content;
}

std::optional<std::string> SystemTree::text(const std::string& path) const
{
    const std::optional<std::string> content = bytes(path);
    return content ? std::optional<std::string>(trimmed(*content)) : std::nullopt;
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

std::optional<std::string> SystemTree::linkedName(const std::string& path) const
{
    std::error_code error;
    const auto target = std::filesystem::read_symlink(fRoot + path, error);
    return error || target.filename().empty() ? std::nullopt : std::optional<std::string>(target.filename());
}

} // namespace lnx
