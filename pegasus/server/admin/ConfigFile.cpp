// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/ConfigFile.h"

#include "pegasus/server/admin/PrivateFile.h"

#include <climits>
#include <cstdlib>
#include <sstream>

#include <unistd.h>

namespace Pegasus::server {

namespace {

constexpr std::size_t kMaxConfigFileBytes = 64u << 10;

std::string folderOf(const std::string& path)
{
    const std::size_t slash = path.rfind('/');
    return slash == std::string::npos ? "." : path.substr(0, slash);
}

} // namespace

ConfigValues readConfigFile(const std::string& path)
{
    ConfigValues values;
    std::istringstream lines(readOwnFile(path, kMaxConfigFileBytes));
    for (std::string line; std::getline(lines, line);) {
        const std::size_t equals = line.find('=');
        if (line.empty() || line[0] == '#' || equals == std::string::npos) {
            continue;
        }
        values[line.substr(0, equals)] = line.substr(equals + 1);
    }
    return values;
}

void writeConfigFile(const std::string& path, const ConfigValues& values)
{
    std::string content = "# Written by cimserver and cimconfig; use cimconfig to change it.\n";
    for (const auto& [name, value] : values) {
        content += name + "=" + value + "\n";
    }
    writePrivateFile(path, content);
}

std::string defaultHome()
{
    if (const char* home = std::getenv("PEGASUS_HOME")) {
        return home;
    }
    char program[PATH_MAX];
    const ssize_t size = ::readlink("/proc/self/exe", program, sizeof program);
    return size <= 0 ? "." : folderOf(folderOf(std::string(program, static_cast<std::size_t>(size))));
}

} // namespace Pegasus::server
