// SPDX-License-Identifier: MIT
#include "pegasus/base/AsciiCase.h"
#include "pegasus/server/net/HttpRequest.h"

#include <cstring>

#include <arpa/inet.h>

namespace Pegasus::server {

namespace {

constexpr unsigned char kLoopbackNet = 127;

bool isLoopbackAddress(const std::string& text)
{
    in_addr four = {};
    if (::inet_pton(AF_INET, text.c_str(), &four) == 1) {
        return *reinterpret_cast<const unsigned char*>(&four) == kLoopbackNet;
    }
    in6_addr six = {};
    if (::inet_pton(AF_INET6, text.c_str(), &six) != 1) {
        return false;
    }
    return IN6_IS_ADDR_LOOPBACK(&six) || (IN6_IS_ADDR_V4MAPPED(&six) && six.s6_addr[12] == kLoopbackNet);
}

bool isLoopbackName(std::string_view name)
{
    static constexpr std::string_view kBelow = ".localhost"; // reserved: no name server answers for it
    const bool isBelow =
        name.size() > kBelow.size() && base::equalNoCase(name.substr(name.size() - kBelow.size()), kBelow);
    return isBelow || base::equalNoCase(name, "localhost") || base::equalNoCase(name, "localhost.localdomain");
}

// Returns: "host" of "host:port" and of "[host]:port"; empty if it is malformed.
std::string hostOf(std::string_view authority)
{
    const bool isBracketed = !authority.empty() && authority.front() == '[';
    const std::size_t end = isBracketed ? authority.find(']') : std::min(authority.find(':'), authority.size());
    if (end == std::string_view::npos) {
        return {};
    }
    const std::string_view port = authority.substr(end + (isBracketed ? 1 : 0));
    if (!port.empty() && (port.front() != ':' || port.find_first_not_of("0123456789", 1) != std::string_view::npos)) {
        return {};
    }
    return std::string(authority.substr(isBracketed ? 1 : 0, end - (isBracketed ? 1 : 0)));
}

bool namesLoopback(std::string_view authority)
{
    const std::string host = hostOf(authority);
    return !host.empty() && (isLoopbackAddress(host) || isLoopbackName(host));
}

[[noreturn]] void refuseHeader(const char* header, const std::string& value)
{
    throw HttpError(403, HttpError::After::kClose, "",
                    std::string("The ") + header + " header must be localhost or a loopback address: " + value);
}

} // namespace

void requireLocalHost(const HttpRequest& http)
{
    const std::string* host = http.header("Host");
    if (host != nullptr && !host->empty() && !namesLoopback(*host)) {
        refuseHeader("Host", *host);
    }
    const std::string* origin = http.header("Origin"); // "scheme://host:port" or "null"
    const std::size_t authority = origin != nullptr ? origin->find("://") : std::string::npos;
    if (origin != nullptr &&
        (authority == std::string::npos || !namesLoopback(std::string_view(*origin).substr(authority + 3))))
    {
        refuseHeader("Origin", *origin);
    }
}

} // namespace Pegasus::server
