// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <fstream>
#include <random>
#include <stdexcept>
#include <string>

#include <netinet/in.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace test {

// A port of the loopback interface for one test's server, which may stop and start again on it. No other test's process
// gets it while this object lives: each holds an abstract socket named after its port. The kernel gives it to no
// outgoing connection where the range of those begins above it, as it does unless the machine was set up for many
// connections.
class ReservedPort
{
  public:
    // Throws: std::runtime_error when none is free.
    ReservedPort()
    {
        int above = 0;
        std::ifstream("/proc/sys/net/ipv4/ip_local_port_range") >> above;
        const int end = above > kFirst ? std::min(above, kEnd) : kEnd;
        const int count = end - kFirst;
        const int start = static_cast<int>(std::random_device{}() % static_cast<unsigned>(count));
        for (int i = 0; i < count; ++i) {
            fPort = static_cast<std::uint16_t>(kFirst + (start + i) % count);
            fReservation = reserve(fPort);
            if (fReservation >= 0) {
                return;
            }
        }
        throw std::runtime_error("no port from " + std::to_string(kFirst) + " to " + std::to_string(end) + " is free");
    }
    ~ReservedPort() { ::close(fReservation); }
    ReservedPort(const ReservedPort&) = delete;
    ReservedPort& operator=(const ReservedPort&) = delete;

    std::uint16_t number() const { return fPort; }

  private:
    static constexpr int kFirst = 20000;
    static constexpr int kEnd = 32768;

    // Returns: the descriptor that holds the reservation; -1 when another process has it or listens on the port.
    static int reserve(std::uint16_t port)
    {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_port = htons(port);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        const int probe = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
        const bool isFree = ::bind(probe, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0;
        ::close(probe);

        sockaddr_un name = {};
        name.sun_family = AF_UNIX;
        const std::string text = "vrx-test-port-" + std::to_string(port);
        text.copy(name.sun_path + 1, sizeof name.sun_path - 1);
        const auto size = static_cast<socklen_t>(offsetof(sockaddr_un, sun_path) + 1 + text.size());
        const int descriptor = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
        if (isFree && ::bind(descriptor, reinterpret_cast<const sockaddr*>(&name), size) == 0) {
            return descriptor;
        }
        ::close(descriptor);
        return -1;
    }

    std::uint16_t fPort = 0;
    int fReservation = -1;
};

} // namespace test
