// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentConfinement.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>

#include <sys/prctl.h>
#include <sys/resource.h>

namespace Pegasus::server {

namespace {

constexpr std::uint64_t kMegabyte = 1u << 20;

struct Field
{
    const char* name;
    std::uint64_t AgentConfinement::*value;
};

constexpr Field kFields[] = {
    {"memory=", &AgentConfinement::memoryMegabytes},      {"file=", &AgentConfinement::fileMegabytes},
    {"core=", &AgentConfinement::coreMegabytes},          {"processes=", &AgentConfinement::processes},
    {"newPrivileges=", &AgentConfinement::newPrivileges}, {"capabilities=", &AgentConfinement::capabilities},
    {"strictOwners=", &AgentConfinement::strictOwners},   {"strictProviders=", &AgentConfinement::strictProviders},
};

// A limit that is lower already stays.
void lower(decltype(RLIMIT_DATA) resource, std::uint64_t value)
{
    rlimit limit = {};
    ::getrlimit(resource, &limit);
    limit.rlim_max = std::min<rlim_t>(limit.rlim_max, value);
    limit.rlim_cur = std::min(limit.rlim_cur, limit.rlim_max);
    ::setrlimit(resource, &limit);
}

// Returns: the processes and threads of all users, of which this user's are a part; 0 if /proc does not tell.
std::uint64_t runningOnMachine()
{
    std::ifstream file("/proc/loadavg"); // "0.20 0.18 0.12 1/80 11206": running/all
    std::string word;
    for (int i = 0; i < 4; ++i) {
        file >> word;
    }
    return std::strtoul(word.c_str() + std::min(word.find('/') + 1, word.size()), nullptr, 10);
}

} // namespace

std::vector<std::string> agentWords(const AgentConfinement& confinement)
{
    std::vector<std::string> words;
    for (const Field& field : kFields) {
        words.push_back(field.name + std::to_string(confinement.*field.value));
    }
    return words;
}

AgentConfinement agentConfinement(char** words)
{
    AgentConfinement confinement;
    for (; *words != nullptr; ++words) {
        const std::string word = *words;
        for (const Field& field : kFields) {
            const std::size_t size = std::char_traits<char>::length(field.name);
            if (word.compare(0, size, field.name) == 0) {
                confinement.*field.value = std::strtoull(word.c_str() + size, nullptr, 10);
            }
        }
    }
    return confinement;
}

void confine(const AgentConfinement& confinement)
{
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__) // whose shadow memory is larger than any limit
    if (confinement.memoryMegabytes != 0) {
        lower(RLIMIT_DATA, confinement.memoryMegabytes * kMegabyte);
    }
#endif
    if (confinement.fileMegabytes != 0) {
        lower(RLIMIT_FSIZE, confinement.fileMegabytes * kMegabyte);
    }
    if (confinement.processes != 0) {
        lower(RLIMIT_NPROC, runningOnMachine() + confinement.processes);
    }
    lower(RLIMIT_CORE, confinement.coreMegabytes * kMegabyte);
    if (confinement.newPrivileges == 0) {
        ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
    }
    keepCapabilities(confinement.capabilities);
}

} // namespace Pegasus::server
