// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/ConfigTable.h"

#include "pegasus/server/admin/Capabilities.h"

#include <algorithm>
#include <charconv>
#include <cstring>

#include <sys/stat.h>
#include <unistd.h>

namespace Pegasus::server {

namespace {

// What libraries that read and set up hardware use: raw access to devices, memory and network interfaces, device files,
// other users' files, and helper programs under another user. Left out is what changes the system around them: kernel
// modules, clock, restart, the limits of resources, security policies.
constexpr const char* kAgentCapabilities =
    "chown,dac_override,dac_read_search,fowner,fsetid,kill,setgid,setuid,net_bind_service,net_broadcast,net_admin,"
    "net_raw,ipc_lock,ipc_owner,sys_rawio,sys_chroot,sys_ptrace,sys_admin,sys_nice,mknod,audit_write,syslog";

} // namespace

const std::vector<ConfigProperty>& configTable()
{
    using Kind = ConfigProperty::Kind;
    static const std::vector<ConfigProperty> kTable = {
        {"httpPort", "5988", Kind::kPort, false, "TCP port on 127.0.0.1"},
        {"enableHttpConnection", "true", Kind::kBoolean, false, "listen on the TCP port at all"},
        {"enableHttpsConnection", "false", Kind::kFalse, false, "TLS; not offered by this server"},
        {"daemon", "true", Kind::kBoolean, false, "leave the caller's session and run in the background"},
        {"consumer", "quvex", Kind::kConsumer, false, "for whom the server runs; names the start file in /var/tmp"},
        {"providerDir", "lib", Kind::kDirectoryList, true, "where provider libraries are searched, in this order"},
        {"repositoryDir", "repository", Kind::kDirectory, false, "where classes and instances are kept"},
        {"strictOwners", "true", Kind::kBoolean, false,
         "refuse a tree, program or provider library that users other than root and this one can change"},
        {"strictHosts", "true", Kind::kBoolean, true,
         "refuse requests whose Host or Origin header is neither localhost nor a loopback address: a web page's"},
        {"logLevel", "INFORMATION", Kind::kLogLevel, true, "least severity that is logged"},
        {"shutdownTimeout", "3", Kind::kCount, true, "seconds that running requests get at the end"},
        {"idleConnectionTimeout", "0", Kind::kCountOrZero, true,
         "seconds until a silent connection is closed; 0: never"},
        {"requestReadTimeout", "30", Kind::kCount, true, "seconds from a request's first byte to its last"},
        {"socketWriteTimeout", "20", Kind::kCount, true, "seconds that a client may leave its answer unread"},
        {"maxConnections", "128", Kind::kCount, true, "connections served at once, over TCP and locally each"},
        {"maxHeaderBytes", "65536", Kind::kCount, true, "bytes of a request's head"},
        {"maxBodyBytes", "16777216", Kind::kCount, true, "bytes of a request's body"},
        {"maxXmlDepth", "64", Kind::kCount, true, "elements within elements of a request"},
        {"maxBufferedAnswerBytes", "268435456", Kind::kCount, true,
         "bytes of an answer for a client that takes no chunked one with trailers"},
        {"providerTimeout", "600", Kind::kCount, true, "seconds of silence after which a provider's agent is ended"},
        {"agentIdleTimeout", "300", Kind::kCountOrZero, true, "seconds after which an idle agent is ended; 0: never"},
        {"agentMemoryMegabytes", "4096", Kind::kCountOrZero, true,
         "private writable memory that an agent, and each process of its provider, may take; 0: any"},
        {"agentFileMegabytes", "4096", Kind::kCountOrZero, true, "largest file that an agent may write; 0: any"},
        {"agentCoreMegabytes", "0", Kind::kCountOrZero, true, "largest core file of an agent; 0: none"},
        {"agentProcesses", "1024", Kind::kCountOrZero, true,
         "processes and threads that may be added to the machine's by an agent of a user other than root; 0: any"},
        {"agentNewPrivileges", "false", Kind::kBoolean, true,
         "let agents gain privileges by programs with set-user-id bits or file capabilities"},
        {"agentCapabilities", kAgentCapabilities, Kind::kCapabilities, true,
         "capabilities that root's agents keep; all; none"},
        {"strictProviders", "false", Kind::kBoolean, true,
         "refuse calls of providers that fail on OpenPegasus 2.14; agents that start later do"},
    };
    return kTable;
}

const ConfigProperty* findConfigProperty(const std::string& name)
{
    for (const ConfigProperty& property : configTable()) {
        if (name == property.name) {
            return &property;
        }
    }
    return nullptr;
}

std::vector<std::string> splitDirectoryList(const std::string& list, const std::string& home)
{
    std::vector<std::string> directories;
    for (std::size_t begin = 0; begin <= list.size();) {
        const std::size_t end = std::min(list.find(':', begin), list.size());
        const std::string entry = list.substr(begin, end - begin);
        if (!entry.empty()) {
            directories.push_back(entry[0] == '/' ? entry : home + "/" + entry);
        }
        begin = end + 1;
    }
    return directories;
}

namespace {

bool isNumberIn(const std::string& text, long least, long most)
{
    long number = 0;
    const char* end = text.data() + text.size();
    const auto parsed = std::from_chars(text.data(), end, number);
    return parsed.ec == std::errc() && parsed.ptr == end && number >= least && number <= most;
}

bool isReadableDirectory(const std::string& path)
{
    struct stat info = {};
    return ::stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode) && ::access(path.c_str(), R_OK | X_OK) == 0;
}

bool areReadableDirectories(const std::vector<std::string>& directories)
{
    return !directories.empty() && std::all_of(directories.begin(), directories.end(), isReadableDirectory);
}

// One path component. Characters that mean something to a shell or a terminal are refused.
bool isConsumerName(const std::string& name)
{
    static const char kRefused[] = "/\"'\\`$&|;<>()*?[]{}!#~ ";
    return !name.empty() && name.size() <= 128 && name != "." && name != ".." &&
           std::none_of(name.begin(), name.end(), [](char c) {
               return static_cast<unsigned char>(c) < 0x20 || c == 0x7f || std::strchr(kRefused, c) != nullptr;
           });
}

bool isLogLevel(const std::string& text)
{
    static const char* const kLevels[] = {"ERROR", "WARNING", "INFORMATION", "DEBUG"};
    return std::any_of(std::begin(kLevels), std::end(kLevels), [&](const char* level) { return text == level; });
}

constexpr long kMaxCount = 0x7fffffff;

} // namespace

bool isValidConfigValue(const ConfigProperty& property, const std::string& value, const std::string& home)
{
    if (value.find_first_of(std::string("\0\n\r", 3)) != std::string::npos) {
        return false; // the files hold one property a line
    }
    switch (property.kind) {
    case ConfigProperty::Kind::kBoolean:
        return value == "true" || value == "false";
    case ConfigProperty::Kind::kFalse:
        return value == "false";
    case ConfigProperty::Kind::kPort:
        return isNumberIn(value, 1, 65535);
    case ConfigProperty::Kind::kCount:
        return isNumberIn(value, 1, kMaxCount);
    case ConfigProperty::Kind::kCountOrZero:
        return isNumberIn(value, 0, kMaxCount);
    case ConfigProperty::Kind::kConsumer:
        return isConsumerName(value);
    case ConfigProperty::Kind::kDirectory:
        return !value.empty();
    case ConfigProperty::Kind::kDirectoryList:
        return areReadableDirectories(splitDirectoryList(value, home));
    case ConfigProperty::Kind::kLogLevel:
        return isLogLevel(value);
    case ConfigProperty::Kind::kCapabilities:
        return parseCapabilities(value).has_value();
    }
    return false;
}

} // namespace Pegasus::server
